#include "programs/varnel-telephonyd/ReplaySource.h"

#include <algorithm>

#include "base/Log.h"

namespace varnel {

namespace {

double secondsBetween(Time from, Time to) {
  return static_cast<double>(to.seconds) - static_cast<double>(from.seconds) +
         (to.nanoseconds - from.nanoseconds) * 1e-9;
}

}  // namespace

std::optional<StreamMessage> ReplaySource::next() {
  CaptureRecord record;
  try {
    if (!readRecord(record)) return std::nullopt;
  } catch (const CaptureError& error) {
    logError("The replay ends: %s", error.what());
    return std::nullopt;
  }
  if (!_first) _first = record.time;
  _last = std::max(_last, _roundStart + playingTime(secondsBetween(*_first, record.time)));
  return StreamMessage{_last, Bytes(record.message.begin(), record.message.end())};
}

bool ReplaySource::readRecord(CaptureRecord& record) {
  if (!_capture) _capture.emplace(_path);
  if (_capture->next(record)) return true;
  if (_atEnd == AtEnd::Stop || !_first) return false;
  _capture.emplace(_path);
  _roundStart = _last + playingTime(1);
  return _capture->next(record);
}

std::chrono::milliseconds ReplaySource::playingTime(double seconds) const {
  constexpr double longest_s = 1e9;  // for the times in a file may be anything
  const std::chrono::duration<double> time(std::clamp(seconds / _speed, 0.0, longest_s));
  return std::chrono::round<std::chrono::milliseconds>(time);
}

}  // namespace varnel
