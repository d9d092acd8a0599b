#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The frequency of the idle-mode neighbor measurement.
class NeighborMeasurementMisc final : public SectionDecoder {
 public:
  NeighborMeasurementMisc();
};

}  // namespace varnel
