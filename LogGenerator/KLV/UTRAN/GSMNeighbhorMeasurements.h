#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The GSM neighbor cells of a UTRAN modem, one record per cell.
/// Kept: "Neighbhor" has an h too many.
class GSMNeighbhorMeasurements final : public SectionDecoder {
 public:
  GSMNeighbhorMeasurements();
};

}  // namespace varnel
