#include "programs/varnel-telephonyd/simulation/Walk.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <set>

#include "programs/varnel-telephonyd/simulation/CellSelection.h"

namespace varnel::simulation {
namespace {

// One LTE cell without a direction, 100 m along a street of 2 km.
Cell cellAt(std::int64_t position_cm) {
  return {.access = Access::LTE,
          .band = 3,
          .channel = 1300,
          .resourceBlocks = 100,
          .antennas = 2,
          .code = 1,
          .area = 1,
          .identity = 1,
          .position_cm = position_cm,
          .setback_cm = 20'00,
          .direction = 0,
          .power_cdbm = -15'00};
}

constexpr std::int64_t streetLength_cm = 2000'00;
constexpr int stepsRoundTheStreet = 30000;  // at 0.9 to 1.8 m/s

TEST(Walk, LevelsFallWithTheDistance) {
  Walk walk({streetLength_cm, {cellAt(100'00)}}, Random(1));
  std::int64_t strongest = -1000'00, weakest = 0;
  for (int i = 0; i < stepsRoundTheStreet; ++i) {
    walk.step();
    const std::int64_t level = walk.cells(Access::LTE).at(0).level_cdbm;
    strongest = std::max(strongest, level);
    weakest = std::min(weakest, level);
  }
  // The mean is -60.5 dBm at 20 m and -120.0 dBm at 1 km.
  EXPECT_GT(strongest, -70'00);
  EXPECT_LT(strongest, -45'00);
  EXPECT_GT(weakest, -135'00);
  EXPECT_LT(weakest, -112'00);
}

TEST(Walk, CellsComeStrongestFirstAndByTechnology) {
  Cell other = cellAt(900'00);
  other.access = Access::GSM;
  Walk walk({streetLength_cm, {cellAt(100'00), cellAt(1100'00), other}}, Random(2));
  for (int i = 0; i < stepsRoundTheStreet; ++i) {
    walk.step();
    const auto cells = walk.cells(Access::LTE);
    ASSERT_EQ(cells.size(), 2u);
    EXPECT_GE(cells[0].level_cdbm, cells[1].level_cdbm);
  }
  EXPECT_EQ(walk.cells(Access::GSM).size(), 1u);
  EXPECT_TRUE(walk.cells(Access::UMTS).empty());
}

TEST(Walk, DistancesGoTheShorterWayRound) {
  const Walk walk({streetLength_cm, {cellAt(100'00)}}, Random(1));
  EXPECT_EQ(walk.distance_cm(cellAt(100'00), cellAt(400'00)), 300'00);
  EXPECT_EQ(walk.distance_cm(cellAt(400'00), cellAt(100'00)), 300'00);
  EXPECT_EQ(walk.distance_cm(cellAt(1900'00), cellAt(100'00)), 200'00);
}

TEST(Walk, AnAerialIsWeakBehindItself) {
  Cell up = cellAt(1000'00), down = cellAt(1000'00);
  up.direction = 1;
  down.direction = -1;
  Walk walk({streetLength_cm, {up, down}}, Random(3));
  std::set<std::int64_t> strongest;
  for (int i = 0; i < stepsRoundTheStreet; ++i) {
    walk.step();
    strongest.insert(walk.cells(Access::LTE).at(0).cell->direction);
  }
  EXPECT_EQ(strongest, (std::set<std::int64_t>{-1, 1}));
}

TEST(CellSelection, AClearlyStrongerCellTakesOverAndAWeakerOneDoesNot) {
  Walk walk({streetLength_cm, {cellAt(0), cellAt(1000'00)}}, Random(4));
  CellSelection selection(walk, Access::LTE);
  const Cell* serving = &selection.servingCell();
  int changes = 0;
  for (int i = 0; i < stepsRoundTheStreet; ++i) {
    walk.step();
    const bool isAnnounced = selection.update();
    EXPECT_EQ(isAnnounced, &selection.servingCell() != serving);
    if (!isAnnounced) continue;
    ++changes;
    EXPECT_GT(walk.level_cdbm(selection.servingCell()), walk.level_cdbm(*serving) + 3'00);
    serving = &selection.servingCell();
  }
  // Twice per round, and sometimes back and forth between the cells.
  EXPECT_GE(changes, 2);
  EXPECT_LE(changes, 40);
}

TEST(LTEChannels, UplinkFollowsDownlink) {
  EXPECT_EQ(uplinkEARFCN(1300), 19300);
  EXPECT_EQ(uplinkEARFCN(6300), 24300);
  EXPECT_EQ(uplinkEARFCN(37900), 37900);
}

}  // namespace
}  // namespace varnel::simulation
