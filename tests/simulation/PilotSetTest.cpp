#include "programs/varnel-telephonyd/simulation/PilotSet.h"

#include <gtest/gtest.h>

#include <array>

namespace varnel::simulation {
namespace {

class PilotSetTest : public testing::Test {
 protected:
  // Of the cells in their order.
  static CDMACarrier carrier(const std::vector<std::int64_t>& strengths) {
    CDMACarrier carrier{{}, -70'00};
    for (std::size_t i = 0; i < strengths.size(); ++i) carrier.pilots.push_back({&cells[i], strengths[i]});
    return carrier;
  }
  std::vector<int> members(const CDMACarrier& carrier) const {
    std::vector<int> numbers;
    for (const ReceivedPilot& pilot : set.pilots(carrier))
      numbers.push_back(static_cast<int>(pilot.cell - cells.data()));
    return numbers;
  }

  static const std::array<Cell, 8> cells;
  PilotSet set{{.add = 1000, .drop = 500}};
};
const std::array<Cell, 8> PilotSetTest::cells{};

TEST_F(PilotSetTest, ItIsEmptyAtFirst) { EXPECT_TRUE(members(carrier({9000, 8000})).empty()); }

TEST_F(PilotSetTest, AStrongPilotComesInAndAWeakOneDoesNot) {
  const CDMACarrier received = carrier({9000, 1000, 999});
  set.update(received, cells[0]);
  EXPECT_EQ(members(received), (std::vector{0, 1}));
}

TEST_F(PilotSetTest, TheServingCellIsInHoweverWeak) {
  const CDMACarrier received = carrier({9000, 100});
  set.update(received, cells[1]);
  EXPECT_EQ(members(received), (std::vector{1, 0}));
}

TEST_F(PilotSetTest, APilotIsDroppedAfterThreeSecondsOfWeakness) {
  set.update(carrier({9000, 1000}), cells[0]);
  const CDMACarrier weak = carrier({9000, 499});
  for (int step = 0; step < 30; ++step) set.update(weak, cells[0]);
  EXPECT_EQ(members(weak), (std::vector{0, 1}));
  set.update(weak, cells[0]);
  EXPECT_EQ(members(weak), (std::vector{0}));
}

TEST_F(PilotSetTest, StrengthForAMomentSavesAPilot) {
  set.update(carrier({9000, 1000}), cells[0]);
  for (int step = 0; step < 100; ++step) set.update(carrier({9000, step % 30 == 29 ? 500 : 499}), cells[0]);
  EXPECT_EQ(members(carrier({9000, 499})), (std::vector{0, 1}));
}

TEST_F(PilotSetTest, ItHoldsSixPilotsAndMakesRoomForTheServingCell) {
  const CDMACarrier received = carrier({9000, 8000, 7000, 6000, 5000, 4000, 3000, 2000});
  set.update(received, cells[0]);
  EXPECT_EQ(members(received), (std::vector{0, 1, 2, 3, 4, 5}));
  set.update(received, cells[7]);
  EXPECT_EQ(members(received), (std::vector{1, 2, 3, 4, 5, 7}));
}

TEST_F(PilotSetTest, AnIdlePhoneHasOnePilotOrNone) {
  const CDMACarrier received = carrier({9000, 8000});
  set.update(received, cells[0]);
  set.reset(&cells[1]);
  EXPECT_EQ(members(received), (std::vector{1}));
  set.reset(nullptr);
  EXPECT_TRUE(members(received).empty());
}

}  // namespace
}  // namespace varnel::simulation
