#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// How often the serving cell changed.
class CellChangeCounters final : public SectionDecoder {
 public:
  static constexpr std::string_view sectionName = "Cell Change Counters";

  CellChangeCounters() : SectionDecoder(sectionName, "CellChangeCounters", {}, UnknownCodes::Ignored) {}
};

}  // namespace varnel
