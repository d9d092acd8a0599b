#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The UMTS cells that are not ranked.
class NonRankedUMTSSet final : public SectionDecoder {
 public:
  static constexpr std::string_view sectionName = "Non-Ranked UMTS Set";

  NonRankedUMTSSet() : SectionDecoder(sectionName, "NonRankedUMTSSet", {}, UnknownCodes::Ignored) {}
};

}  // namespace varnel
