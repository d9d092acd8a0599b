#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The UTRAN neighbor cells, one record per cell.
/// Kept: "Neighbhor" has an h too many.
class UTRANNeighbhorMeasurements final : public SectionDecoder {
 public:
  UTRANNeighbhorMeasurements();
};

}  // namespace varnel
