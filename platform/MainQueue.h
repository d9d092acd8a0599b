#pragma once

#include <chrono>
#include <functional>
#include <memory>

namespace varnel {

/// Runs a task again and again on the main queue until this object is destroyed. The task may destroy it.
class RepeatingTimer {
 public:
  virtual ~RepeatingTimer() = default;
};

/// The queue on which everything runs, in the order in which it was added.
class MainQueue {
 public:
  using Task = std::function<void()>;

  virtual ~MainQueue() = default;
  /// Runs the task once, after the running task has returned.
  virtual void async(Task task) = 0;
  /// Runs the task once, after the delay.
  virtual void after(std::chrono::milliseconds delay, Task task) = 0;
  /// Runs the task once per interval. The first run comes after one interval.
  virtual std::unique_ptr<RepeatingTimer> repeating(std::chrono::milliseconds interval, Task task) = 0;
};

}  // namespace varnel
