#pragma once

#include "LogGenerator/KLV/GSMUMTS/CellSet.h"

namespace varnel {

/// The cells that were found without being on the network's list.
class DetectedSet final : public EmptyCellSet {
 public:
  static constexpr std::string_view sectionName = "Detected Set";

  DetectedSet() : EmptyCellSet(sectionName, "DetectedSet") {}
};

}  // namespace varnel
