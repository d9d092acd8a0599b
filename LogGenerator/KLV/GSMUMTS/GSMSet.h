#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The ranked GSM cells, one record per cell.
class GSMSet final : public SectionDecoder {
 public:
  GSMSet();
};

}  // namespace varnel
