#pragma once

#include <chrono>

#include "programs/varnel-telephonyd/simulation/Random.h"

namespace varnel::simulation {

/// What the HRPD (1xEV-DO) half of a CDMA phone does: it finds the network, opens a session, and from then on
/// rests and transfers data in turn. It lies still while the 1x half needs the radio, with its session open.
class HRPDConnection {
 public:
  /// Both numbered as in the modem's packets.
  enum class State { Inactive, Acquisition, Sync, Idle, Access, Connected };
  enum class Session { Closed, AddressSetup, NegotiationByPhone, NegotiationByNetwork, Open };

  explicit HRPDConnection(Random random) : _random(random) {}

  State state() const { return _state; }
  Session session() const { return _session; }
  bool hasPilot() const { return _state >= State::Sync; }
  bool transmits() const { return _state >= State::Access; }
  bool carriesData() const { return _state == State::Connected && _session == Session::Open; }

  enum class Radio { Free, Taken };
  /// Time passes; true when the state or the session is another one from now on.
  bool update(std::chrono::milliseconds now, Radio radio);

 private:
  State nextState();
  void enter(State state, std::chrono::milliseconds now);
  std::chrono::milliseconds duration();

  Random _random;
  State _state = State::Inactive;
  Session _session = Session::Closed;
  std::chrono::milliseconds _end{0};
};

}  // namespace varnel::simulation
