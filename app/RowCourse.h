#pragma once

#include <optional>
#include <vector>

#include "app/ValueHistory.h"

namespace varnel {

/// The course of a row's number over the four minutes up to its last change: 24 values, each the last one of
/// ten seconds. Nothing where the row was not there. Empty for a row that is no number. When the number did
/// not change within the last four minutes, these are shown. For `CellFacts::course`.
///
/// The stretches end at whole tens of seconds. So the line moves only when the number changes after one is
/// over, and a terminal need not draw the lines of all rows anew when one number changes.
std::vector<std::optional<double>> recentCourse(const ValueHistory& history, const VarnelModelNode& row);

}  // namespace varnel
