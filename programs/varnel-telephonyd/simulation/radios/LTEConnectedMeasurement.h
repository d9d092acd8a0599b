#pragma once

#include <span>

#include "base/Bytes.h"
#include "programs/varnel-telephonyd/simulation/radios/AntennaLevels.h"
#include "programs/varnel-telephonyd/simulation/radios/LTEServingCell.h"

namespace varnel::simulation {

/// 0xB179, in version 3 with narrow channel numbers or in version 4: the serving cell, its neighbors on the
/// carrier, and cells that are only detected.
Bytes lteConnectedMeasurement(std::chrono::milliseconds now, std::span<const AntennaLevels> cells,
                              std::span<const Cell* const> detected, int servingIndex, ChannelWidth width);

/// How modems of several years send 0xB195: the version of the subpacket.
enum class ConnectedNeighborsLayout { Version3, Version4, Version24 };
/// 0xB195: the neighbors on the carrier of the first cell, which is the serving one.
Bytes lteConnectedNeighbors(std::chrono::milliseconds now, std::span<const AntennaLevels> cells,
                            int servingIndex, ConnectedNeighborsLayout layout);

}  // namespace varnel::simulation
