#pragma once

#include "base/Bytes.h"
#include "programs/varnel-telephonyd/simulation/Cell.h"

namespace varnel::simulation {

/// The name that the network gave a phone (TS 23.003 2.8.1, 2.10.1): which part of the network knows it, and
/// its number there.
struct TemporaryName {
  Network network;
  int group = 0;  ///< LTE: the group of mobility management entities; NR: the region and the set
  int code = 0;   ///< LTE: the entity; NR: the pointer
  std::uint32_t number = 0;
};

}  // namespace varnel::simulation
