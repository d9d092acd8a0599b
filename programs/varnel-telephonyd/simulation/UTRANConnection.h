#pragma once

#include <chrono>

#include "programs/varnel-telephonyd/simulation/Random.h"

namespace varnel::simulation {

/// The connection of a phone with a UMTS network of either mode. Data flows on a dedicated channel. When
/// there is less data, the phone goes over the common channels to deeper and deeper states of rest.
class UTRANConnection {
 public:
  /// Numbered as in the modem's packets.
  enum class State { Disconnected, Connecting, CellFach, CellDCH, CellPCH, URAPCH };

  explicit UTRANConnection(Random random);

  State state() const { return _state; }
  /// Whether transport channels are set up.
  bool hasChannels() const { return _state == State::CellDCH || _state == State::CellFach; }

  /// Disconnects the phone.
  void end(std::chrono::milliseconds now);

  /// Lets time pass. True when the state has changed.
  bool update(std::chrono::milliseconds now);

  enum class Area { Same, Another };
  /// The phone has another cell, of the same registration area or of another one. At rest it may have to tell
  /// the network. True when the state has changed.
  bool cellChanged(std::chrono::milliseconds now, Area area);

 private:
  State nextState();
  void enter(State state, std::chrono::milliseconds now);

  Random _random;
  State _state = State::Disconnected;
  State _rest = State::CellPCH;  // the next state after the common channels
  std::chrono::milliseconds _end;
};

}  // namespace varnel::simulation
