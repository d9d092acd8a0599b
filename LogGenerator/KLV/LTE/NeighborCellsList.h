#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The cells of the idle-mode neighbour measurement, a row each.
class NeighborCellsList final : public SectionDecoder {
 public:
  NeighborCellsList();
};

}  // namespace varnel
