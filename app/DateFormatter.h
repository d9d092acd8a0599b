#pragma once

#include <string>
#include <string_view>

#include "base/Time.h"

namespace varnel {

/// Writes moments by a pattern. Runs of y, M, d, H, m, and s stand for year, month, day, hour (0 to 23),
/// minute, and second, with leading zeros up to the length of the run. Text between apostrophes, and every
/// other character, stands for itself. (A subset of Unicode TS 35.)
class DateFormatter {
 public:
  explicit DateFormatter(std::string_view pattern) : _pattern(pattern) {}

  std::string string(Time time, TimeZone zone) const;

 private:
  std::string _pattern;
};

}  // namespace varnel
