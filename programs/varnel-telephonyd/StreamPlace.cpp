#include "programs/varnel-telephonyd/StreamPlace.h"

#include <algorithm>

#include "base/ClockStep.h"
#include "programs/varnel-telephonyd/ReplayPace.h"

namespace varnel {

bool hasReached(const StreamPosition& position, const StreamPlace& place) {
  if (const auto* const sinceStart = std::get_if<std::chrono::milliseconds>(&place))
    return position.sinceStart >= *sinceStart;
  return position.time && *position.time >= std::get<Time>(place);
}

StreamPosition PlayingTime::of(Time time) {
  const ClockStep step = _last ? clockStep(*_last, time) : ClockStep::Back;
  if (step == ClockStep::None || step == ClockStep::Ahead)
    _passed += std::min<std::chrono::nanoseconds>(durationBetween(*_last, time), ReplayPace::longestWait);
  if (step != ClockStep::Overtaking) _last = time;
  return {std::chrono::floor<std::chrono::milliseconds>(_passed), time};
}

}  // namespace varnel
