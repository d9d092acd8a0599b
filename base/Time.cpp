#include "base/Time.h"

#include <cstdio>
#include <limits>

namespace varnel {

std::chrono::nanoseconds durationBetween(Time start, Time end) {
  if (end < start) return -durationBetween(end, start);
  // Unsigned seconds wrap, so that their difference comes out right.
  const std::uint64_t seconds =
      static_cast<std::uint64_t>(end.seconds) - static_cast<std::uint64_t>(start.seconds);
  constexpr std::uint64_t mostSeconds = std::numeric_limits<std::int64_t>::max() / 1'000'000'000;
  if (seconds >= mostSeconds) return std::chrono::nanoseconds::max();
  return std::chrono::nanoseconds(static_cast<std::int64_t>(seconds) * 1'000'000'000 + end.nanoseconds -
                                  start.nanoseconds);
}

CalendarTime calendarTime(Time time, TimeZone zone) {
  constexpr std::int64_t daySeconds = 86400;
  const std::int64_t local = time.seconds + zone.offsetSeconds;
  const std::int64_t dayNumber = local / daySeconds - (local % daySeconds < 0 ? 1 : 0);
  const auto ofDay = static_cast<unsigned>(local - dayNumber * daySeconds);
  const std::chrono::year_month_day date{std::chrono::sys_days(std::chrono::days(dayNumber))};
  return {int{date.year()}, unsigned{date.month()}, unsigned{date.day()},
          ofDay / 3600,     ofDay / 60 % 60,        ofDay % 60};
}

std::string dateDescription(Time time) {
  const CalendarTime utc = calendarTime(time);
  char text[64];
  std::snprintf(text, sizeof text, "%04lld-%02u-%02u %02u:%02u:%02u +0000", static_cast<long long>(utc.year),
                utc.month, utc.day, utc.hour, utc.minute, utc.second);
  return text;
}

}  // namespace varnel
