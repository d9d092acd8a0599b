#pragma once

#include <chrono>
#include <functional>
#include <optional>
#include <utility>

#include "host/SystemClock.h"
#include "platform/Clock.h"

namespace varnel {

/// The moment that comes so much later; the same one when no number holds that.
Time laterBy(std::chrono::nanoseconds duration, Time time);

/// The host's clock; while a capture is played, the capture's. A server tells now and then how far it is, and
/// between two such moments the clock goes on by itself, at the speed at which the capture is played.
class PlayedClock final : public Clock {
 public:
  /// The time since any moment. It never jumps.
  using Uptime = std::function<std::chrono::nanoseconds()>;
  /// A pause of the capture that is longer than this is played as one of this length.
  static constexpr std::chrono::seconds longestPause{5};

  /// The host's clock must outlive the object.
  explicit PlayedClock(const Clock& host, Uptime uptime = timeSinceBoot)
      : _host(host), _uptime(std::move(uptime)) {}

  /// The last message that was sent has this time of the capture. The clock goes on from there, so many times
  /// as fast as the host's; with 0 it stands. It does not step back when it was just a little ahead, and it
  /// does not go far ahead when no other message comes.
  void follow(Time told, double speed);
  /// Stands at this time of a capture until the next `follow`.
  void standAt(Time time);
  /// Stands where it is. Does nothing while it shows the host's time.
  void stand();
  /// Shows the host's time, as in the beginning.
  void followHost() { _played.reset(); }
  bool followsCapture() const { return _played.has_value(); }

  Time now() const override;
  TimeZone zoneAt(Time time) const override { return _host.zoneAt(time); }

 private:
  struct Played {
    std::optional<Time> told;           // absent while it stands where nobody told
    Time from;                          // shown until it goes on from there
    std::chrono::nanoseconds begin{0};  // the uptime when it goes on
    double speed = 0;
    Time last;  // it goes no further
  };

  const Clock& _host;
  const Uptime _uptime;
  std::optional<Played> _played;  // absent while the host's time is shown
};

}  // namespace varnel
