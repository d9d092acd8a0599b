#pragma once

#include <functional>
#include <utility>

namespace varnel {

/// Counts refreshes for a caller that waits for a number of them.
class AwaitedUpdates {
 public:
  /// Calls the task once, after this many more refreshes. A later call replaces an earlier one.
  void await(unsigned count, std::function<void()> task) {
    _left = count;
    _task = std::move(task);
  }
  void countOne() {
    if (_left == 0 || --_left > 0) return;
    if (const auto task = std::exchange(_task, nullptr)) task();
  }

 private:
  unsigned _left = 0;
  std::function<void()> _task;
};

}  // namespace varnel
