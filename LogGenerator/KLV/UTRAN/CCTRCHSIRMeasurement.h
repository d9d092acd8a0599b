#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The signal-to-interference ratios of the coded composite transport channels, one record per channel.
class CCTRCHSIRMeasurement final : public SectionDecoder {
 public:
  CCTRCHSIRMeasurement();
};

}  // namespace varnel
