#pragma once

#include <chrono>

#include "platform/Clock.h"

namespace varnel {

/// The machine's clock and time zone.
class SystemClock final : public Clock {
 public:
  /// The time to the nanosecond.
  Time now() const override;
  TimeZone zoneAt(Time time) const override;
};

/// The time since the machine was started. It never jumps, and it goes on while the machine sleeps.
std::chrono::nanoseconds timeSinceBoot();

}  // namespace varnel
