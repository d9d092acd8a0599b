#pragma once

#include <chrono>
#include <optional>

#include "base/Time.h"
#include "host/ControlProtocol.h"

namespace varnel {

/// Where a stream is.
struct StreamPosition {
  /// How long playing took until the last message, at speed 1.
  std::chrono::milliseconds sinceStart{0};
  /// The time of the last message by the capture's clock; absent for a stream without one.
  std::optional<Time> time{};

  bool operator==(const StreamPosition&) const = default;
};

/// Whether a message at this position is at the place, or behind it. A message without a time never is, when
/// the place is a time.
bool hasReached(const StreamPosition& position, const StreamPlace& place);

/// Measures how long playing a capture takes at speed 1. Like a replay, it counts no more than five seconds
/// for a pause, and none for a clock that was set back.
class PlayingTime {
 public:
  /// The position of the next record.
  StreamPosition of(Time time);

 private:
  std::optional<Time> _last;  // absent before the first record
  std::chrono::nanoseconds _passed{0};
};

}  // namespace varnel
