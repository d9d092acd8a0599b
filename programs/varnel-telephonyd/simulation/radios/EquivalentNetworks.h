#pragma once

#include <initializer_list>

#include "base/Bytes.h"
#include "programs/varnel-telephonyd/simulation/Situation.h"

namespace varnel::simulation {

/// 0x7150: the networks that the serving network treats as equivalent, each as three bytes behind the other.
Bytes packedEquivalentNetworks(std::chrono::milliseconds now, std::initializer_list<Network> networks);

}  // namespace varnel::simulation
