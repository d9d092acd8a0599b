#pragma once

#include <chrono>

#include "programs/varnel-telephonyd/simulation/Random.h"

namespace varnel::simulation {

/// The connection of a phone with a GSM network. The phone arrives from UMTS, idles, makes calls and
/// transfers data in turn, and leaves again.
class GSMConnection {
 public:
  /// Numbered as in the modem's packets.
  enum class State {
    Inactive = 0,
    Idle = 5,
    CellReselection = 6,
    Pending = 7,
    Transfer = 9,
    Release = 11,
    FromUMTS = 14,
    ToUMTS = 18
  };
  enum class Traffic { Voice, Data };

  /// The connection is inactive until the phone arrives.
  explicit GSMConnection(Random random) : _random(random) {}

  State state() const { return _state; }
  /// The current traffic, or else the last or the next one.
  Traffic traffic() const { return _traffic; }
  bool isSpeaking() const { return _state == State::Transfer && _traffic == Traffic::Voice; }

  /// Lets time pass. True when the state has changed.
  bool update(std::chrono::milliseconds now);

  /// The phone changes from UMTS to GSM.
  void arrive(std::chrono::milliseconds now) { enter(State::FromUMTS, now); }
  /// The phone changes to UMTS. It is there when the state is inactive.
  void leave(std::chrono::milliseconds now) { enter(State::ToUMTS, now); }
  /// The phone has another GSM cell. True when the state has changed: a connected phone is handed over by the
  /// network.
  bool cellChanged(std::chrono::milliseconds now);

 private:
  State nextState();
  void enter(State state, std::chrono::milliseconds now);

  Random _random;
  State _state = State::Inactive;
  Traffic _traffic = Traffic::Data;
  std::chrono::milliseconds _end{0};
};

}  // namespace varnel::simulation
