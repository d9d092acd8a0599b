#include "host/SystemClock.h"

#include <ctime>

namespace varnel {

Time SystemClock::now() const {
  timespec moment{};
  ::clock_gettime(CLOCK_REALTIME, &moment);
  return {moment.tv_sec, static_cast<std::int32_t>(moment.tv_nsec)};
}

TimeZone SystemClock::zoneAt(Time time) const {
  ::tzset();  // localtime_r alone may miss a change of the zone
  tm local{};
  if (!::localtime_r(&time.seconds, &local)) return {};
  return {static_cast<std::int32_t>(local.tm_gmtoff), local.tm_isdst > 0};
}

std::chrono::nanoseconds timeSinceBoot() {
  timespec moment{};
  ::clock_gettime(CLOCK_BOOTTIME, &moment);
  return std::chrono::seconds(moment.tv_sec) + std::chrono::nanoseconds(moment.tv_nsec);
}

}  // namespace varnel
