#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The channels that the GSM connection hops over.
class MobileAllocation final : public SectionDecoder {
 public:
  MobileAllocation();
};

}  // namespace varnel
