#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The state of the UTRAN radio resource control connection (3GPP TS 25.331).
class RRC_State final : public SectionDecoder {
 public:
  RRC_State();
};

}  // namespace varnel
