#pragma once

#include "LogGenerator/SectionWithoutCodes.h"

namespace varnel {

/// The UMTS cells that take no part in the ranking.
class NonRankedUMTSSet final : public SectionWithoutCodes<NonRankedUMTSSet> {
 public:
  static constexpr std::string_view sectionName = "Non-Ranked UMTS Set";
  static constexpr std::string_view traceLine = "NonRankedUMTSSet";
};

}  // namespace varnel
