#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The UTRAN serving cell, from the modem's packets and the telephony server's cell-monitor array.
class UTRANServingCellInfo final : public SectionDecoder {
 public:
  UTRANServingCellInfo();
};

}  // namespace varnel
