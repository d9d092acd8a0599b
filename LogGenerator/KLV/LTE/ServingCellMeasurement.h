#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The idle-mode measurement of the serving cell.
class ServingCellMeasurement final : public SectionDecoder {
 public:
  ServingCellMeasurement();
};

}  // namespace varnel
