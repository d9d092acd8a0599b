#include "programs/varnel/trends/TrendStretch.h"

#include <gtest/gtest.h>

namespace varnel {
namespace {

using namespace std::chrono_literals;
using Stretch = TrendStretch::Stretch;
using Kind = TrendStretch::Kind;

// Ten to seventy minutes of an axis.
constexpr Stretch whole{10min, 70min};

std::string text(const Stretch& stretch) {
  const auto seconds = [](auto duration) {
    return std::to_string(std::chrono::duration_cast<std::chrono::seconds>(duration).count());
  };
  return seconds(stretch.begin) + " to " + seconds(stretch.end);
}

TEST(TrendStretch, TheLastMinutesGoOnWithTheHistory) {
  TrendStretch stretch;
  stretch.showLast(10min);
  EXPECT_EQ(text(stretch.of(whole)), "3600 to 4200");
  EXPECT_EQ(text(stretch.of({10min, 71min})), "3660 to 4260");
}

TEST(TrendStretch, TheLastMinutesOfAShorterHistoryKeepTheirLength) {
  TrendStretch stretch;
  stretch.showLast(2min);
  EXPECT_EQ(text(stretch.of({0s, 30s})), "-90 to 30");
}

TEST(TrendStretch, TheWholeHistoryIsAtLeastAMinute) {
  TrendStretch stretch;
  stretch.showWhole();
  EXPECT_EQ(text(stretch.of(whole)), "600 to 4200");
  EXPECT_EQ(text(stretch.of({0s, 30s})), "-30 to 30");
}

TEST(TrendStretch, ZoomingKeepsThePointUnderThePointer) {
  TrendStretch stretch;
  stretch.show({20min, 40min});
  stretch.zoom(0.5, 0.25, whole);
  EXPECT_EQ(text(stretch.of(whole)), "1350 to 1950");
  stretch.zoom(2, 0.25, whole);
  EXPECT_EQ(text(stretch.of(whole)), "1200 to 2400");
}

TEST(TrendStretch, KeysZoomAtTheEndThatGoesOn) {
  TrendStretch stretch;
  stretch.showLast(10min);
  stretch.zoom(0.5, whole);
  EXPECT_EQ(stretch.kind(), Kind::Last);
  EXPECT_EQ(text(stretch.of(whole)), "3900 to 4200");
}

TEST(TrendStretch, KeysZoomInTheMiddleOfWhatStandsStill) {
  TrendStretch stretch;
  stretch.show({20min, 40min});
  stretch.zoom(0.5, whole);
  EXPECT_EQ(text(stretch.of(whole)), "1500 to 2100");
}

TEST(TrendStretch, ZoomsToTenSecondsAtLeast) {
  TrendStretch stretch;
  stretch.show({20min, 20min + 12s});
  stretch.zoom(0.1, 0, whole);
  EXPECT_EQ(text(stretch.of(whole)), "1200 to 1210");
}

TEST(TrendStretch, ZoomingOutEndsAtTheWholeHistory) {
  TrendStretch stretch;
  stretch.showLast(40min);
  stretch.zoom(2, whole);
  EXPECT_EQ(stretch.kind(), Kind::Whole);
}

TEST(TrendStretch, ZoomingOutBeforeTheBeginningStartsThere) {
  TrendStretch stretch;
  stretch.show({11min, 21min});
  stretch.zoom(2, 0.5, whole);
  EXPECT_EQ(text(stretch.of(whole)), "600 to 1800");
}

TEST(TrendStretch, MovingBackStopsTheFollowing) {
  TrendStretch stretch;
  stretch.showLast(10min);
  stretch.pan(-0.5, whole);
  EXPECT_EQ(stretch.kind(), Kind::Fixed);
  EXPECT_EQ(text(stretch.of(whole)), "3300 to 3900");
  EXPECT_EQ(text(stretch.of({10min, 90min})), "3300 to 3900");
}

TEST(TrendStretch, MovingToTheEndFollowsAgain) {
  TrendStretch stretch;
  stretch.show({50min, 65min});
  stretch.pan(1, whole);
  EXPECT_EQ(stretch.kind(), Kind::Last);
  EXPECT_EQ(stretch.length(), 15min);
}

TEST(TrendStretch, MovingStopsAtTheBeginning) {
  TrendStretch stretch;
  stretch.show({15min, 30min});
  stretch.pan(-1, whole);
  EXPECT_EQ(text(stretch.of(whole)), "600 to 1500");
}

TEST(TrendStretch, AStretchLongerThanTheHistoryDoesNotMove) {
  TrendStretch stretch;
  stretch.showLast(10min);
  stretch.pan(-0.5, {0s, 90s});
  EXPECT_EQ(stretch.kind(), Kind::Last);
}

TEST(TrendStretch, GoesToBothEnds) {
  TrendStretch stretch;
  stretch.showLast(10min);
  stretch.goToBegin(whole);
  EXPECT_EQ(text(stretch.of(whole)), "600 to 1200");
  stretch.goToEnd(whole);
  EXPECT_EQ(stretch.kind(), Kind::Last);
  EXPECT_EQ(text(stretch.of(whole)), "3600 to 4200");
}

}  // namespace
}  // namespace varnel
