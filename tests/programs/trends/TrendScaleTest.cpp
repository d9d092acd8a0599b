#include "programs/varnel/trends/TrendScale.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <limits>

namespace varnel {
namespace {

using namespace std::chrono_literals;

std::string text(const TrendScale& scale) {
  return numberText(scale.lowest, scale.decimals) + " to " + numberText(scale.highest, scale.decimals) +
         " by " + numberText(scale.step, scale.decimals);
}

TEST(TrendScale, TicksAreRoundNumbers) {
  EXPECT_EQ(text(scaleFor(-97.3, -84.1, 6)), "-100 to -80 by 5");
  EXPECT_EQ(text(scaleFor(0, 43, 5)), "0 to 50 by 10");
  EXPECT_EQ(text(scaleFor(1815, 2585, 8)), "1800 to 2600 by 100");
}

TEST(TrendScale, SmallDifferencesGetDecimals) {
  EXPECT_EQ(text(scaleFor(0.012, 0.048, 4)), "0.01 to 0.05 by 0.01");
  EXPECT_EQ(text(scaleFor(10.02, 10.09, 10)), "10.02 to 10.09 by 0.01");
}

TEST(TrendScale, ThereAreNotMoreStepsThanWanted) {
  EXPECT_EQ(text(scaleFor(-95.5, -85.5, 5)), "-100 to -85 by 5");
  for (int most = 1; most < 12; ++most) {
    const TrendScale scale = scaleFor(-7.7, 19.3, most);
    // Zero lies inside, so there are two steps at least.
    EXPECT_LE(std::lround((scale.highest - scale.lowest) / scale.step), std::max(most, 2)) << most;
    EXPECT_LE(scale.lowest, -7.7);
    EXPECT_GE(scale.highest, 19.3);
  }
}

TEST(TrendScale, AValueThatStaysTheSameIsInTheMiddle) {
  EXPECT_EQ(text(scaleFor(7, 7, 4)), "6.0 to 8.0 by 0.5");
  EXPECT_EQ(text(scaleFor(0, 0, 4)), "-1.0 to 1.0 by 0.5");
}

TEST(TrendScale, NoValuesAndEndlessOnesHaveAScaleToo) {
  const double endless = std::numeric_limits<double>::infinity();
  EXPECT_EQ(scaleFor(endless, -endless, 4), TrendScale());
  EXPECT_EQ(scaleFor(-endless, endless, 4), TrendScale());
}

TEST(NumberText, HasNoNegativeZero) {
  EXPECT_EQ(numberText(-0.04, 1), "0.0");
  EXPECT_EQ(numberText(-0.05001, 1), "-0.1");
  EXPECT_EQ(numberText(12, 0), "12");
}

TEST(TrendStatistics, TheMeanHasTheDecimalsOfTheValues) {
  const TrendStatistics statistics =
      statisticsOf({.count = 3, .lowest = -97, .mean = -90.333, .highest = -84, .last = -90, .decimals = 1});
  EXPECT_EQ(statistics.lowest, "-97.0");
  EXPECT_EQ(statistics.mean, "-90.3");
  EXPECT_EQ(statistics.highest, "-84.0");
  EXPECT_EQ(statistics.last, "-90.0");
}

TEST(TrendStatistics, WithoutSamplesThereIsNothingToTell) { EXPECT_EQ(statisticsOf({}).mean, ""); }

}  // namespace
}  // namespace varnel
