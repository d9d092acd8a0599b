#include "programs/varnel-decode/ListProgress.h"

#include <sys/mman.h>
#include <unistd.h>

#include <algorithm>
#include <cinttypes>
#include <cstdio>
#include <new>
#include <numeric>
#include <utility>

#include "programs/varnel-decode/ProgressBar.h"

namespace varnel {

namespace {

using namespace std::chrono_literals;

constexpr auto delay = 500ms, interval = 100ms;
constexpr std::size_t width = 20;
constexpr double mebibyte = 1 << 20;
constexpr double longestTold_s = 100 * 3600;

std::string timeLeft(const ListPosition& position) {
  if (position.bytesDecoded == 0 || position.bytes <= position.bytesDone) return {};
  const double seconds = position.elapsed.count() * static_cast<double>(position.bytes - position.bytesDone) /
                         static_cast<double>(position.bytesDecoded);
  const auto whole = static_cast<unsigned long>(std::clamp(seconds, 0.0, longestTold_s));
  char text[64];
  if (whole < 3600)
    std::snprintf(text, sizeof text, "  %lu:%02lu left", whole / 60, whole % 60);
  else
    std::snprintf(text, sizeof text, "  %lu:%02lu:%02lu left", whole / 3600, whole / 60 % 60, whole % 60);
  return text;
}

}  // namespace

std::string progressText(const ListPosition& position) {
  const double bytes = static_cast<double>(std::max<std::uint64_t>(position.bytes, 1));
  const double share = std::min(static_cast<double>(position.bytesDone) / bytes, 1.0);
  const auto filled = static_cast<std::size_t>(share * width);
  char text[200];
  std::snprintf(text, sizeof text, "[%s%s] %3d %%  %.1f of %.1f MiB  %zu of %zu captures",
                std::string(filled, '#').c_str(), std::string(width - filled, '.').c_str(),
                static_cast<int>(share * 100), static_cast<double>(position.bytesDone) / mebibyte,
                bytes / mebibyte, position.capturesDone, position.captures);
  return text + timeLeft(position);
}

ListProgress::ListProgress(std::vector<std::uint64_t> sizes, std::size_t slots)
    : _sizes(std::move(sizes)),
      _captures(slots),
      _nextDrawing(_start + delay),
      _isShown(isTerminalThatErases(STDERR_FILENO)) {
  _ended.bytes = std::accumulate(_sizes.begin(), _sizes.end(), std::uint64_t{0});
  _ended.captures = _sizes.size();
  if (!_isShown) return;
  void* const memory =
      ::mmap(nullptr, slots * sizeof *_read, PROT_READ | PROT_WRITE, MAP_SHARED | MAP_ANONYMOUS, -1, 0);
  _isShown = memory != MAP_FAILED;
  if (_isShown) _read = new (memory) std::atomic<std::uint64_t>[slots]();
}

ListProgress::~ListProgress() {
  erase();
  if (_read) ::munmap(_read, _captures.size() * sizeof *_read);
}

std::atomic<std::uint64_t>* ListProgress::begin(std::size_t slot, std::size_t capture) {
  if (!_isShown) return nullptr;
  _captures[slot] = capture;
  _read[slot] = 0;
  return &_read[slot];
}

void ListProgress::end(std::size_t slot) {
  if (!_isShown || !_captures[slot]) return;
  const std::uint64_t bytes = _sizes[*_captures[slot]];
  _ended.bytesDone += bytes;
  _ended.bytesDecoded += bytes;
  ++_ended.capturesDone;
  _captures[slot].reset();
}

void ListProgress::leave(std::size_t capture) {
  if (!_isShown) return;
  _ended.bytesDone += _sizes[capture];
  ++_ended.capturesDone;
}

ListPosition ListProgress::position() const {
  ListPosition position = _ended;
  for (std::size_t slot = 0; slot < _captures.size(); ++slot) {
    if (!_captures[slot]) continue;
    const std::uint64_t bytes = std::min<std::uint64_t>(_read[slot], _sizes[*_captures[slot]]);
    position.bytesDone += bytes;
    position.bytesDecoded += bytes;
  }
  position.elapsed = Clock::now() - _start;
  return position;
}

void ListProgress::look() {
  if (!_isShown || Clock::now() < _nextDrawing) return;
  _nextDrawing = Clock::now() + interval;
  std::fprintf(stderr, "\r%s\x1b[K", progressText(position()).c_str());
  std::fflush(stderr);
  _isDrawn = true;
}

void ListProgress::erase() {
  if (!_isDrawn) return;
  std::fputs("\r\x1b[K", stderr);
  std::fflush(stderr);
  _isDrawn = false;
}

}  // namespace varnel
