#pragma once

#include <chrono>
#include <functional>
#include <optional>
#include <string>

#include "base/Bytes.h"
#include "base/Time.h"
#include "host/CaptureWriter.h"

namespace varnel {

/// Records what is sent to viewers. If recording fails, it ends, and sending goes on.
class Recorder {
 public:
  struct Setup {
    std::string path;  ///< "-" is standard output
    ExistingRecording existing = ExistingRecording::Refused;
    std::optional<std::string> technology{};  ///< the technology that the recording names; absent: none
    std::function<Time()> now;
    /// The time since some fixed moment. It never jumps.
    std::function<std::chrono::nanoseconds()> uptime;
    /// Called once with one sentence that says why, when the recording ends before the recorder does.
    std::function<void(const std::string& why)> ended;
  };

  /// Throws std::runtime_error when this recording cannot be made.
  explicit Recorder(Setup setup);

  /// Records a message. Its time is the time of the first message plus the time that has passed since. So a
  /// clock that is set meanwhile does not show.
  void record(ByteView message);

 private:
  Time timeOfMessage();

  Setup _setup;
  std::optional<CaptureWriter> _writer;  // absent once the recording has ended
  std::optional<Time> _start;            // absent before the first message
  std::chrono::nanoseconds _startUptime{0};
};

}  // namespace varnel
