#include "programs/varnel/JumpStages.h"

#include <chrono>

#include "programs/varnel/PlayedClock.h"

namespace varnel {

namespace {

using namespace std::chrono_literals;

// From the end of a stage to the place.
constexpr std::chrono::seconds distances[] = {1s,   2s,   4s,    8s,    15s, 30s, 45s, 60s, 90s, 2min,
                                              4min, 8min, 15min, 30min, 1h,  2h,  4h,  8h,  16h};

// The last message of a stage may be as far from its end as the longest pause.
constexpr auto mostMistaken = 2 * PlayedClock::longestPause;

}  // namespace

void JumpStages::begin(int from) {
  _stages = {_place};
  for (const std::chrono::milliseconds distance : distances) {
    if (distance.count() >= _place - from) return;
    _stages.push_back(_place - static_cast<int>(distance.count()));
  }
}

Time JumpStages::expect(int from, Time time) {
  const auto known = _times.find(next());
  _expected = known != _times.end() ? known->second : laterBy(std::chrono::milliseconds(next() - from), time);
  return *_expected;
}

void JumpStages::reach(std::optional<Time> told) {
  if (told) {
    const auto late = _expected ? durationBetween(*_expected, *told) : 0ns;
    if (late > mostMistaken || late < -mostMistaken) _isMistaken = true;
    _times.insert_or_assign(next(), *told);
  }
  _stages.pop_back();
  _expected.reset();
}

std::optional<JumpStages> JumpStages::repetition() const {
  if (!_isMistaken || _isRepeated) return std::nullopt;
  JumpStages again(_place);
  again._times = _times;
  again._isRepeated = true;
  return again;
}

}  // namespace varnel
