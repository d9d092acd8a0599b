#pragma once

#include <optional>
#include <vector>

#include "app/ValueHistory.h"

namespace varnel {

/// The course of a row's number over the last four minutes: 24 values, each the last one of ten seconds.
/// Nothing where the row was not there. Empty for a row that is no number. For `CellView::setCourse`.
///
/// The stretches end at whole tens of seconds, so that the line moves only when one is over.
std::vector<std::optional<double>> recentCourse(const ValueHistory& history, const VarnelModelNode& row);

}  // namespace varnel
