#pragma once

#include "base/Time.h"

namespace varnel {

/// The host's clock and its local time zone.
class Clock {
 public:
  virtual ~Clock() = default;
  virtual Time now() const = 0;
  /// The rules of the local zone at that moment.
  virtual TimeZone zoneAt(Time time) const = 0;
};

}  // namespace varnel
