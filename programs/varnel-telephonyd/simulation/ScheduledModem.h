#pragma once

#include <chrono>
#include <deque>
#include <functional>
#include <vector>

#include "programs/varnel-telephonyd/simulation/Random.h"
#include "programs/varnel-telephonyd/simulation/SimulatedModem.h"

namespace varnel::simulation {

/// A modem whose doings repeat, each at a pace of its own.
class ScheduledModem : public SimulatedModem {
 public:
  SimulatedMessage next() final;

 protected:
  struct Pace {
    std::chrono::milliseconds first;      ///< when it happens for the first time
    std::chrono::milliseconds interval;   ///< from one time to the next
    std::chrono::milliseconds jitter{0};  ///< by how much each interval may be longer or shorter
  };

  explicit ScheduledModem(Random random) : _random(random) {}

  /// What falls on the same moment happens in the order in which it was told here.
  void repeat(Pace pace, std::function<void()> task);
  /// Sends a packet now. As on a real link, some come behind a prefix of two bytes.
  void send(Bytes packet);
  /// Sends a message that is no packet now, as it is.
  void sendBare(Bytes message);
  /// The time since the start of the stream.
  std::chrono::milliseconds now() const { return _now; }

 private:
  struct Task {
    std::chrono::milliseconds due;
    Pace pace;
    std::function<void()> run;
  };

  void runNextTask();

  Random _random;
  std::chrono::milliseconds _now{0};
  std::vector<Task> _tasks;
  std::deque<SimulatedMessage> _sent;
};

}  // namespace varnel::simulation
