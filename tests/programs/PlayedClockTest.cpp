#include "programs/varnel/PlayedClock.h"

#include <gtest/gtest.h>

#include <limits>

#include "LogGenerator/Radios/SeenCells.h"
#include "tests/support/FakeClock.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;

constexpr std::int64_t start = 1'700'000'000;

class PlayedClockTest : public testing::Test {
 protected:
  PlayedClockTest() { host.set({2'000'000'000, 0}); }

  // What the clock shows, from the start of the capture on.
  std::chrono::milliseconds shown() const {
    return std::chrono::duration_cast<std::chrono::milliseconds>(durationBetween({start, 0}, clock.now()));
  }
  static Time at(int second) { return {start + second, 0}; }

  FakeClock host;
  std::chrono::nanoseconds uptime = 1000s;
  PlayedClock clock{host, [this] { return uptime; }};
};

TEST_F(PlayedClockTest, ShowsTheHostsTimeWithoutACapture) {
  EXPECT_EQ(clock.now(), (Time{2'000'000'000, 0}));
  EXPECT_FALSE(clock.followsCapture());
  clock.stand();
  EXPECT_EQ(clock.now(), (Time{2'000'000'000, 0}));
}

TEST_F(PlayedClockTest, GoesOnFromTheTimeThatWasTold) {
  clock.follow(at(10), 1);
  EXPECT_EQ(shown(), 10s);
  uptime += 250ms;
  EXPECT_EQ(shown(), 10'250ms);
  EXPECT_TRUE(clock.followsCapture());
}

TEST_F(PlayedClockTest, GoesAsFastAsTheCaptureIsPlayed) {
  clock.follow(at(0), 10);
  uptime += 500ms;
  EXPECT_EQ(shown(), 5s);
  clock.follow(at(5), 0.5);
  uptime += 500ms;
  EXPECT_EQ(shown(), 5'250ms);
}

TEST_F(PlayedClockTest, StandsWhileTheCaptureIsPaused) {
  clock.follow(at(10), 1);
  uptime += 400ms;
  clock.follow(at(10), 0);
  uptime += 90s;
  EXPECT_EQ(shown(), 10'400ms);
  clock.follow(at(10), 1);
  EXPECT_EQ(shown(), 10'400ms);
  uptime += 100ms;
  EXPECT_EQ(shown(), 10'500ms);
}

TEST_F(PlayedClockTest, WaitsForTheCaptureInsteadOfSteppingBack) {
  clock.follow(at(10), 1);
  uptime += 3s;
  clock.follow(at(12), 1);
  EXPECT_EQ(shown(), 13s);
  uptime += 1s;
  EXPECT_EQ(shown(), 13s);
  uptime += 500ms;
  EXPECT_EQ(shown(), 13'500ms);
}

TEST_F(PlayedClockTest, StepsAheadWithTheCapture) {
  clock.follow(at(10), 1);
  uptime += 500ms;
  clock.follow(at(70), 1);
  EXPECT_EQ(shown(), 70s);
}

TEST_F(PlayedClockTest, StepsBackWithAClockThatWasSet) {
  clock.follow(at(100), 1);
  clock.follow(at(60), 1);
  EXPECT_EQ(shown(), 60s);
}

TEST_F(PlayedClockTest, DoesNotGoFarAheadOfTheLastMessage) {
  clock.follow(at(10), 1);
  for (int second = 0; second < 60; ++second) {
    uptime += 1s;
    clock.follow(at(10), 1);
  }
  // The longest pause, and what a message may be late.
  EXPECT_EQ(shown(), 16s);
  uptime += std::chrono::hours(24 * 400);
  EXPECT_EQ(shown(), 16s);
}

TEST_F(PlayedClockTest, StandsAtAPlaceUntilTheCaptureIsThere) {
  clock.follow(at(10), 1);
  clock.standAt(at(300));
  uptime += 20s;
  EXPECT_EQ(shown(), 300s);
  clock.follow(at(299), 1);
  EXPECT_EQ(shown(), 300s);
  uptime += 3s;
  EXPECT_EQ(shown(), 302s);
}

TEST_F(PlayedClockTest, StandsWhenTheCaptureIsNoLongerPlayed) {
  clock.follow(at(10), 1);
  uptime += 1s;
  clock.stand();
  uptime += 9s;
  EXPECT_EQ(shown(), 11s);
  clock.followHost();
  EXPECT_EQ(clock.now(), (Time{2'000'000'000, 0}));
}

TEST_F(PlayedClockTest, NeighborsAgeAsFastAsTheCaptureIsPlayed) {
  Section section;
  section.bind(Value::ofDictionary());
  SeenCells cells([](const Dictionary&) { return std::optional<CellPlace>(); });
  const auto count = [&] {
    cells.begin(section, clock.now());
    cells.show(section);
    const Array* const list = section.container().dictionary()->get(SeenCells::listEntry).array();
    return list ? list->size() : 0;
  };
  clock.follow(at(0), 8);
  cells.begin(section, clock.now());
  cells.see({1, 16})->set("Physical Cell ID", "16");
  for (const int second : {8, 16, 24}) {
    uptime += 1s;
    clock.follow(at(second), 8);
    EXPECT_EQ(count(), 1u) << second;
  }
  uptime += 625ms;
  EXPECT_EQ(count(), 1u) << "29 s";
  clock.follow(at(29), 0);
  uptime += std::chrono::hours(1);
  EXPECT_EQ(count(), 1u) << "paused";
  clock.follow(at(29), 8);
  uptime += 125ms;
  EXPECT_EQ(count(), 0u) << "30 s";
}

TEST_F(PlayedClockTest, NeighborsStayWhenAJumpGoesBack) {
  Section section;
  section.bind(Value::ofDictionary());
  SeenCells cells([](const Dictionary&) { return std::optional<CellPlace>(); });
  clock.standAt(at(300));
  cells.begin(section, clock.now());
  cells.see({1, 16});
  cells.show(section);
  const Array& list = *section.container().dictionary()->get(SeenCells::listEntry).array();
  clock.standAt(at(20));
  cells.begin(section, clock.now());
  EXPECT_EQ(list.size(), 1u);
  clock.standAt(at(50));
  cells.begin(section, clock.now());
  cells.show(section);
  EXPECT_EQ(section.container().dictionary()->get(SeenCells::listEntry).array()->size(), 0u);
}

TEST_F(PlayedClockTest, HasTheHostsTimeZone) {
  host.setZone({7200, false});
  clock.follow(at(10), 1);
  EXPECT_EQ(clock.zoneAt(clock.now()).offsetSeconds, 7200);
}

TEST_F(PlayedClockTest, KeepsNanosecondsInRange) {
  EXPECT_EQ(laterBy(600ms, {10, 500'000'000}), (Time{11, 100'000'000}));
  EXPECT_EQ(laterBy(-600ms, {10, 500'000'000}), (Time{9, 900'000'000}));
  constexpr Time last{std::numeric_limits<std::int64_t>::max(), 500'000'000};
  EXPECT_EQ(laterBy(600ms, last), last);
  EXPECT_EQ(laterBy(200ms, last), (Time{last.seconds, 700'000'000}));
}

}  // namespace
}  // namespace varnel
