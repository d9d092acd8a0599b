#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The detected cells of the connected-mode intra-frequency measurement, one record per cell.
class DetectedCells final : public SectionDecoder {
 public:
  DetectedCells();
};

}  // namespace varnel
