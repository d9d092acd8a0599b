#pragma once

#include <cstdint>
#include <memory>
#include <string_view>
#include <vector>

#include "programs/varnel-telephonyd/simulation/SimulatedModem.h"

namespace varnel {

/// A new modem of the technology, at the start of its stream; null for a technology that is not simulated.
std::unique_ptr<SimulatedModem> simulatedModem(std::string_view technology, std::uint64_t seed);

/// Every technology that is simulated.
std::vector<std::string_view> simulatedTechnologies();

}  // namespace varnel
