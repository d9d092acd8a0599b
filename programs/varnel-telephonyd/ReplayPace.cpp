#include "programs/varnel-telephonyd/ReplayPace.h"

#include <algorithm>
#include <utility>

#include "base/ClockStep.h"
#include "base/Log.h"

namespace varnel {

ReplayPace::Milliseconds ReplayPace::following(Time time) {
  _last = momentAfter(time);
  return _last->at;
}

// A late record does not move the origin. So a stall of the sender delays nothing but what comes during it.
ReplayPace::Milliseconds ReplayPace::arriving(Time time, Milliseconds now) {
  const ClockStep step = _last ? clockStep(_last->time, time) : ClockStep::Ahead;
  if (step == ClockStep::Overtaking) return now;
  const bool isLate =
      step == ClockStep::None && _origin.at + playingTime(durationBetween(_origin.time, time)) <= now;
  if (!isLate) _origin = {time, now};
  _last = {time, _origin.at + playingTime(durationBetween(_origin.time, time))};
  return now;
}

ReplayPace::Milliseconds ReplayPace::startOver(Time time) {
  const auto pause = std::min(playingTime(std::chrono::seconds(1)), longestWait);
  return jump(time, _last->at + pause);
}

ReplayPace::Milliseconds ReplayPace::jump(Time time, Milliseconds at) {
  _last = _origin = {time, at};
  return at;
}

ReplayPace::Milliseconds ReplayPace::setSpeed(double speed, Milliseconds now) {
  const double oldSpeed = std::exchange(_speed, speed);
  if (!_last) return now;
  if (_last->at > now) {
    const std::chrono::duration<double, std::milli> wait = (_last->at - now) * (oldSpeed / speed);
    const auto longest = std::chrono::duration<double, std::milli>(longestWait);
    _last->at = now + std::chrono::round<Milliseconds>(std::min(wait, longest));
  }
  _origin = *_last;
  return _last->at;
}

void ReplayPace::delay(Milliseconds by) {
  _origin.at += by;
  if (_last) _last->at += by;
}

// Distances are measured from an origin. Distances from record to record would add up their rounding errors.
ReplayPace::Moment ReplayPace::momentAfter(Time time) {
  if (!_last) return _origin = {time, Milliseconds(0)};
  switch (clockStep(_last->time, time)) {
    case ClockStep::Overtaking:
      return *_last;
    case ClockStep::Back:
      return _origin = {time, _last->at};
    case ClockStep::None:
    case ClockStep::Ahead:
      break;
  }
  const Moment moment{time, _origin.at + playingTime(durationBetween(_origin.time, time))};
  if (moment.at - _last->at <= longestWait) return moment;
  tellShortening(time);
  return _origin = {time, _last->at + longestWait};
}

void ReplayPace::tellShortening(Time time) {
  if (std::exchange(_hasToldShortening, true)) return;
  logError("The replay of %s waits for no message longer than 5 seconds, as between %s and %s", _name,
           dateDescription(_last->time), dateDescription(time));
}

ReplayPace::Milliseconds ReplayPace::playingTime(std::chrono::nanoseconds duration) const {
  return std::chrono::round<Milliseconds>(std::chrono::duration<double>(duration) / _speed);
}

}  // namespace varnel
