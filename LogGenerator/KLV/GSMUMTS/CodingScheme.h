#pragma once

#include "LogGenerator/SectionWithoutCodes.h"

namespace varnel {

/// The GPRS coding scheme.
class CodingScheme final : public SectionWithoutCodes<CodingScheme> {
 public:
  static constexpr std::string_view sectionName = "Coding Scheme";
  // Kept: the text of `CellChangeCounters`.
  static constexpr std::string_view traceLine = "CellChangeCounters";
};

}  // namespace varnel
