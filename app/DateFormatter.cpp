#include "app/DateFormatter.h"

#include <algorithm>
#include <optional>

namespace varnel {

namespace {

std::optional<long long> field(char letter, const CalendarTime& time) {
  switch (letter) {
    case 'y':
      return time.year;
    case 'M':
      return time.month;
    case 'd':
      return time.day;
    case 'H':
      return time.hour;
    case 'm':
      return time.minute;
    case 's':
      return time.second;
    default:
      return std::nullopt;
  }
}

std::string padded(long long number, std::size_t width) {
  const std::string digits = std::to_string(number);
  return std::string(width - std::min(width, digits.size()), '0') + digits;
}

}  // namespace

std::string DateFormatter::string(Time time, TimeZone zone) const {
  const CalendarTime local = calendarTime(time, zone);
  std::string text;
  bool isLiteral = false;
  for (std::size_t i = 0; i < _pattern.size();) {
    const char letter = _pattern[i];
    const std::size_t end = std::min(_pattern.find_first_not_of(letter, i), _pattern.size());
    if (letter == '\'') {
      isLiteral = !isLiteral;
      ++i;
      continue;
    }
    const auto number = isLiteral ? std::nullopt : field(letter, local);
    text += number ? padded(*number, end - i) : _pattern.substr(i, end - i);
    i = end;
  }
  return text;
}

}  // namespace varnel
