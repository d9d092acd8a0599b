#pragma once

#include "LogGenerator/KLV/GSMUMTS/CellSet.h"

namespace varnel {

/// The active set on another frequency (3GPP TS 25.331).
class VirtualActiveSet final : public EmptyCellSet {
 public:
  static constexpr std::string_view sectionName = "Virtual Active Set";

  VirtualActiveSet() : EmptyCellSet(sectionName, "VirtualActiveSet") {}
};

}  // namespace varnel
