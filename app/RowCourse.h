#pragma once

#include <optional>
#include <string_view>
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
/// The same for a series, as it was at a point of the axis: nothing later counts. Empty when the series has
/// no sample within the four minutes before.
std::vector<std::optional<double>> recentCourse(const ValueHistory& history, ValueHistory::Number series,
                                                ValueHistory::Duration until);

/// Who knows more of the courses of rows than the displays that were shown.
class RowCourses {
 public:
  virtual ~RowCourses() = default;
  /// As `recentCourse`.
  virtual std::vector<std::optional<double>> course(const VarnelModelNode& row) const = 0;
  /// Another number than before when rows have other courses now, though the display is the same.
  virtual unsigned edition() const = 0;
};

/// Whether the number of a row with this name only tells one thing from another, such as a cell or a channel,
/// and measures nothing. Its course is not shown beside it.
bool isIdentity(std::string_view rowName);

}  // namespace varnel
