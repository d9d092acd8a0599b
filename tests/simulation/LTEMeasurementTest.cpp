#include "programs/varnel-telephonyd/simulation/LTEMeasurement.h"

#include <gtest/gtest.h>

namespace varnel::simulation {
namespace {

Cell cellOn(int channel, std::int64_t power_cdbm) {
  return {.channel = channel, .position_cm = 100'00, .setback_cm = 20'00, .power_cdbm = power_cdbm};
}

constexpr std::int64_t streetLength_cm = 300'00;

TEST(LTEMeasurement, ACellAloneOnItsCarrierHasTheBestQuality) {
  const Walk walk({streetLength_cm, {cellOn(1300, -15'00), cellOn(2850, -15'00)}}, Random(1));
  Random random(2);
  const auto measurements = measureLTECarrier(walk, 1300, random);
  ASSERT_EQ(measurements.size(), 1u);
  EXPECT_EQ(measurements[0].cell->channel, 1300);
  EXPECT_EQ(measurements[0].averageRSRP_cdbm, walk.level_cdbm(*measurements[0].cell));
  EXPECT_EQ(measurements[0].averageRSRQ_cdb, -4'00);
  EXPECT_TRUE(measurements[0].isMeasurable());
}

TEST(LTEMeasurement, CellsOfOneCarrierShareItsPowerAndDisturbEachOther) {
  const Walk walk({streetLength_cm, {cellOn(1300, -15'00), cellOn(1300, -15'00)}}, Random(1));
  Random random(2);
  const auto measurements = measureLTECarrier(walk, 1300, random);
  ASSERT_EQ(measurements.size(), 2u);
  // Twice the power is 3.01 dB more.
  for (const LTEMeasurement& measurement : measurements) {
    EXPECT_EQ(measurement.averageRSRQ_cdb, -7'01);
    EXPECT_EQ(measurement.rssi_cdbm, lteRSSI_cdbm(walk, 1300));
  }
}

TEST(LTEMeasurement, AMuchWeakerCellIsDetectedAtMost) {
  const Walk walk({streetLength_cm, {cellOn(1300, -15'00), cellOn(1300, -35'00), cellOn(1300, -40'00)}},
                  Random(1));
  Random random(2);
  const auto measurements = measureLTECarrier(walk, 1300, random);
  ASSERT_EQ(measurements.size(), 3u);
  EXPECT_TRUE(measurements[0].isMeasurable());
  EXPECT_FALSE(measurements[1].isMeasurable());
  EXPECT_TRUE(measurements[1].isDetectable());
  EXPECT_FALSE(measurements[2].isDetectable());
}

TEST(LTEMeasurement, NoiseCoversTheWeakestCells) {
  const Walk walk({streetLength_cm, {cellOn(1300, -90'00)}}, Random(1));
  Random random(2);
  EXPECT_FALSE(measureLTECarrier(walk, 1300, random).at(0).isMeasurable());
}

}  // namespace
}  // namespace varnel::simulation
