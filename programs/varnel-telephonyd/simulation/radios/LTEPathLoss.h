#pragma once

#include <cstdint>

namespace varnel::simulation {

/// The path loss as an LTE phone reckons it: cells broadcast that they send their reference signals with
/// 15 dBm.
constexpr std::int64_t ltePathLoss_db(std::int64_t level_cdbm) {
  constexpr std::int64_t referencePower_dbm = 15;
  return referencePower_dbm - level_cdbm / 100;
}

}  // namespace varnel::simulation
