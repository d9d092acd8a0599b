#pragma once

#include <atomic>
#include <chrono>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <vector>

namespace varnel {

/// How far a list of captures has been decoded.
struct ListPosition {
  std::uint64_t bytesDone = 0, bytesDecoded = 0, bytes = 0;  ///< done: decoded, or left as they were
  std::size_t capturesDone = 0, captures = 0;
  std::chrono::duration<double> elapsed{0};
};

/// "[####....]  41 %  42.5 of 103.0 MiB  402 of 980 captures  0:12 left". Without the time left as long as
/// nothing was decoded.
std::string progressText(const ListPosition& position);

/// Shows on standard error how far a list of captures has been decoded: only on a terminal, and only after a
/// while. The processes that decode tell by shared memory how far they have read.
class ListProgress final {
 public:
  /// The bytes of each capture. At most `slots` captures are decoded at the same time.
  ListProgress(std::vector<std::uint64_t> sizes, std::size_t slots);
  ListProgress(const ListProgress&) = delete;
  ListProgress& operator=(const ListProgress&) = delete;
  ~ListProgress();

  /// Whether there is a terminal to show it on. Otherwise the other functions do nothing.
  bool isShown() const { return _isShown; }

  /// Where a process that decodes a capture notes how many bytes it has read. Null when nothing is shown.
  std::atomic<std::uint64_t>* begin(std::size_t slot, std::size_t capture);
  /// The process has ended.
  void end(std::size_t slot);
  /// The capture is left as it is.
  void leave(std::size_t capture);

  /// Draws the bar, unless it was drawn a moment ago.
  void look();
  void erase();

 private:
  using Clock = std::chrono::steady_clock;

  ListPosition position() const;

  const std::vector<std::uint64_t> _sizes;
  std::vector<std::optional<std::size_t>> _captures;  // by slot
  std::atomic<std::uint64_t>* _read = nullptr;        // by slot
  ListPosition _ended;
  const Clock::time_point _start = Clock::now();
  Clock::time_point _nextDrawing;
  bool _isShown;
  bool _isDrawn = false;
};

}  // namespace varnel
