#include "programs/shared/Timestamps.h"

#include <charconv>
#include <chrono>
#include <cstdio>

namespace varnel {

namespace {

// The number that fills a part of the text; -1 when there is none.
int numberAt(std::string_view text, std::size_t offset, std::size_t digits) {
  unsigned number = 0;
  const char* const first = text.data() + offset;
  const auto [end, failure] = std::from_chars(first, first + digits, number);
  return failure == std::errc() && end == first + digits ? static_cast<int>(number) : -1;
}

}  // namespace

std::string timestamp(Time time) {
  constexpr int nanosecondsPerMillisecond = 1'000'000;
  const CalendarTime utc = calendarTime(time);
  char text[64];
  std::snprintf(text, sizeof text, "%04lld-%02u-%02uT%02u:%02u:%02u.%03dZ", static_cast<long long>(utc.year),
                utc.month, utc.day, utc.hour, utc.minute, utc.second,
                time.nanoseconds / nanosecondsPerMillisecond);
  return text;
}

std::string secondsText(std::chrono::nanoseconds duration) {
  char text[32];
  std::snprintf(text, sizeof text, "%.3f", std::chrono::duration<double>(duration).count());
  return text;
}

std::optional<Time> timeOfDescription(std::string_view text) {
  constexpr std::size_t length = std::string_view("YYYY-MM-DD hh:mm:ss +0000").size();
  if (text.size() != length) return std::nullopt;
  const int year = numberAt(text, 0, 4), month = numberAt(text, 5, 2), day = numberAt(text, 8, 2);
  const int hour = numberAt(text, 11, 2), minute = numberAt(text, 14, 2), second = numberAt(text, 17, 2);
  const std::chrono::year_month_day date{std::chrono::year(year),
                                         std::chrono::month(static_cast<unsigned>(month)),
                                         std::chrono::day(static_cast<unsigned>(day))};
  if (year < 0 || month < 0 || day < 0 || !date.ok()) return std::nullopt;
  const std::int64_t days = std::chrono::sys_days(date).time_since_epoch().count();
  const Time time{((days * 24 + hour) * 60 + minute) * 60 + second, 0};
  // A text with other separators, or with numbers out of range, would differ from this one.
  if (dateDescription(time) != text) return std::nullopt;
  return time;
}

}  // namespace varnel
