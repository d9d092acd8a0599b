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

/// The time from the start to the end; negative when the end is earlier. A time that 64 bits of nanoseconds
/// cannot hold (292 years and more) becomes the longest one that they can.
std::chrono::nanoseconds durationBetween(Time start, Time end);

/// The difference between a local clock and UTC.
struct TimeZone {
  std::int32_t offsetSeconds = 0;  ///< local time minus UTC, daylight saving time included
  bool daylight = false;           ///< daylight saving time is in force
};

/// A moment as calendar date and time of day in a time zone.
struct CalendarTime {
  std::int64_t year;
  unsigned month, day, hour, minute, second;
};
CalendarTime calendarTime(Time time, TimeZone zone = {});

/// The default text of a moment: YYYY-MM-DD hh:mm:ss +0000, always in UTC.
std::string dateDescription(Time time);

}  // namespace varnel
