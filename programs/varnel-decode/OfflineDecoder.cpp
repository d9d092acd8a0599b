#include "programs/varnel-decode/OfflineDecoder.h"

namespace varnel {

namespace {

constexpr std::uint64_t tickSeconds = 2;

// Captures may hold any time there is. Unsigned seconds wrap, so differences and sums come out right.
std::uint64_t ticksBetween(Time start, Time end) {
  if (end <= start) return 0;
  const std::uint64_t seconds =
      static_cast<std::uint64_t>(end.seconds) - static_cast<std::uint64_t>(start.seconds);
  return (end.nanoseconds < start.nanoseconds ? seconds - 1 : seconds) / tickSeconds;
}

Time tickTime(Time start, std::uint64_t tick) {
  const std::uint64_t seconds = static_cast<std::uint64_t>(start.seconds) + tick * tickSeconds;
  return {static_cast<std::int64_t>(seconds), start.nanoseconds};
}

}  // namespace

void OfflineDecoder::deliver(Time time, ByteView message) noexcept {
  fireTicks(time);
  _clock.set(time);
  _generator.updateState_withData(_state, message);
}

// There is always something to show: the last tick fired before the last message arrived.
Value OfflineDecoder::finish() { return _generator.generateLogUsingState(_state); }

std::optional<Generation> OfflineDecoder::fireTicks(Time now) {
  if (!_start) _start = now;
  const std::uint64_t due = ticksBetween(*_start, now);
  if (due <= _ticksFired) return std::nullopt;
  const Time time = tickTime(*_start, _ticksFired + 1);
  _clock.set(time);
  _ticksFired = due;
  return Generation{time, _generator.generateLogUsingState(_state)};
}

}  // namespace varnel
