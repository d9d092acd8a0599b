#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The ranked GSM cells, a row each.
class GSMSet final : public SectionDecoder {
 public:
  GSMSet();
};

}  // namespace varnel
