#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The GSM radio resource management.
class GSMRRInfo final : public SectionDecoder {
 public:
  GSMRRInfo();
};

}  // namespace varnel
