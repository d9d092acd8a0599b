#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The neighbor cells of the connected-mode intra-frequency measurement, one record per cell.
class MeasuredNeighborCells final : public SectionDecoder {
 public:
  MeasuredNeighborCells();
};

}  // namespace varnel
