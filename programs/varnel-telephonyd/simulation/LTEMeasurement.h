#pragma once

#include <vector>

#include "programs/varnel-telephonyd/simulation/Walk.h"

namespace varnel::simulation {

/// What an LTE phone measures for one cell, in hundredths of a decibel.
struct LTEMeasurement {
  const Cell* cell;
  std::int64_t averageRSRP_cdbm;  ///< the level that the walk gives
  std::int64_t averageRSRQ_cdb;
  std::int64_t measuredRSRP_cdbm;  ///< the current value, near the average
  std::int64_t measuredRSRQ_cdb;
  std::int64_t rssi_cdbm;  ///< the same for all cells of a carrier

  /// A weaker cell is lost among the others and in the noise.
  bool isMeasurable() const { return averageRSRP_cdbm >= -124'00 && averageRSRQ_cdb >= -19'50; }
  /// True when the cell is at least strong enough to be told apart from others.
  bool isDetectable() const { return averageRSRP_cdbm >= -126'00 && averageRSRQ_cdb >= -25'00; }
};

/// The power on a carrier, over six resource blocks.
std::int64_t lteRSSI_cdbm(const Walk& walk, int channel);

/// All cells of a carrier, the strongest first.
std::vector<LTEMeasurement> measureLTECarrier(const Walk& walk, int channel, Random& random);

}  // namespace varnel::simulation
