#pragma once

#include "base/Time.h"

namespace varnel {

/// The host's clock and its local time zone.
class Clock {
 public:
  virtual ~Clock() = default;
  virtual Time now() const = 0;
  /// The local zone as it is in force at that moment.
  virtual TimeZone zoneAt(Time time) const = 0;
};

}  // namespace varnel
