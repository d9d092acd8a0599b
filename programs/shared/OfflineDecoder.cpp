#include "programs/shared/OfflineDecoder.h"

#include <algorithm>
#include <limits>

#include "base/ClockStep.h"

namespace varnel {

namespace {

constexpr std::uint64_t tickSeconds = 2;

// Captures may hold any time. Unsigned seconds wrap, so differences and sums are right.
std::uint64_t ticksBetween(Time start, Time end) {
  if (end <= start) return 0;
  const std::uint64_t seconds =
      static_cast<std::uint64_t>(end.seconds) - static_cast<std::uint64_t>(start.seconds);
  return (end.nanoseconds < start.nanoseconds ? seconds - 1 : seconds) / tickSeconds;
}

// The last ticks before the end of time are all at the last second.
Time tickTime(Time start, std::uint64_t tick) {
  constexpr std::int64_t last = std::numeric_limits<std::int64_t>::max();
  const auto first = static_cast<std::uint64_t>(start.seconds);
  const std::uint64_t secondsLeft = static_cast<std::uint64_t>(last) - first;
  return {static_cast<std::int64_t>(first + std::min(tick * tickSeconds, secondsLeft)), start.nanoseconds};
}

}  // namespace

OfflineDecoder::OfflineDecoder(LogGenerator& generator, CaptureClock& clock, RawBytes rawBytes)
    : _generator(generator), _clock(clock) {
  if (rawBytes == RawBytes::NotKept) _generator.keepNoRawBytes();
}

void OfflineDecoder::deliver(Time time, ByteView message) noexcept {
  fireTicks(time);
  _clock.set(_now);
  _generator.updateState_withData(_state, message);
}

// This always finds something to show: the last tick fired before the last message arrived.
Value OfflineDecoder::finish() { return _generator.generateLogUsingState(_state); }

std::optional<Generation> OfflineDecoder::fireTicks(Time now) {
  if (!_start) startAnew(now);
  if (now == _now) return std::nullopt;
  switch (clockStep(_now, now)) {
    case ClockStep::Overtaking:
      return std::nullopt;
    case ClockStep::Back:
    case ClockStep::Ahead: {
      if (_clockSteps.count++ == 0) _clockSteps = {1, _now, now};
      const Generation generation = fireNextTick();
      startAnew(now);
      return generation;
    }
    case ClockStep::None:
      break;
  }
  _now = now;
  const std::uint64_t due = ticksBetween(*_start, now);
  if (due <= _ticksFired) return std::nullopt;
  const Generation generation = fireNextTick();
  _ticksFired = due;
  return generation;
}

Generation OfflineDecoder::fireNextTick() {
  const Time time = tickTime(*_start, _ticksFired + 1);
  _clock.set(time);
  return {time, _generator.generateLogUsingState(_state)};
}

void OfflineDecoder::startAnew(Time now) {
  _start = _now = now;
  _ticksFired = 0;
}

}  // namespace varnel
