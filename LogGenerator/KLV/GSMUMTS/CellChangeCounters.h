#pragma once

#include "LogGenerator/SectionWithoutCodes.h"

namespace varnel {

/// How often the serving cell changed.
class CellChangeCounters final : public SectionWithoutCodes<CellChangeCounters> {
 public:
  static constexpr std::string_view sectionName = "Cell Change Counters";
  static constexpr std::string_view traceLine = "CellChangeCounters";
};

}  // namespace varnel
