#pragma once

#include <chrono>
#include <compare>
#include <cstdint>
#include <string>

namespace varnel {

/// A moment: seconds since 1970-01-01 00:00:00 UTC and the nanoseconds (0 to 999,999,999) past them.
struct Time {
  std::int64_t seconds = 0;
  std::int32_t nanoseconds = 0;

  friend auto operator<=>(const Time&,
                          const Time&) = default;  // NOLINT(modernize-use-nullptr): no pointer here
};

/// How long after the one moment the other is, negative when it is before. What nanoseconds cannot tell (292
/// years and more) comes out as the longest time that they can.
std::chrono::nanoseconds durationBetween(Time start, Time end);

/// How far a local clock stands from UTC.
struct TimeZone {
  std::int32_t offsetSeconds = 0;  ///< local time less UTC, daylight time included
  bool daylight = false;           ///< daylight saving time is in force
};

/// A moment broken down on the calendar of a zone.
struct CalendarTime {
  std::int64_t year;
  unsigned month, day, hour, minute, second;
};
CalendarTime calendarTime(Time time, TimeZone zone = {});

/// The default textual form of a moment: YYYY-MM-DD hh:mm:ss +0000, always in UTC.
std::string dateDescription(Time time);

}  // namespace varnel
