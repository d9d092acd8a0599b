#include "programs/varnel/CaptureCourses.h"

#include <chrono>

namespace varnel {

namespace {

using namespace std::chrono_literals;

constexpr auto lengthOfSearch = 1s;

}  // namespace

std::vector<std::optional<double>> CaptureCourses::course(const VarnelModelNode& row) const {
  const auto shown = _sources.displays.seriesOf(row);
  if (!shown) return {};
  if (const auto place = playedPlace()) {
    const auto series = place->numbers->seriesOfKey(_sources.displays.key(*shown));
    auto course =
        series ? recentCourse(*place->numbers, *series, place->point) : std::vector<std::optional<double>>();
    if (!course.empty()) return course;
  }
  return recentCourse(_sources.displays, row);
}

std::optional<CaptureCourses::Place> CaptureCourses::playedPlace() const {
  const auto capture = _sources.capture();
  if (!capture) return std::nullopt;
  const auto point = pointAt(*capture->numbers, _sources.clock.now());
  if (!point || (!capture->isWhole && *point > capture->numbers->whole().end)) return std::nullopt;
  return Place{capture->numbers, *point};
}

std::optional<ValueHistory::Duration> CaptureCourses::pointAt(const ValueHistory& numbers, Time time) const {
  const auto end = numbers.whole().end;
  if (_search && _search->numbers == &numbers && _search->end == end) {
    const auto since = durationBetween(_search->time, time);
    if (since >= std::chrono::seconds::zero() && since < lengthOfSearch)
      return _search->point ? std::optional(*_search->point + since) : std::nullopt;
  }
  _search = Search{&numbers, end, time, numbers.pointAt(time)};
  return _search->point;
}

}  // namespace varnel
