#include "programs/varnel-telephonyd/simulation/CDMACarrier.h"

#include <gtest/gtest.h>

namespace varnel::simulation {
namespace {

Cell mast(std::int64_t power_cdbm = -6'00) {
  return {.access = Access::HRPD, .code = 4, .identity = 1, .setback_cm = 20'00, .power_cdbm = power_cdbm};
}

// The street is so short that everything is received far above the noise.
Town townOf(std::vector<Cell> cells) { return {50'00, std::move(cells)}; }

TEST(CDMACarrier, AMastThatIsAloneIsNearlyEverything) {
  const Walk walk(townOf({mast()}), Random(1));
  const CDMACarrier carrier = receiveCDMACarrier(walk, Access::HRPD);
  ASSERT_EQ(carrier.pilots.size(), 1u);
  // Of 65536 parts, 20 of 21.
  EXPECT_NEAR(static_cast<double>(carrier.pilots[0].strength), 62415, 40);
  // And 0.21 dB above the mast.
  EXPECT_NEAR(static_cast<double>(carrier.level_cdbm - walk.level_cdbm(*carrier.pilots[0].cell)), 21, 4);
}

TEST(CDMACarrier, ThePilotOf1xIsAFifthOfThePower) {
  const Walk walk(townOf({mast()}), Random(1));
  const CDMACarrier carrier = receiveCDMACarrier(walk, Access::CDMA1xRTT);
  EXPECT_NEAR(static_cast<double>(carrier.pilots[0].strength), 12483, 10);
}

TEST(CDMACarrier, MastsDisturbOneAnother) {
  // Ten times as strong as the other.
  const Walk walk(townOf({mast(-16'00), mast()}), Random(1));
  const CDMACarrier carrier = receiveCDMACarrier(walk, Access::HRPD);
  ASSERT_EQ(carrier.pilots.size(), 2u);
  // 20 and 2 of 23 parts.
  EXPECT_NEAR(static_cast<double>(carrier.pilots[0].strength), 56988, 40);
  EXPECT_NEAR(static_cast<double>(carrier.pilots[1].strength), 5699, 10);
  EXPECT_EQ(carrier.strength(*carrier.pilots[1].cell), carrier.pilots[1].strength);
}

TEST(CDMACarrier, NoiseDrownsWhatIsFarAway) {
  const Walk walk(townOf({mast(-100'00)}), Random(1));
  const CDMACarrier carrier = receiveCDMACarrier(walk, Access::HRPD);
  EXPECT_LT(carrier.pilots[0].strength, 10);
  EXPECT_NEAR(static_cast<double>(carrier.level_cdbm), -106'00, 2);
}

TEST(CDMACarrier, BothTechnologiesAreReceivedFromTheSameMasts) {
  const Walk walk(townOf({mast(-16'00), mast()}), Random(1));
  const CDMACarrier voice = receiveCDMACarrier(walk, Access::CDMA1xRTT),
                    data = receiveCDMACarrier(walk, Access::HRPD);
  EXPECT_EQ(voice.level_cdbm, data.level_cdbm);
  ASSERT_EQ(voice.pilots.size(), 2u);
  EXPECT_EQ(voice.pilots[0].cell, data.pilots[0].cell);
  EXPECT_EQ(voice.pilots[1].cell, data.pilots[1].cell);
}

TEST(CDMACarrier, StrengthsHaveDecibels) {
  EXPECT_EQ(strength_cdb(65536), 0);
  EXPECT_NEAR(static_cast<double>(strength_cdb(32768)), -3'01, 3);
  EXPECT_NEAR(static_cast<double>(strength_cdb(655)), -20'00, 3);
}

TEST(CDMACarrier, TheWeakerAPhoneReceivesTheStrongerItSends) {
  EXPECT_EQ(openLoopPower_cdbm(-80'00), 7'00);
  EXPECT_EQ(openLoopPower_cdbm(-60'00), -13'00);
  EXPECT_EQ(openLoopPower_cdbm(-100'00), 23'00);
  EXPECT_EQ(openLoopPower_cdbm(-20'00), -50'00);
}

}  // namespace
}  // namespace varnel::simulation
