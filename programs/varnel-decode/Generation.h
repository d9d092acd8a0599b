#pragma once

#include <chrono>

#include "base/Time.h"
#include "base/Value.h"
#include "host/captures/CaptureRecord.h"

namespace varnel {

/// One display that was generated, and when. The display is live: what it shows changes with the next
/// message.
struct Generation {
  Time time;
  Value display;
  /// Where the date is unknown the time means nothing to a user, who gets `elapsed` in its place.
  Dating dating = Dating::Known;
  std::chrono::nanoseconds elapsed{0};  ///< since the first record, without what the clock was set by
};

}  // namespace varnel
