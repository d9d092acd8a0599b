#pragma once

#include <optional>
#include <string>

#include "base/Time.h"
#include "host/Capture.h"
#include "programs/varnel-telephonyd/MessageSource.h"

namespace varnel {

/// Plays a capture back: its messages in their order and at their distances in time, a message that is dated
/// before its predecessor together with that one.
class ReplaySource final : public MessageSource {
 public:
  enum class AtEnd { Stop, StartOver };

  /// The capture is played that many times as fast. When it starts over, the first message follows the last
  /// one after a second of the capture's time.
  ReplaySource(std::string path, double speed, AtEnd atEnd)
      : _path(std::move(path)), _speed(speed), _atEnd(atEnd) {}

  /// A fault of the capture is logged and ends the stream.
  std::optional<StreamMessage> next() override;

 private:
  bool readRecord(CaptureRecord& record);
  std::chrono::milliseconds playingTime(double seconds) const;

  const std::string _path;
  const double _speed;
  const AtEnd _atEnd;
  std::optional<CaptureReader> _capture;     // open while it is being played
  std::optional<Time> _first;                // the first record's time, once it was read
  std::chrono::milliseconds _roundStart{0};  // of the stream, when the first record was played
  std::chrono::milliseconds _last{0};
};

}  // namespace varnel
