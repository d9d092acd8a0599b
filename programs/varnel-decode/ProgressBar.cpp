#include "programs/varnel-decode/ProgressBar.h"

#include <unistd.h>

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <string>

namespace varnel {

namespace {

using namespace std::chrono_literals;

constexpr auto interval = 100ms;
constexpr std::size_t width = 40;
constexpr double mebibyte = 1 << 20;

}  // namespace

bool isTerminalThatErases(int file) {
  const char* const terminal = std::getenv("TERM");
  return ::isatty(file) && terminal && std::string_view(terminal) != "dumb";
}

ProgressBar::ProgressBar(const Capture& capture, Output output, LogSink& log, int logLevel,
                         std::chrono::milliseconds delay)
    : _capture(capture), _log(log), _logLevel(logLevel), _nextDrawing(Clock::now() + delay) {
  if (!isTerminalThatErases(STDERR_FILENO)) return;
  if (output == Output::GoesToTerminalAlongside && ::isatty(STDOUT_FILENO)) return;
  _size = _capture.fileSize();
  if (_size) setLogSink(this, _logLevel);
}

ProgressBar::~ProgressBar() {
  if (!_size) return;
  erase();
  setLogSink(&_log, _logLevel);
}

void ProgressBar::write(int priority, std::string_view text) {
  erase();
  _log.write(priority, text);
}

void ProgressBar::look() {
  _recordsUnseen = 0;
  const auto now = Clock::now();
  if (now < _nextDrawing) return;
  _nextDrawing = now + interval;
  draw(_capture.bytesRead());
}

void ProgressBar::draw(std::uint64_t bytesRead) {
  const double size = static_cast<double>(std::max(*_size, std::uint64_t{1}));
  const double share = std::min(static_cast<double>(bytesRead) / size, 1.0);
  const auto filled = static_cast<std::size_t>(share * width);
  const std::string bar = std::string(filled, '#') + std::string(width - filled, '.');
  std::fprintf(stderr, "\r[%s] %3d %%  %.1f of %.1f MiB\x1b[K", bar.c_str(), static_cast<int>(share * 100),
               static_cast<double>(bytesRead) / mebibyte, size / mebibyte);
  _isDrawn = true;
}

void ProgressBar::erase() {
  if (!_isDrawn) return;
  std::fputs("\r\x1b[K", stderr);
  _isDrawn = false;
}

}  // namespace varnel
