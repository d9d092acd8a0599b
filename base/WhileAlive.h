#pragma once

#include <memory>
#include <utility>

namespace varnel {

/// Makes tasks that others may keep for longer than their owner lives: once the owner is gone they do
/// nothing. It is the last member of the owner, so that no task runs while the owner is being destroyed.
/// Owner and tasks stay on one thread.
class WhileAlive {
 public:
  WhileAlive() = default;
  WhileAlive(const WhileAlive&) = delete;
  WhileAlive& operator=(const WhileAlive&) = delete;

  /// The task may destroy the owner.
  template <typename Task>
  auto operator()(Task task) const {
    return [life = std::weak_ptr(_life), task = std::move(task)] {
      if (!life.expired()) task();
    };
  }

 private:
  struct Life {};
  std::shared_ptr<Life> _life = std::make_shared<Life>();
};

}  // namespace varnel
