#pragma once

#include <chrono>
#include <functional>
#include <memory>

namespace varnel {

/// A task that runs again and again on the main queue until this object is destroyed. The task may destroy
/// it.
class RepeatingTimer {
 public:
  virtual ~RepeatingTimer() = default;
};

/// The one queue on which everything runs, in the order in which it was put there.
class MainQueue {
 public:
  using Task = std::function<void()>;

  virtual ~MainQueue() = default;
  /// Runs the task once, after the running one has returned.
  virtual void async(Task task) = 0;
  /// Runs the task once, that long from now.
  virtual void after(std::chrono::milliseconds delay, Task task) = 0;
  /// Runs the task at every interval from now on; the first time after one interval.
  virtual std::unique_ptr<RepeatingTimer> repeating(std::chrono::milliseconds interval, Task task) = 0;
};

}  // namespace varnel
