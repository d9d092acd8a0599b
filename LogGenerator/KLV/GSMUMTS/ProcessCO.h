#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The state of the mobility management, in short.
class ProcessCO final : public SectionDecoder {
 public:
  ProcessCO();
};

}  // namespace varnel
