#include "programs/varnel-telephonyd/simulation/GSMConnection.h"

namespace varnel::simulation {

bool GSMConnection::update(std::chrono::milliseconds now) {
  if (_state == State::Inactive || now < _end) return false;
  enter(nextState(), now);
  return true;
}

bool GSMConnection::cellChanged(std::chrono::milliseconds now) {
  if (_state != State::Idle) return false;
  enter(State::CellReselection, now);
  return true;
}

GSMConnection::State GSMConnection::nextState() {
  switch (_state) {
    case State::FromUMTS:
    case State::CellReselection:
    case State::Release:
      return State::Idle;
    case State::Idle:
      _traffic = _traffic == Traffic::Data ? Traffic::Voice : Traffic::Data;
      return State::Pending;
    case State::Pending:
      return State::Transfer;
    case State::Transfer:
      return State::Release;
    case State::ToUMTS:
    case State::Inactive:
      break;
  }
  return State::Inactive;
}

void GSMConnection::enter(State state, std::chrono::milliseconds now) {
  std::int64_t shortest_ms = 500, longest_ms = 900;
  if (state == State::Idle) shortest_ms = 3'000, longest_ms = 5'000;
  if (state == State::Transfer) shortest_ms = 5'000, longest_ms = 9'000;
  _state = state;
  _end = now + std::chrono::milliseconds(_random.between(shortest_ms, longest_ms));
}

}  // namespace varnel::simulation
