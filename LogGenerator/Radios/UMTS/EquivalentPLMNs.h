#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel::radios {

/// The networks that count as equivalent to the registered one, one record per network. Other than
/// `EquivalentPLMNList`, it reads their digits as they are packed (3GPP TS 24.008, 10.5.1.13).
class EquivalentPLMNs final : public SectionDecoder {
 public:
  EquivalentPLMNs();
};

}  // namespace varnel::radios
