#include "programs/varnel-telephonyd/simulation/UMTSCarrier.h"

#include <gtest/gtest.h>

namespace varnel::simulation {
namespace {

Cell cellAt(std::int64_t position_cm) {
  return {.access = Access::UMTS,
          .channel = 10588,
          .position_cm = position_cm,
          .setback_cm = 20'00,
          .power_cdbm = -12'00};
}

TEST(UMTSCarrier, HasFourDecibelsMoreThanItsStrongestCell) {
  const Walk walk({2000'00, {cellAt(100'00), cellAt(1100'00)}}, Random(1));
  EXPECT_EQ(umtsRSSI_cdbm(walk), walk.cells(Access::UMTS).at(0).level_cdbm + 4'00);
}

TEST(UMTSCarrier, AStrongestCellHasMinusFourDecibelsOfIt) {
  const Walk walk({2000'00, {cellAt(100'00), cellAt(1100'00)}}, Random(1));
  EXPECT_EQ(umtsEcN0_cdb(walk, *walk.cells(Access::UMTS).at(0).cell), -4'00);
}

TEST(UMTSCarrier, ACellThatDrownsHasTheLeastThatIsTold) {
  Cell weak = cellAt(100'00);
  weak.power_cdbm = -60'00;
  const Walk walk({2000'00, {cellAt(100'00), weak}}, Random(1));
  EXPECT_EQ(umtsEcN0_cdb(walk, *walk.cells(Access::UMTS).at(1).cell), -24'00);
}

TEST(UMTSCarrier, TwoCellsAlikeHaveTheSamePart) {
  const Walk walk({2000'00, {cellAt(100'00), cellAt(100'00)}}, Random(1));
  EXPECT_EQ(umtsEcN0_cdb(walk, *walk.cells(Access::UMTS).at(1).cell), -4'00);
}

// 524,288 times 10 to the power of -0.05, -0.35, -0.95, -2.25 and -2.35.
TEST(UMTSCarrier, EnergiesAreHalfADecibelAboveTheWholeOne) {
  EXPECT_EQ(umtsEnergy(-1'00), 467'272);
  EXPECT_EQ(umtsEnergy(-4'00), 234'191);
  EXPECT_EQ(umtsEnergy(-4'99), 234'191);
  EXPECT_EQ(umtsEnergy(-10'50), 58'826);
  EXPECT_EQ(umtsEnergy(-23'00), 2'948);
  EXPECT_EQ(umtsEnergy(-24'00), 2'342);
}

TEST(UMTSChannelNumbers, UplinkFollowsDownlink) { EXPECT_EQ(uplinkUARFCN(10588), 9638); }

}  // namespace
}  // namespace varnel::simulation
