#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel::radios {

/// What the GSM cell says about packet data. Other than `varnel::GPRSInformation`, it shows "Not Available"
/// while the cell does not tell whether it supports packet flow contexts.
class GPRSInformation final : public SectionDecoder {
 public:
  GPRSInformation();
};

}  // namespace varnel::radios
