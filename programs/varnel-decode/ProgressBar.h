#pragma once

#include <chrono>
#include <cstdint>
#include <optional>

#include "base/Log.h"
#include "host/captures/Capture.h"

namespace varnel {

/// Whether an open file is a terminal on which a line can be erased.
bool isTerminalThatErases(int file);

/// Shows on standard error how far a capture has been read: only on a terminal, only for a file, and only
/// after a while. It disappears with the object. While it is visible, it is the log's sink, so that log lines
/// do not run into it.
class ProgressBar final : public LogSink {
 public:
  enum class Output { LeavesTerminalAlone, GoesToTerminalAlongside };

  /// Draws nothing when the output goes to the same terminal. The log takes the lines of this priority number
  /// and lower. It must outlive the bar.
  ProgressBar(const Capture& capture, Output output, LogSink& log, int logLevel,
              std::chrono::milliseconds delay = std::chrono::milliseconds(500));
  ProgressBar(const ProgressBar&) = delete;
  ProgressBar& operator=(const ProgressBar&) = delete;
  ~ProgressBar() override;

  /// Call this once per record. It looks at the clock from time to time.
  void recordRead() {
    if (_size && ++_recordsUnseen >= recordsBetweenLooks) look();
  }

  void write(int priority, std::string_view text) override;

 private:
  using Clock = std::chrono::steady_clock;
  static constexpr unsigned recordsBetweenLooks = 256;

  void look();
  void draw(std::uint64_t bytesRead);
  void erase();

  const Capture& _capture;
  LogSink& _log;
  const int _logLevel;
  std::optional<std::uint64_t> _size;  // absent when no bar is drawn
  Clock::time_point _nextDrawing;
  unsigned _recordsUnseen = 0;
  bool _isDrawn = false;
};

}  // namespace varnel
