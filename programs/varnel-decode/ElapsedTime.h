#pragma once

#include <chrono>
#include <optional>

#include "base/Time.h"

namespace varnel {

/// How much time has passed in a capture, by its own clock. What the clock is set by has not passed.
class ElapsedTime {
 public:
  /// The next record was captured then.
  void record(Time time);

  /// How long after the first record a moment is that comes no earlier than the last one; 0 before any
  /// record.
  std::chrono::nanoseconds at(Time time) const;

 private:
  std::optional<Time> _origin;  // where the clock was set last
  Time _last;
  std::chrono::nanoseconds _beforeOrigin{0};
};

}  // namespace varnel
