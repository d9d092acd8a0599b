#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The neighbour cells of the connected-mode intra-frequency measurement, a row each.
class MeasuredNeighborCells final : public SectionDecoder {
 public:
  MeasuredNeighborCells();
};

}  // namespace varnel
