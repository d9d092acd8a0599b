#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// What the GSM cell broadcasts about its packet service.
class GPRSInformation final : public SectionDecoder {
 public:
  GPRSInformation();
};

}  // namespace varnel
