#pragma once

#include <chrono>
#include <functional>
#include <map>

namespace varnel::simulation {

/// Tasks that a phone has still to do, each at its time.
class Script {
 public:
  void at(std::chrono::milliseconds time, std::function<void()> task) {
    _tasks.emplace(time, std::move(task));
  }

  /// Runs the tasks that are due, in their order. A task may add others.
  void run(std::chrono::milliseconds now) {
    while (!_tasks.empty() && _tasks.begin()->first <= now) {
      const auto task = _tasks.extract(_tasks.begin());
      task.mapped()();
    }
  }

 private:
  std::multimap<std::chrono::milliseconds, std::function<void()>> _tasks;
};

}  // namespace varnel::simulation
