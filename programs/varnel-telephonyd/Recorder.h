#pragma once

#include <chrono>
#include <functional>
#include <optional>
#include <string>

#include "base/Bytes.h"
#include "base/Time.h"
#include "host/CaptureWriter.h"

namespace varnel {

/// Records what is sent to viewers, until that fails: the sending goes on.
class Recorder {
 public:
  struct Setup {
    std::string path;  ///< "-" is standard output
    ExistingRecording existing = ExistingRecording::Refused;
    std::optional<std::string> technology{};  ///< what the recording says that it is of; absent: nothing
    std::function<Time()> now;
    /// The time since any one moment; it never steps.
    std::function<std::chrono::nanoseconds()> uptime;
    /// Called once, when the recording ends before the recorder does, with one sentence that says why.
    std::function<void(const std::string& why)> ended;
  };

  /// Throws std::runtime_error when there can be no such recording.
  explicit Recorder(Setup setup);

  /// Records a message. Its time is that of the first message and what has passed since: a clock that is set
  /// meanwhile does not show.
  void record(ByteView message);

 private:
  Time timeOfMessage();

  Setup _setup;
  std::optional<CaptureWriter> _writer;  // absent once the recording has ended
  std::optional<Time> _start;            // absent before the first message
  std::chrono::nanoseconds _startUptime{0};
};

}  // namespace varnel
