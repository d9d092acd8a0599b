#include "programs/varnel-telephonyd/simulation/ScheduledModem.h"

#include <algorithm>

#include "base/MessagePrefix.h"

namespace varnel::simulation {

namespace {
constexpr std::uint8_t noSubscription = 0;
constexpr int messagesPerPrefix = 8;
}  // namespace

SimulatedMessage ScheduledModem::next() {
  while (_sent.empty()) runNextTask();
  SimulatedMessage message = std::move(_sent.front());
  _sent.pop_front();
  return message;
}

void ScheduledModem::repeat(Pace pace, std::function<void()> task) {
  _tasks.push_back({pace.first, pace, std::move(task)});
}

void ScheduledModem::send(Bytes packet) {
  if (hasPrefix()) packet.insert(packet.begin(), {prefixMark, _subscription.value_or(noSubscription)});
  sendBare(std::move(packet));
}

bool ScheduledModem::hasPrefix() { return _subscription || _random.oneIn(messagesPerPrefix); }

void ScheduledModem::sendBare(Bytes message) { _sent.push_back({_now, std::move(message)}); }

void ScheduledModem::runNextTask() {
  Task& task = *std::ranges::min_element(_tasks, {}, &Task::due);
  _now = task.due;
  const std::int64_t jitter = task.pace.jitter.count();
  task.due += task.pace.interval + std::chrono::milliseconds(_random.between(-jitter, jitter));
  task.run();
}

}  // namespace varnel::simulation
