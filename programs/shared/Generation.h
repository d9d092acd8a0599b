#pragma once

#include <chrono>

#include "base/Time.h"
#include "base/Value.h"
#include "host/captures/CaptureRecord.h"

namespace varnel {

/// One display that was generated, and its time. The display is live: the next message changes what it shows.
struct Generation {
  Time time;
  Value display;
  /// Where the date is unknown, `time` means nothing to a user, who gets `elapsed` instead.
  Dating dating = Dating::Known;
  std::chrono::nanoseconds elapsed{0};  ///< since the first record, without the jumps of a clock that was set
};

}  // namespace varnel
