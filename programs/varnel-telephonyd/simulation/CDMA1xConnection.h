#pragma once

#include <chrono>

#include "programs/varnel-telephonyd/simulation/Random.h"

namespace varnel::simulation {

/// What the 1x half of a CDMA phone does. It finds the network, then sleeps and listens to its pages in turn.
/// After a number of pages there is a call, and then it finds the network again.
class CDMA1xConnection {
 public:
  /// Numbered as in the modem's packets.
  enum class State {
    Initial = 2,
    Acquisition = 3,
    Sync = 4,
    Slew = 5,
    Paging = 6,
    SlottedSleep = 7,
    Traffic = 8,
    Powerup = 11,
  };

  explicit CDMA1xConnection(Random random);

  State state() const { return _state; }
  /// Whether the phone has a network and could be called.
  bool isIdle() const { return _state == State::Paging || _state == State::SlottedSleep; }
  bool hasPilot() const { return _state >= State::Sync && _state <= State::Traffic; }

  /// Lets time pass. True when the state has changed.
  bool update(std::chrono::milliseconds now);

 private:
  State nextState();
  void enter(State state, std::chrono::milliseconds now);

  Random _random;
  State _state = State::Powerup;
  std::int64_t _pagesLeft;  // until the next call
  std::chrono::milliseconds _end;
};

}  // namespace varnel::simulation
