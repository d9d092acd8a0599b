#pragma once

#include <vector>

#include "programs/varnel-telephonyd/simulation/Walk.h"

namespace varnel::simulation {

/// What a phone measures with one antenna, or with all of them, for one LTE cell. The unit is the sixteenth
/// of a decibel, in which packets send levels.
struct AntennaLevel {
  std::int64_t rsrp, rsrq, rssi;
  std::int64_t snrTenths;  ///< in tenths of a decibel
};

/// An LTE cell as a phone measures it on several antennas.
struct AntennaLevels {
  const Cell* cell;
  std::vector<AntennaLevel> antennas;
  AntennaLevel combined;  ///< the largest of each value
  AntennaLevel filtered;  ///< without the quick changes
};

/// TS 36.214 5.1.3: on every antenna RSRQ is the number of resource blocks in decibels, plus RSRP, less RSSI,
/// but not below -30 dB.
AntennaLevels measureOnAntennas(const Walk& walk, const Cell& cell, int antennas, Random& random);

/// The cells of a carrier that are strong enough, the strongest first, but the serving cell before them. At
/// most that many.
std::vector<AntennaLevels> measureCarrierOnAntennas(const Walk& walk, const Cell& serving, int antennas,
                                                    std::size_t most, Random& random);

}  // namespace varnel::simulation
