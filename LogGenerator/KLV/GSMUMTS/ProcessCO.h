#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// A summary of the mobility management.
class ProcessCO final : public SectionDecoder {
 public:
  ProcessCO();
};

}  // namespace varnel
