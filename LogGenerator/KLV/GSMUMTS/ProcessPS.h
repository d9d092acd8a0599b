#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The packet-switched mobility management (GMM).
class ProcessPS final : public SectionDecoder {
 public:
  ProcessPS();
};

}  // namespace varnel
