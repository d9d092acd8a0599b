#pragma once

#include <chrono>
#include <deque>
#include <functional>
#include <optional>
#include <vector>

#include "programs/varnel-telephonyd/simulation/Random.h"
#include "programs/varnel-telephonyd/simulation/SimulatedModem.h"

namespace varnel::simulation {

/// A modem whose tasks repeat, each at its own pace.
class ScheduledModem : public SimulatedModem {
 public:
  SimulatedMessage next() final;

 protected:
  struct Pace {
    std::chrono::milliseconds first;      ///< when it happens first
    std::chrono::milliseconds interval;   ///< from one run to the next
    std::chrono::milliseconds jitter{0};  ///< how much longer or shorter each interval may be
  };

  explicit ScheduledModem(Random random) : _random(random) {}
  /// A modem whose packets all name this subscription.
  ScheduledModem(Random random, std::uint8_t subscription) : _random(random), _subscription(subscription) {}

  /// Repeats a task. Tasks that are due at the same moment run in the order of these calls.
  void repeat(Pace pace, std::function<void()> task);
  /// Sends a packet now. A prefix of two bytes names the subscription. As on a real link, some packets of a
  /// modem without subscriptions have a prefix too.
  void send(Bytes packet);
  /// Sends a message that is no packet, unchanged.
  void sendBare(Bytes message);
  /// The time since the start of the stream.
  std::chrono::milliseconds now() const { return _now; }

 private:
  struct Task {
    std::chrono::milliseconds due;
    Pace pace;
    std::function<void()> run;
  };

  bool hasPrefix();
  void runNextTask();

  Random _random;
  std::optional<std::uint8_t> _subscription;
  std::chrono::milliseconds _now{0};
  std::vector<Task> _tasks;
  std::deque<SimulatedMessage> _sent;
};

}  // namespace varnel::simulation
