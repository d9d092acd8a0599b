#pragma once

#include <string>
#include <string_view>

#include "base/Time.h"

namespace varnel {

/// Writes moments by a pattern. Runs of y, M, d, H, m and s stand for year, month, day, hour (of 24), minute
/// and second, with zeros in front to the length of the run; what is between apostrophes, and every other
/// character, is itself. (Unicode TS 35, as far as viewers need it.)
class DateFormatter {
 public:
  explicit DateFormatter(std::string_view pattern) : _pattern(pattern) {}

  std::string string(Time time, TimeZone zone) const;

 private:
  std::string _pattern;
};

}  // namespace varnel
