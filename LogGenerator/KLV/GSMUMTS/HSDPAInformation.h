#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// High-speed downlink packet access: what each HARQ process has received.
class HSDPAInformation final : public SectionDecoder {
 public:
  HSDPAInformation();
};

}  // namespace varnel
