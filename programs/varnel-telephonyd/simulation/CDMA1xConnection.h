#pragma once

#include <chrono>

#include "programs/varnel-telephonyd/simulation/Random.h"

namespace varnel::simulation {

/// What the 1x half of a CDMA phone does: it finds the network, sleeps and listens to its pages in turn, and
/// after a number of pages there is a call, behind which it finds the network anew.
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

  /// Time passes; true when the state is another one from now on.
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
