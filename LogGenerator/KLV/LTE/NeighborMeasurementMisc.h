#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// What the idle-mode neighbour measurement says of its frequency.
class NeighborMeasurementMisc final : public SectionDecoder {
 public:
  NeighborMeasurementMisc();
};

}  // namespace varnel
