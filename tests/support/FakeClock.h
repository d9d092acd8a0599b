#pragma once

#include "platform/Clock.h"

namespace varnel {

/// A clock that stands still until a test sets it. It begins at 1970 in UTC.
class FakeClock final : public Clock {
 public:
  Time now() const override { return _now; }
  TimeZone zoneAt(Time) const override { return _zone; }

  void set(Time now) { _now = now; }
  void setZone(TimeZone zone) { _zone = zone; }

 private:
  Time _now;
  TimeZone _zone;
};

}  // namespace varnel
