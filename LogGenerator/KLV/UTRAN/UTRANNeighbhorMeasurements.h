#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The UTRAN neighbor cells, one record per cell.
class UTRANNeighbhorMeasurements final : public SectionDecoder {
 public:
  UTRANNeighbhorMeasurements();
};

}  // namespace varnel
