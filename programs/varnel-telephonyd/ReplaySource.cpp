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
  CaptureRecord record;
  try {
    if (readRecord(record)) return message(_pace.following(record.time), record);
    if (_atEnd == AtEnd::StartOver && _pace.hasBegun()) {
      _capture.reset();
      if (readRecord(record)) return message(_pace.startOver(record.time), record);
    }
    _endNote = _subscription.endNote(_pace.hasBegun());
  } catch (const CaptureError& error) {
    logError("The replay ends: %s", error.what());
    _endNote = std::string("the replay has ended early: ") + error.what();
  }
  return std::nullopt;
}

std::string ReplaySource::nameOfLast() const {
  return "Record " + std::to_string(_recordsRead) + " of " + _path;
}

bool ReplaySource::readRecord(CaptureRecord& record) {
  if (!_capture) {
    _capture = openCapture(_path, {.tell = [](const std::string& line) { logError("%s", line); }});
    _recordsRead = 0;
  }
  do {
    ++_recordsRead;
    if (!_capture->next(record)) return false;
  } while (!_subscription.takes(record.subscription));
  return true;
}

StreamMessage ReplaySource::message(std::chrono::milliseconds at, const CaptureRecord& record) {
  return {at, Bytes(record.message.begin(), record.message.end())};
}

}  // namespace varnel
