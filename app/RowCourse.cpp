#include "app/RowCourse.h"

namespace varnel {

namespace {

constexpr std::size_t columns = 24;
constexpr ValueHistory::Duration columnLength = std::chrono::seconds(10);

// The last moment within the length of the line at which the value became another one, or came back; the
// last sample's when it stood all the time, so that the line is flat. Nothing without samples.
std::optional<ValueHistory::Duration> lastChange(const ValueHistory& history, ValueHistory::Number series,
                                                 ValueHistory::Duration until) {
  const auto samples = history.samples(series, {until - columns * columnLength, until});
  for (std::size_t i = samples.size(); i-- > 0;) {
    const bool isChange = samples[i].followsGap || (i > 0 && samples[i].value != samples[i - 1].value);
    if (isChange) return samples[i].at;
  }
  return samples.empty() ? std::nullopt : std::optional(samples.back().at);
}

}  // namespace

std::vector<std::optional<double>> recentCourse(const ValueHistory& history, const VarnelModelNode& row) {
  const auto series = history.seriesOf(row);
  if (!series) return {};
  return recentCourse(history, *series, history.whole().end);
}

std::vector<std::optional<double>> recentCourse(const ValueHistory& history, ValueHistory::Number series,
                                                ValueHistory::Duration until) {
  const auto newest = lastChange(history, series, until);
  if (!newest) return {};
  // A stretch has its end, but not its beginning.
  const auto begun = *newest / columnLength + (*newest % columnLength == ValueHistory::Duration() ? 0 : 1);
  const auto end = begun * columnLength;
  const ValueHistory::Stretch stretch{end - columns * columnLength, end};
  auto found = history.columns(series, stretch, columns);
  if (until < end) {
    const ValueHistory::Stretch last{end - columnLength + ValueHistory::Duration(1), until};
    found.back() = history.columns(series, last, 1).front();
  }
  std::vector<std::optional<double>> course;
  course.reserve(columns);
  for (const auto& column : found)
    course.push_back(column.isEmpty ? std::nullopt : std::optional(column.last));
  return course;
}

}  // namespace varnel
