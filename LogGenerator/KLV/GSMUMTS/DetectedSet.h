#pragma once

#include "LogGenerator/KLV/GSMUMTS/CellSet.h"

namespace varnel {

/// The cells that the phone has found, but that are not in the network's list.
class DetectedSet final : public EmptyCellSet {
 public:
  static constexpr std::string_view sectionName = "Detected Set";

  DetectedSet() : EmptyCellSet(sectionName, "DetectedSet") {}
};

}  // namespace varnel
