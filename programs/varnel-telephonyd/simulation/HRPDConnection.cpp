#include "programs/varnel-telephonyd/simulation/HRPDConnection.h"

namespace varnel::simulation {

bool HRPDConnection::update(std::chrono::milliseconds now, Radio radio) {
  if (radio == Radio::Taken) {
    if (_state == State::Inactive) return false;
    // A session that was not open yet is lost.
    if (_session != Session::Open) _session = Session::Closed;
    enter(State::Inactive, now);
    return true;
  }
  if (_state != State::Inactive && now < _end) return false;
  enter(nextState(), now);
  return true;
}

HRPDConnection::State HRPDConnection::nextState() {
  switch (_state) {
    case State::Inactive:
      return State::Acquisition;
    case State::Acquisition:
      return State::Sync;
    case State::Sync:
      return State::Idle;
    case State::Idle:
      if (_session == Session::Closed) _session = Session::AddressSetup;
      return State::Access;
    case State::Access:
      if (_session == Session::AddressSetup) _session = Session::NegotiationByPhone;
      return State::Connected;
    case State::Connected:
      break;
  }
  if (_session == Session::NegotiationByPhone) {
    _session = Session::NegotiationByNetwork;
    return State::Connected;
  }
  _session = Session::Open;
  return State::Idle;
}

void HRPDConnection::enter(State state, std::chrono::milliseconds now) {
  _state = state;
  _end = now + duration();
}

std::chrono::milliseconds HRPDConnection::duration() {
  const bool isOpen = _session == Session::Open;
  const auto between = [this](std::int64_t shortest_ms, std::int64_t longest_ms) {
    return std::chrono::milliseconds(_random.between(shortest_ms, longest_ms));
  };
  switch (_state) {
    case State::Inactive:
      break;
    case State::Acquisition:
      return between(500, 900);
    case State::Sync:
      return between(300, 600);
    case State::Idle:
      return isOpen ? between(1'000, 4'000) : between(300, 800);
    case State::Access:
      return between(200, 500);
    case State::Connected:
      return isOpen ? between(6'000, 14'000) : between(600, 1'200);
  }
  return std::chrono::milliseconds(0);
}

}  // namespace varnel::simulation
