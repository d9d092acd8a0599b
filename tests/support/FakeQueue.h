#pragma once

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <map>
#include <memory>
#include <utility>

#include "platform/MainQueue.h"

namespace varnel {

/// A main queue whose time passes only when a test says so. Tasks run in the order of their moments. Tasks of
/// the same moment run in the order in which they were added. The queue must outlive its timers.
class FakeQueue final : public MainQueue {
 public:
  using Duration = std::chrono::milliseconds;

  void async(Task task) override { put(_now, std::move(task)); }
  void after(Duration delay, Task task) override { put(_now + delay, std::move(task)); }
  std::unique_ptr<RepeatingTimer> repeating(Duration interval, Task task) override {
    return std::make_unique<Timer>(*this, interval, std::move(task));
  }

  /// Runs everything that is due now, including tasks that are added meanwhile for now.
  void run() { advance(Duration::zero()); }

  /// Lets time pass and runs each task at its moment.
  void advance(Duration duration) {
    const Duration end = _now + duration;
    while (!_tasks.empty() && _tasks.begin()->first.first <= end) {
      auto next = _tasks.extract(_tasks.begin());
      _now = next.key().first;
      next.mapped()();
    }
    _now = end;
  }

  /// The time that has passed since the beginning.
  Duration now() const { return _now; }
  /// The tasks that have not run yet, without timers.
  std::size_t waitingTasks() const { return _tasks.size() - _timers; }
  /// Timers that have not been destroyed.
  std::size_t liveTimers() const { return _timers; }

 private:
  // The moment of a task, and the number of tasks that were added before it.
  using Position = std::pair<Duration, std::uint64_t>;

  class Timer final : public RepeatingTimer {
   public:
    Timer(FakeQueue& queue, Duration interval, Task task)
        : _queue(queue), _interval(interval), _task(std::move(task)) {
      ++_queue._timers;
      schedule();
    }
    Timer(const Timer&) = delete;
    Timer& operator=(const Timer&) = delete;
    ~Timer() override {
      _queue._tasks.erase(_next);
      --_queue._timers;
    }

   private:
    void schedule() {
      _next = _queue.put(_queue._now + _interval, [this] { fire(); });
    }
    void fire() {
      schedule();
      const Task task = _task;  // a copy: the task may destroy this timer
      task();
    }

    FakeQueue& _queue;
    Duration _interval;
    Task _task;
    Position _next;
  };

  Position put(Duration moment, Task task) {
    const Position position{moment, _count++};
    _tasks.emplace(position, std::move(task));
    return position;
  }

  Duration _now{0};
  std::uint64_t _count = 0;
  std::size_t _timers = 0;
  std::map<Position, Task> _tasks;
};

}  // namespace varnel
