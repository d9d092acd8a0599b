#pragma once

#include "platform/Clock.h"

namespace varnel {

/// The machine's clock and time zone.
class SystemClock final : public Clock {
 public:
  /// To the nanosecond.
  Time now() const override;
  TimeZone zoneAt(Time time) const override;
};

}  // namespace varnel
