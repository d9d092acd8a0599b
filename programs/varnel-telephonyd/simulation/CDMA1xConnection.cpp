#include "programs/varnel-telephonyd/simulation/CDMA1xConnection.h"

namespace varnel::simulation {

namespace {

// The first call comes early, so that a new stream soon has some of everything.
constexpr std::int64_t firstPages = 4;
constexpr std::int64_t fewestPages = 4, mostPages = 8;

struct Duration {
  std::int64_t shortest_ms, longest_ms;
};

Duration durationOf(CDMA1xConnection::State state) {
  using State = CDMA1xConnection::State;
  switch (state) {
    case State::Powerup:
      return {300, 600};
    case State::Initial:
      return {200, 400};
    case State::Acquisition:
      return {400, 900};
    case State::Sync:
      return {300, 700};
    case State::Slew:
      return {100, 300};
    case State::Paging:
      return {600, 1'400};
    case State::SlottedSleep:
      return {3'000, 4'600};
    case State::Traffic:
      return {10'000, 16'000};
  }
  return {};
}

}  // namespace

CDMA1xConnection::CDMA1xConnection(Random random) : _random(random), _pagesLeft(firstPages) {
  enter(State::Powerup, std::chrono::milliseconds(0));
}

bool CDMA1xConnection::update(std::chrono::milliseconds now) {
  if (now < _end) return false;
  enter(nextState(), now);
  return true;
}

CDMA1xConnection::State CDMA1xConnection::nextState() {
  switch (_state) {
    case State::Powerup:
      return State::Initial;
    case State::Initial:
    case State::Traffic:
      return State::Acquisition;
    case State::Acquisition:
      return State::Sync;
    case State::Sync:
      return State::Slew;
    case State::Slew:
    case State::SlottedSleep:
      return State::Paging;
    case State::Paging:
      break;
  }
  if (_pagesLeft-- > 0) return State::SlottedSleep;
  _pagesLeft = _random.between(fewestPages, mostPages);
  return State::Traffic;
}

void CDMA1xConnection::enter(State state, std::chrono::milliseconds now) {
  const Duration duration = durationOf(state);
  _state = state;
  _end = now + std::chrono::milliseconds(_random.between(duration.shortest_ms, duration.longest_ms));
}

}  // namespace varnel::simulation
