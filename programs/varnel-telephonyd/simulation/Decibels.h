#pragma once

#include <cstdint>

namespace varnel::simulation {

/// The power of a level, in attowatts: what comes from several masts can be added. A level below -150 dBm
/// counts as that, one above 0 dBm as that.
std::int64_t power_aw(std::int64_t level_cdbm);

/// The level of a power, correct to a hundredth of a decibel or two; of less than one attowatt -150 dBm. At
/// most 10^15 attowatts, one milliwatt.
std::int64_t level_cdbm(std::int64_t power_aw);

}  // namespace varnel::simulation
