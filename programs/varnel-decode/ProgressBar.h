#pragma once

#include <chrono>
#include <cstdint>
#include <optional>

#include "base/Log.h"
#include "host/captures/Capture.h"

namespace varnel {

/// How far a capture has been read, on standard error: only on a terminal, only for a file, and only once it
/// has taken a while. It is gone when the object goes. While it shows it is the log's sink, so that lines of
/// the log do not run into it.
class ProgressBar final : public LogSink {
 public:
  enum class Output { LeavesTerminalAlone, GoesToTerminalAlongside };

  /// Draws nothing beside lines that go to the same terminal. The log takes the lines of that priority number
  /// and lower, and outlives the bar.
  ProgressBar(const Capture& capture, Output output, LogSink& log, int logLevel,
              std::chrono::milliseconds delay = std::chrono::milliseconds(500));
  ProgressBar(const ProgressBar&) = delete;
  ProgressBar& operator=(const ProgressBar&) = delete;
  ~ProgressBar() override;

  /// To be called once a record; looks at the clock now and then.
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
  std::optional<std::uint64_t> _size;  // absent when no bar is to be drawn
  Clock::time_point _nextDrawing;
  unsigned _recordsUnseen = 0;
  bool _isDrawn = false;
};

}  // namespace varnel
