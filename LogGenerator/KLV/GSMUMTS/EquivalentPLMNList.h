#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The networks that count as the registered one, a row each.
class EquivalentPLMNList final : public SectionDecoder {
 public:
  EquivalentPLMNList();
};

}  // namespace varnel
