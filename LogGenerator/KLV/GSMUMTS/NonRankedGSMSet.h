#pragma once

#include "LogGenerator/SectionWithoutCodes.h"

namespace varnel {

/// The GSM cells that take no part in the ranking.
class NonRankedGSMSet final : public SectionWithoutCodes<NonRankedGSMSet> {
 public:
  static constexpr std::string_view sectionName = "Non-Ranked GSM Set";
  static constexpr std::string_view traceLine = "NonRankedGSMSet";
};

}  // namespace varnel
