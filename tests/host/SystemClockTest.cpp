#include "host/SystemClock.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <ctime>
#include <optional>
#include <string>

namespace varnel {
namespace {

// The time zone of the process, as long as the object lives.
class Zone {
 public:
  explicit Zone(const char* name) {
    if (const char* const former = std::getenv("TZ")) _former = former;
    ::setenv("TZ", name, 1);
  }
  Zone(const Zone&) = delete;
  Zone& operator=(const Zone&) = delete;
  ~Zone() { _former ? ::setenv("TZ", _former->c_str(), 1) : ::unsetenv("TZ"); }

 private:
  std::optional<std::string> _former;
};

constexpr const char* centralEurope = "CET-1CEST,M3.5.0,M10.5.0/3";
constexpr Time january{1704067200, 0};  // 2024-01-01 00:00:00 UTC
constexpr Time july{1719792000, 0};     // 2024-07-01 00:00:00 UTC

TEST(SystemClock, TellsTheTimeWithNanoseconds) {
  const SystemClock clock;
  const std::int64_t before = std::time(nullptr);
  const Time now = clock.now();
  EXPECT_GE(now.seconds, before);
  EXPECT_LE(now.seconds, before + 60);
  EXPECT_GE(now.nanoseconds, 0);
  EXPECT_LE(now.nanoseconds, 999'999'999);
  EXPECT_LE(now, clock.now());
}

TEST(SystemClock, KnowsDaylightTimeOfTheMomentThatIsAskedFor) {
  const Zone zone(centralEurope);
  const SystemClock clock;
  EXPECT_EQ(clock.zoneAt(january).offsetSeconds, 3600);
  EXPECT_FALSE(clock.zoneAt(january).daylight);
  EXPECT_EQ(clock.zoneAt(july).offsetSeconds, 7200);
  EXPECT_TRUE(clock.zoneAt(july).daylight);
}

TEST(SystemClock, ZonesMayLieWestAndBesideFullHours) {
  const SystemClock clock;
  const Zone zone("XXX4:30");
  EXPECT_EQ(clock.zoneAt(january).offsetSeconds, -16200);
}

TEST(SystemClock, AMomentThatNoCalendarHoldsIsInUtc) {
  const Zone zone(centralEurope);
  EXPECT_EQ(SystemClock().zoneAt({INT64_MAX, 0}).offsetSeconds, 0);
}

}  // namespace
}  // namespace varnel
