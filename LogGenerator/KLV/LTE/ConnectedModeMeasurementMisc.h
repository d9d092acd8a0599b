#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The serving cell of the connected-mode intra-frequency measurement.
class ConnectedModeMeasurementMisc final : public SectionDecoder {
 public:
  ConnectedModeMeasurementMisc();
};

}  // namespace varnel
