#pragma once

#include "platform/Clock.h"

namespace varnel {

/// The clock of a capture. It shows the moment that is being played back, and 1970 before the first record.
/// Its zone is UTC, without daylight saving time.
class CaptureClock final : public Clock {
 public:
  Time now() const override { return _now; }
  TimeZone zoneAt(Time /*time*/) const override { return {}; }

  void set(Time now) { _now = now; }

 private:
  Time _now;
};

}  // namespace varnel
