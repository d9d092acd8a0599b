#pragma once

#include <chrono>
#include <optional>
#include <string>

#include "base/Time.h"

namespace varnel {

/// Says when the records of a capture are played, from their times. No wait is longer than five seconds. A
/// record dated before its predecessor comes together with it. When the capture's clock was set back, the
/// records after that keep their distances.
class ReplayPace {
 public:
  using Milliseconds = std::chrono::milliseconds;

  static constexpr Milliseconds longestWait{5000};

  /// The name of the capture is for the log.
  ReplayPace(std::string name, double speed) : _name(std::move(name)), _speed(speed) {}

  /// When the next record is played. A log line tells, once, that a wait was shortened.
  Milliseconds following(Time time);
  /// The same for a record that is played now, whatever its time. The records that follow keep their
  /// distances from it, unless it is late: then they catch up.
  Milliseconds arriving(Time time, Milliseconds now);
  /// The same for the first record of a round.
  Milliseconds startOver(Time time);
  /// Plays a record at this time, whatever its own. The records that follow keep their distances from it.
  Milliseconds jump(Time time, Milliseconds at);
  /// Changes the speed of everything after `now`. Returns when the last record is played.
  Milliseconds setSpeed(double speed, Milliseconds now);
  /// Plays everything after this later.
  void delay(Milliseconds by);

  /// Whether there was a record.
  bool hasBegun() const { return _last.has_value(); }

 private:
  /// A moment of the capture, and when it is played.
  struct Moment {
    Time time;
    Milliseconds at;
  };

  Moment momentAfter(Time time);
  void tellShortening(Time time);
  Milliseconds playingTime(std::chrono::nanoseconds duration) const;

  const std::string _name;
  double _speed;
  std::optional<Moment> _last;  // absent before the first record
  Moment _origin{};             // from here the distances are measured
  bool _hasToldShortening = false;
};

}  // namespace varnel
