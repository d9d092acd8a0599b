#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The block errors of the UMTS transport channels.
class BLER final : public SectionDecoder {
 public:
  BLER();
};

}  // namespace varnel
