#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The block error rates of the transport channels, one record per channel.
class TRCHBLERMeasurement final : public SectionDecoder {
 public:
  TRCHBLERMeasurement();
};

}  // namespace varnel
