#pragma once

#include <chrono>

#include "programs/varnel-telephonyd/simulation/Random.h"

namespace varnel::simulation {

/// How a phone is connected with a network of UMTS, of either mode. Data flows on a dedicated channel; as it
/// becomes silent the phone goes by way of the common channels into deeper and deeper rest.
class UTRANConnection {
 public:
  /// Numbered as in the modem's packets.
  enum class State { Disconnected, Connecting, CellFach, CellDCH, CellPCH, URAPCH };

  explicit UTRANConnection(Random random);

  State state() const { return _state; }
  /// Whether transport channels are set up.
  bool hasChannels() const { return _state == State::CellDCH || _state == State::CellFach; }

  /// The phone is disconnected from now on.
  void end(std::chrono::milliseconds now);

  /// Time passes; true when the state is another one from now on.
  bool update(std::chrono::milliseconds now);

  enum class Area { Same, Another };
  /// The phone has gone to another cell, of the same registration area or of another one: at rest it may have
  /// to tell the network. True when the state is another one from now on.
  bool cellChanged(std::chrono::milliseconds now, Area area);

 private:
  State nextState();
  void enter(State state, std::chrono::milliseconds now);

  Random _random;
  State _state = State::Disconnected;
  State _rest = State::CellPCH;  // where the common channels lead to
  std::chrono::milliseconds _end;
};

}  // namespace varnel::simulation
