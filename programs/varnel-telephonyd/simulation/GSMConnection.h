#pragma once

#include <chrono>

#include "programs/varnel-telephonyd/simulation/Random.h"

namespace varnel::simulation {

/// How a phone is connected with a GSM network: it arrives from UMTS, idles, speaks and transfers data in
/// turn, and leaves again.
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

  /// Inactive until the phone arrives.
  explicit GSMConnection(Random random) : _random(random) {}

  State state() const { return _state; }
  /// What is transferred, was or will be.
  Traffic traffic() const { return _traffic; }
  bool isSpeaking() const { return _state == State::Transfer && _traffic == Traffic::Voice; }

  /// Time passes; true when the state is another one from now on.
  bool update(std::chrono::milliseconds now);

  /// The phone changes over from UMTS.
  void arrive(std::chrono::milliseconds now) { enter(State::FromUMTS, now); }
  /// The phone changes over to UMTS; it is there when the state is inactive.
  void leave(std::chrono::milliseconds now) { enter(State::ToUMTS, now); }
  /// The phone has gone to another cell of GSM. True when the state is another one from now on: while it is
  /// connected, the network hands it over.
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
