#include "programs/varnel-telephonyd/ReplaySource.h"

#include <utility>

#include "base/Log.h"

namespace varnel {

ReplaySource::ReplaySource(std::string path, double speed, AtEnd atEnd,
                           std::optional<std::uint8_t> subscription, Unasked unasked)
    : _path(std::move(path)),
      _atEnd(atEnd),
      _subscription(_path, subscription, unasked),
      _pace(_path, speed) {}

std::optional<StreamMessage> ReplaySource::next() {
  if (_upcoming) _played = std::exchange(_upcoming, std::nullopt);
  CaptureRecord record;
  try {
    if (readRecord(record)) return message(playingTimeOf(record.time), record);
    // Else it would seek what a capture does not have again and again.
    _seek.reset();
    if (_atEnd == AtEnd::StartOver && _pace.hasBegun()) {
      _capture.reset();
      if (readRecord(record)) return message(_pace.startOver(record.time), record);
    }
    _endNote = _subscription.endNote(_pace.hasBegun());
  } catch (const CaptureError& error) {
    logError("The replay ends: %s", error.what());
    _seek.reset();
    _endNote = std::string("the replay has ended early: ") + error.what();
  }
  return std::nullopt;
}

std::chrono::milliseconds ReplaySource::playingTimeOf(Time time) {
  if (!_seek) return _pace.following(time);
  const auto at = _pace.jump(time, _seek->at);
  if (hasReached(*_upcoming, _seek->place)) _seek.reset();
  return at;
}

MessageSource::Seeking ReplaySource::seek(const StreamPlace& place, std::chrono::milliseconds now) {
  const bool isAhead = _upcoming && !(_played && hasReached(*_played, place));
  if (isAhead) {
    _pace.jump(_upcoming->time.value(), now);
    _seek.reset();
    if (!hasReached(*_upcoming, place)) _seek = Seek{place, now};
    return Seeking::GoesOn;
  }
  _seek = Seek{place, now};
  _capture.reset();
  _played.reset();
  _upcoming.reset();
  _endNote.clear();
  return Seeking::StartsOver;
}

std::string ReplaySource::nameOfLast() const {
  return "Record " + std::to_string(_recordsRead) + " of " + _path;
}

bool ReplaySource::readRecord(CaptureRecord& record) {
  if (!_capture) {
    _capture = openCapture(_path, {.tell = [](const std::string& line) { logError("%s", line); }});
    _recordsRead = 0;
    _playingTime = {};
  }
  do {
    ++_recordsRead;
    if (!_capture->next(record)) return false;
  } while (!_subscription.takes(record.subscription));
  _upcoming = _playingTime.of(record.time);
  return true;
}

StreamMessage ReplaySource::message(std::chrono::milliseconds at, const CaptureRecord& record) {
  return {at, Bytes(record.message.begin(), record.message.end())};
}

}  // namespace varnel
