#pragma once

#include <span>

#include "base/Bytes.h"
#include "programs/varnel-telephonyd/simulation/radios/AntennaLevels.h"

namespace varnel::simulation {

/// 0xB179: the serving cell, its neighbors on the carrier, and cells that are only detected.
Bytes lteConnectedMeasurement(std::chrono::milliseconds now, std::span<const AntennaLevels> cells,
                              std::span<const Cell* const> detected, int servingIndex);

/// 0xB195: the neighbors on the carrier of the first cell, which is the serving one.
Bytes lteConnectedNeighbors(std::chrono::milliseconds now, std::span<const AntennaLevels> cells,
                            int servingIndex);

}  // namespace varnel::simulation
