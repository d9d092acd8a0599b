#include "programs/varnel-telephonyd/SimulationSource.h"

namespace varnel {

std::optional<StreamMessage> SimulationSource::next() {
  if (_upcoming) _played = _upcoming;
  SimulatedMessage message = _modem->next();
  _upcoming = StreamPosition{message.at};
  if (_place) {
    _modemOrigin = message.at;
    if (hasReached(*_upcoming, *_place)) _place.reset();
  }
  return StreamMessage{playingTimeOf(message.at), std::move(message.bytes)};
}

SimulationSource::Milliseconds SimulationSource::playingTimeOf(Milliseconds modemTime) const {
  const std::chrono::duration<double, std::milli> distance = modemTime - _modemOrigin;
  return _origin + std::chrono::round<Milliseconds>(distance / _speed);
}

SimulationSource::Milliseconds SimulationSource::setSpeed(double speed, Milliseconds now) {
  // The modem's time that is played now.
  const std::chrono::duration<double, std::milli> played = (now - _origin) * _speed;
  _modemOrigin += std::chrono::round<Milliseconds>(played);
  _origin = now;
  _speed = speed;
  return _upcoming ? playingTimeOf(_upcoming->sinceStart) : now;
}

MessageSource::Seeking SimulationSource::seek(const StreamPlace& place, Milliseconds now) {
  _origin = now;
  const bool isAhead = _upcoming && !(_played && hasReached(*_played, place));
  if (isAhead) {
    _modemOrigin = _upcoming->sinceStart;
    _place.reset();
    if (!hasReached(*_upcoming, place)) _place = place;
    return Seeking::GoesOn;
  }
  _modem = _makeModem();
  _modemOrigin = Milliseconds(0);
  _played.reset();
  _upcoming.reset();
  _place = place;
  return Seeking::StartsOver;
}

}  // namespace varnel
