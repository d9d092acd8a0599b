#include "programs/varnel/PlayedClock.h"

#include <algorithm>

namespace varnel {

namespace {

using namespace std::chrono_literals;

// The server is asked twice a second how far it is.
constexpr auto timeBetweenReplies = 1s;

// The duration times the factor, but at most this much.
std::chrono::nanoseconds times(std::chrono::nanoseconds duration, double factor,
                               std::chrono::nanoseconds most) {
  const double product = static_cast<double>(duration.count()) * factor;
  if (product >= static_cast<double>(most.count())) return most;
  return std::chrono::nanoseconds(static_cast<std::chrono::nanoseconds::rep>(product));
}

// How far the capture can be behind the last time that was told.
std::chrono::nanoseconds lead(double speed) {
  return PlayedClock::longestPause + times(timeBetweenReplies, speed, std::chrono::hours(24));
}

}  // namespace

Time laterBy(std::chrono::nanoseconds duration, Time time) {
  const auto seconds = std::chrono::floor<std::chrono::seconds>(duration);
  const std::int64_t nanoseconds = time.nanoseconds + (duration - seconds).count();
  constexpr std::int64_t nanosecondsPerSecond = 1'000'000'000;
  const std::int64_t more = seconds.count() + nanoseconds / nanosecondsPerSecond;
  std::int64_t sum = 0;
  // A capture can say any time.
  if (__builtin_add_overflow(time.seconds, more, &sum)) return time;
  return {sum, static_cast<std::int32_t>(nanoseconds % nanosecondsPerSecond)};
}

void PlayedClock::follow(Time told, double speed) {
  const auto moment = _uptime();
  Played played{
      .told = told, .from = told, .begin = moment, .speed = speed, .last = laterBy(lead(speed), told)};
  if (_played) {
    const Time shown = now();
    const auto ahead = durationBetween(told, shown);
    if (_played->told == told) {
      // No other message has come: the capture has a pause.
      played.from = shown;
      played.begin = std::max(moment, _played->begin);
    } else if (ahead > std::chrono::nanoseconds::zero() &&
               ahead <= std::max(lead(speed), lead(_played->speed))) {
      // Instead of stepping back, it waits for the capture.
      played.from = shown;
      if (speed > 0) played.begin += times(ahead, 1 / speed, std::chrono::hours(24));
    }
    played.last = std::max(played.last, played.from);
  }
  _played = played;
}

void PlayedClock::standAt(Time time) {
  _played = Played{.told = std::nullopt, .from = time, .begin = _uptime(), .speed = 0, .last = time};
}

void PlayedClock::stand() {
  if (_played) standAt(now());
}

Time PlayedClock::now() const {
  if (!_played) return _host.now();
  const auto passed = std::max(_uptime() - _played->begin, std::chrono::nanoseconds::zero());
  const auto most = durationBetween(_played->from, _played->last);
  return laterBy(times(passed, _played->speed, most), _played->from);
}

}  // namespace varnel
