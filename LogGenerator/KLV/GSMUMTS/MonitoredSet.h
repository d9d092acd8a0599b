#pragma once

#include "LogGenerator/KLV/GSMUMTS/CellSet.h"

namespace varnel {

/// The cells in the network's list that are not in the active set.
class MonitoredSet final : public EmptyCellSet {
 public:
  static constexpr std::string_view sectionName = "Monitored Set";

  MonitoredSet() : EmptyCellSet(sectionName, "MonitoredSet") {}
};

}  // namespace varnel
