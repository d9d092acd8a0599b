#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The circuit-switched mobility management (MM).
class ProcessCS final : public SectionDecoder {
 public:
  ProcessCS();
};

}  // namespace varnel
