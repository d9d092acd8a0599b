#include "programs/varnel-decode/ElapsedTime.h"

#include "base/ClockStep.h"

namespace varnel {

void ElapsedTime::record(Time time) {
  if (!_origin) _origin = _last = time;
  switch (clockStep(_last, time)) {
    case ClockStep::None:
      _last = time;
      break;
    case ClockStep::Overtaking:
      break;
    case ClockStep::Back:
    case ClockStep::Ahead:
      _beforeOrigin = at(_last);
      _origin = _last = time;
      break;
  }
}

std::chrono::nanoseconds ElapsedTime::at(Time time) const {
  if (!_origin) return std::chrono::nanoseconds(0);
  return _beforeOrigin + durationBetween(*_origin, time);
}

}  // namespace varnel
