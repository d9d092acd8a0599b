#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The channels over which the GSM connection hops.
class MobileAllocation final : public SectionDecoder {
 public:
  MobileAllocation();
};

}  // namespace varnel
