#pragma once

#include <memory>
#include <utility>

namespace varnel {

/// Makes tasks that can be kept longer than their owner lives. A task does nothing once the owner is gone.
/// This object must be the last member of the owner, so that no task runs while the owner's other members are
/// being destroyed. The body of the owner's destructor runs before that.
/// Owner and tasks must stay on one thread.
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
