#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The GSM cells that are not ranked.
class NonRankedGSMSet final : public SectionDecoder {
 public:
  static constexpr std::string_view sectionName = "Non-Ranked GSM Set";

  NonRankedGSMSet() : SectionDecoder(sectionName, "NonRankedGSMSet", {}, UnknownCodes::Ignored) {}
};

}  // namespace varnel
