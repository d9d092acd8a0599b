#pragma once

#include <span>

#include "programs/varnel-telephonyd/simulation/radios/AntennaLevels.h"
#include "programs/varnel-telephonyd/simulation/radios/LTEServingCell.h"

namespace varnel::simulation {

/// 0xB17F: the serving cell as an idle phone judges it.
Bytes lteIdleMeasurement(std::chrono::milliseconds now, const AntennaLevels& serving, ChannelWidth width);

/// 0xB180: the cells of one carrier that an idle phone has measured.
Bytes lteIdleNeighbors(std::chrono::milliseconds now, std::span<const AntennaLevels> neighbors,
                       ChannelWidth width);

}  // namespace varnel::simulation
