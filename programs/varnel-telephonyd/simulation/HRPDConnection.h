#pragma once

#include <chrono>

#include "programs/varnel-telephonyd/simulation/Random.h"

namespace varnel::simulation {

/// What the HRPD (1xEV-DO) half of a CDMA phone does. It finds the network, opens a session, and from then on
/// idles and transfers data in turn. While the 1x half needs the radio, it stops but keeps its session.
class HRPDConnection {
 public:
  /// State and session are numbered as in the modem's packets.
  enum class State { Inactive, Acquisition, Sync, Idle, Access, Connected };
  enum class Session { Closed, AddressSetup, NegotiationByPhone, NegotiationByNetwork, Open };

  explicit HRPDConnection(Random random) : _random(random) {}

  State state() const { return _state; }
  Session session() const { return _session; }
  bool hasPilot() const { return _state >= State::Sync; }
  bool transmits() const { return _state >= State::Access; }
  bool carriesData() const { return _state == State::Connected && _session == Session::Open; }

  enum class Radio { Free, Taken };
  /// Lets time pass. True when the state or the session has changed.
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
