#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The GSM neighbour cells of a UTRAN modem, a row each.
class GSMNeighbhorMeasurements final : public SectionDecoder {
 public:
  GSMNeighbhorMeasurements();
};

}  // namespace varnel
