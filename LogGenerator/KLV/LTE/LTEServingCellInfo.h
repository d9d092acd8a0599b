#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The LTE serving cell, put together from two modem packets and the telephony server's cell-monitor array. A
/// row keeps its last value until a packet that carries it arrives again.
class LTEServingCellInfo final : public SectionDecoder {
 public:
  LTEServingCellInfo();
};

}  // namespace varnel
