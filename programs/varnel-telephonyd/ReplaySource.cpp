#include "programs/varnel-telephonyd/ReplaySource.h"

#include <algorithm>
#include <utility>

#include "base/ClockStep.h"
#include "base/Log.h"

namespace varnel {

ReplaySource::ReplaySource(std::string path, double speed, AtEnd atEnd,
                           std::optional<std::uint8_t> subscription)
    : _path(std::move(path)),
      _speed(speed),
      _atEnd(atEnd),
      _subscriptions(subscription),
      _tellsOthers(!subscription) {}

std::optional<StreamMessage> ReplaySource::next() {
  CaptureRecord record;
  try {
    if (!readRecord(record)) {
      _endNote = "the replay of " + _path + " has ended";
      if (!_last && _hasOthers)
        _endNote += ": it has no records of " + subscriptionName(_subscriptions.taken());
      return std::nullopt;
    }
  } catch (const CaptureError& error) {
    logError("The replay ends: %s", error.what());
    _endNote = std::string("the replay has ended early: ") + error.what();
    return std::nullopt;
  }
  _last = following(record.time);
  return StreamMessage{_last->at, Bytes(record.message.begin(), record.message.end())};
}

std::string ReplaySource::nameOfLast() const {
  return "Record " + std::to_string(_recordsRead) + " of " + _path;
}

bool ReplaySource::readRecord(CaptureRecord& record) {
  if (!_capture) _capture = open();
  if (readTaken(record)) return true;
  if (_atEnd == AtEnd::Stop || !_last) return false;
  _capture = open();
  _recordsRead = 0;
  if (!readTaken(record)) return false;
  const auto pause = std::min(playingTime(std::chrono::seconds(1)), longestWait);
  _last = _origin = {record.time, _last->at + pause};
  return true;
}

bool ReplaySource::readTaken(CaptureRecord& record) {
  for (;;) {
    ++_recordsRead;
    if (!_capture->next(record)) return false;
    if (_subscriptions.takes(record.subscription)) return true;
    noteOther(*record.subscription);
  }
}

void ReplaySource::noteOther(std::uint8_t subscription) {
  _hasOthers = true;
  if (!std::exchange(_tellsOthers, false)) return;
  logError("%s has records of %s, which are replayed, and of %s, which are not; choose by --sim", _path,
           subscriptionName(_subscriptions.taken()), subscriptionName(subscription));
}

// Distances are measured from an origin. Distances from record to record would add up their rounding errors.
ReplaySource::Moment ReplaySource::following(Time time) {
  if (!_last) return _origin = {time, std::chrono::milliseconds(0)};
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

void ReplaySource::tellShortening(Time time) {
  if (std::exchange(_hasToldShortening, true)) return;
  logError("The replay of %s waits for no message longer than 5 seconds, as between %s and %s", _path,
           dateDescription(_last->time), dateDescription(time));
}

std::chrono::milliseconds ReplaySource::playingTime(std::chrono::nanoseconds duration) const {
  return std::chrono::round<std::chrono::milliseconds>(std::chrono::duration<double>(duration) / _speed);
}

std::unique_ptr<Capture> ReplaySource::open() const {
  return openCapture(_path, {.tell = [](const std::string& line) { logError("%s", line); }});
}

}  // namespace varnel
