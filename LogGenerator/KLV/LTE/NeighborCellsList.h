#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The cells of the idle-mode neighbor measurement, one record per cell.
class NeighborCellsList final : public SectionDecoder {
 public:
  NeighborCellsList();
};

}  // namespace varnel
