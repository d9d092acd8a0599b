#include "programs/varnel-telephonyd/simulation/Decibels.h"

#include <gtest/gtest.h>

namespace varnel::simulation {
namespace {

TEST(Decibels, TenDecibelsAreTenTimesThePower) {
  EXPECT_EQ(power_aw(-150'00), 1);
  EXPECT_EQ(power_aw(-140'00), 10);
  EXPECT_EQ(power_aw(-120'00), 1'000);
  EXPECT_EQ(power_aw(-40'00), 100'000'000'000);
}

TEST(Decibels, ThreeDecibelsAreTwiceThePower) {
  EXPECT_EQ(power_aw(-117'00), 1'995);
  EXPECT_EQ(power_aw(-87'00), 1'995'000);
}

TEST(Decibels, BetweenWholeDecibelsItIsAStraightLine) { EXPECT_EQ(power_aw(-119'50), 1'129); }

TEST(Decibels, LevelsOutOfRangeCountAsTheNearest) {
  EXPECT_EQ(power_aw(-200'00), 1);
  EXPECT_EQ(power_aw(5'00), 1'000'000'000'000'000);
  EXPECT_EQ(level_cdbm(0), -150'00);
  EXPECT_EQ(level_cdbm(-7), -150'00);
}

TEST(Decibels, APowerHasItsLevel) {
  EXPECT_EQ(level_cdbm(1), -150'00);
  EXPECT_EQ(level_cdbm(2), -147'00);
  EXPECT_EQ(level_cdbm(1'000), -120'00);
  EXPECT_EQ(level_cdbm(1'995), -117'00);
  EXPECT_EQ(level_cdbm(50'120'000'000), -43'00);
  EXPECT_EQ(level_cdbm(1'000'000'000'000'000), 0);
}

TEST(Decibels, ALevelIsThatOfItsPower) {
  for (std::int64_t level = -110'00; level <= -20'00; ++level)
    EXPECT_NEAR(static_cast<double>(level_cdbm(power_aw(level))), static_cast<double>(level), 2) << level;
}

}  // namespace
}  // namespace varnel::simulation
