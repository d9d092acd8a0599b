#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The GPRS coding scheme.
class CodingScheme final : public SectionDecoder {
 public:
  static constexpr std::string_view sectionName = "Coding Scheme";

  // Kept: the trace line of `CellChangeCounters`.
  CodingScheme() : SectionDecoder(sectionName, "CellChangeCounters", {}, UnknownCodes::Ignored) {}
};

}  // namespace varnel
