#pragma once

#include "LogGenerator/SectionWithoutCodes.h"

namespace varnel {

/// The measurements that the UMTS radio resource control asks for.
class UMTSRRMeasurement final : public SectionWithoutCodes<UMTSRRMeasurement> {
 public:
  static constexpr std::string_view sectionName = "UMTS RR Measurement";
  static constexpr std::string_view traceLine = "UMTSRRMeasurement";
};

}  // namespace varnel
