#include "programs/varnel-telephonyd/CaptureSurvey.h"

#include <filesystem>
#include <utility>

namespace varnel {

namespace {

// Some milliseconds of work.
constexpr int recordsAtATime = 2000;

}  // namespace

const std::optional<CaptureSurvey::Result>& CaptureSurvey::result() {
  if (std::exchange(_hasBegun, true)) return _result;
  std::error_code failure;
  if (!std::filesystem::is_regular_file(_path, failure)) return _result;
  try {
    _capture = openCapture(_path);
    readSome();
  } catch (const CaptureError&) {  // the replay itself tells
    _capture.reset();
  }
  return _result;
}

void CaptureSurvey::readLater() {
  _queue.async([this, life = std::weak_ptr(_life)] {
    if (!life.expired()) readSome();
  });
}

void CaptureSurvey::readSome() {
  CaptureRecord record;
  try {
    for (int count = 0; count < recordsAtATime; ++count) {
      if (!_capture->next(record)) {
        _sofar.leftOut = _capture->leftOut();
        _result = _sofar;
        _capture.reset();
        return;
      }
      if (!_filter.takes(record.subscription)) continue;
      if (!_sofar.first) _sofar.first = record.time;
      _sofar.last = record.time;
      _sofar.length = _playingTime.of(record.time).sinceStart;
    }
  } catch (const CaptureError&) {  // the replay ends here too
    _sofar.leftOut = _capture->leftOut();
    _result = _sofar;
    _capture.reset();
    return;
  }
  readLater();
}

}  // namespace varnel
