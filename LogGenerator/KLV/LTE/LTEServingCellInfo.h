#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The LTE serving cell, from two modem packets and the telephony server's cell-monitor array. An entry keeps
/// its last value until a packet with this entry arrives.
class LTEServingCellInfo final : public SectionDecoder {
 public:
  LTEServingCellInfo();
};

}  // namespace varnel
