#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The networks that count as equivalent to the registered one, one record per network.
class EquivalentPLMNList final : public SectionDecoder {
 public:
  EquivalentPLMNList();
};

}  // namespace varnel
