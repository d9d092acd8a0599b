#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The measurements that the UMTS radio resource control requests.
class UMTSRRMeasurement final : public SectionDecoder {
 public:
  static constexpr std::string_view sectionName = "UMTS RR Measurement";

  UMTSRRMeasurement() : SectionDecoder(sectionName, "UMTSRRMeasurement", {}, UnknownCodes::Ignored) {}
};

}  // namespace varnel
