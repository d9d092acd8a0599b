#include "programs/varnel-telephonyd/simulation/PhoneActivity.h"

#include <utility>

namespace varnel::simulation {

namespace {

struct Duration {
  std::int64_t shortest_ms, longest_ms;
};
// By kind.
constexpr Duration durations[] = {
    {4'000, 9'000},    // Idle
    {300, 700},        // LocationAccess
    {1'500, 3'000},    // LocationUpdate
    {300, 700},        // CallAccess
    {2'500, 5'000},    // CallSetup
    {10'000, 20'000},  // Call
    {400, 900},        // CallRelease
    {200, 500},        // PacketAccess
    {5'000, 12'000},   // PacketTransfer
};

}  // namespace

PhoneActivity::PhoneActivity(Random random) : _random(random), _end(_random.between(800, 1'600)) {}

bool PhoneActivity::isDedicated() const {
  return _kind == Kind::LocationUpdate || _kind == Kind::CallSetup || _kind == Kind::Call ||
         _kind == Kind::CallRelease;
}

bool PhoneActivity::update(std::chrono::milliseconds now) {
  if (now - _locatedAt >= locationPeriod) _isLocated = false;
  if (now < _end) return false;
  if (_kind == Kind::LocationUpdate) {
    _isLocated = true;
    _locatedAt = now;
  }
  enter(nextKind(), now);
  return true;
}

PhoneActivity::Kind PhoneActivity::nextKind() {
  switch (_kind) {
    case Kind::Idle:
      break;
    case Kind::LocationAccess:
      return Kind::LocationUpdate;
    case Kind::CallAccess:
      return Kind::CallSetup;
    case Kind::CallSetup:
      return Kind::Call;
    case Kind::Call:
      return Kind::CallRelease;
    case Kind::PacketAccess:
      return Kind::PacketTransfer;
    case Kind::LocationUpdate:
    case Kind::CallRelease:
    case Kind::PacketTransfer:
      return Kind::Idle;
  }
  if (!_isLocated) return Kind::LocationAccess;
  const Kind other = _nextWish == Kind::PacketAccess ? Kind::CallAccess : Kind::PacketAccess;
  return std::exchange(_nextWish, other);
}

void PhoneActivity::enter(Kind kind, std::chrono::milliseconds now) {
  const Duration& duration = durations[static_cast<int>(kind)];
  _kind = kind;
  _end = now + std::chrono::milliseconds(_random.between(duration.shortest_ms, duration.longest_ms));
}

}  // namespace varnel::simulation
