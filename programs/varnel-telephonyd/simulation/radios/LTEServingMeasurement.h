#pragma once

#include <span>

#include "base/Bytes.h"
#include "programs/varnel-telephonyd/simulation/radios/AntennaLevels.h"

namespace varnel::simulation {

/// How modems of several years send 0xB193: the version of the subpacket, and the most antennas in it.
enum class ServingMeasurementLayout { Version19, Version36, Version48 };
int antennasOf(ServingMeasurementLayout layout);

/// 0xB193: one carrier. The first cell is the serving one, with this index: 0 is the primary cell, 1 and up
/// are secondary cells. The others are neighbors. At most four cells.
Bytes lteServingMeasurement(std::chrono::milliseconds now, ServingMeasurementLayout layout,
                            std::span<const AntennaLevels> cells, int servingIndex);

}  // namespace varnel::simulation
