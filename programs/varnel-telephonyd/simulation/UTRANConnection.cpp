#include "programs/varnel-telephonyd/simulation/UTRANConnection.h"

namespace varnel::simulation {

namespace {

struct Duration {
  std::int64_t shortest_ms, longest_ms;
};
// By state.
constexpr Duration durations[] = {
    {4'000, 8'000},   // Disconnected
    {600, 1'400},     // Connecting
    {2'000, 5'000},   // CellFach
    {6'000, 12'000},  // CellDCH
    {5'000, 10'000},  // CellPCH
    {6'000, 12'000},  // URAPCH
};

}  // namespace

UTRANConnection::UTRANConnection(Random random) : _random(random) {
  enter(State::Disconnected, std::chrono::milliseconds(0));
}

void UTRANConnection::end(std::chrono::milliseconds now) {
  _rest = State::CellPCH;
  enter(State::Disconnected, now);
}

bool UTRANConnection::update(std::chrono::milliseconds now) {
  if (now < _end) return false;
  enter(nextState(), now);
  return true;
}

bool UTRANConnection::cellChanged(std::chrono::milliseconds now, Area area) {
  const bool mustTell = _state == State::CellPCH || (_state == State::URAPCH && area == Area::Another);
  if (mustTell) enter(State::CellFach, now);
  return mustTell;
}

UTRANConnection::State UTRANConnection::nextState() {
  switch (_state) {
    case State::Disconnected:
      return State::Connecting;
    case State::Connecting:
      _rest = State::CellPCH;
      return State::CellDCH;
    case State::CellDCH:
    case State::CellPCH:
    case State::URAPCH:
      return State::CellFach;
    case State::CellFach:
      break;
  }
  // From one state of rest to a deeper one, then back to work or to the end.
  const State rest = _rest;
  if (rest == State::CellPCH)
    _rest = State::URAPCH;
  else if (rest == State::URAPCH)
    _rest = _random.oneIn(2) ? State::CellDCH : State::Disconnected;
  else
    _rest = State::CellPCH;
  return rest;
}

void UTRANConnection::enter(State state, std::chrono::milliseconds now) {
  const Duration& duration = durations[static_cast<int>(state)];
  _state = state;
  _end = now + std::chrono::milliseconds(_random.between(duration.shortest_ms, duration.longest_ms));
}

}  // namespace varnel::simulation
