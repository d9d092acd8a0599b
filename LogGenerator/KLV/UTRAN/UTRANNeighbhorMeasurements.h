#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The UTRAN neighbour cells, a row each.
class UTRANNeighbhorMeasurements final : public SectionDecoder {
 public:
  UTRANNeighbhorMeasurements();
};

}  // namespace varnel
