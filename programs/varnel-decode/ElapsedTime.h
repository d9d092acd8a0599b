#pragma once

#include <chrono>
#include <optional>

#include "base/Time.h"

namespace varnel {

/// How much time has passed in a capture by its own clock, without the jumps of a clock that was set.
class ElapsedTime {
 public:
  /// The time of the next record.
  void record(Time time);

  /// The time from the first record to this moment, which must not be before the last record. 0 before any
  /// record.
  std::chrono::nanoseconds at(Time time) const;

 private:
  std::optional<Time> _origin;  // the first record, or the one at which the clock was set last
  Time _last;
  std::chrono::nanoseconds _beforeOrigin{0};
};

}  // namespace varnel
