#include "app/RowCourse.h"

namespace varnel {

namespace {

constexpr std::size_t columns = 24;
constexpr ValueHistory::Duration columnLength = std::chrono::seconds(10);

}  // namespace

std::vector<std::optional<double>> recentCourse(const ValueHistory& history, const VarnelModelNode& row) {
  const auto series = history.seriesOf(row);
  if (!series) return {};
  const auto newest = history.whole().end;
  // A stretch has its end, but not its beginning.
  const auto begun = newest / columnLength + (newest % columnLength == ValueHistory::Duration() ? 0 : 1);
  const auto end = begun * columnLength;
  const ValueHistory::Stretch stretch{end - columns * columnLength, end};
  std::vector<std::optional<double>> course;
  course.reserve(columns);
  for (const auto& column : history.columns(*series, stretch, columns))
    course.push_back(column.isEmpty ? std::nullopt : std::optional(column.last));
  return course;
}

}  // namespace varnel
