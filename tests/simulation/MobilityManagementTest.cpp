#include "programs/varnel-telephonyd/simulation/MobilityManagement.h"

#include <gtest/gtest.h>

#include <vector>

namespace varnel::simulation {
namespace {

using namespace std::chrono_literals;

// A phone and the time that passes for it.
class MobilityManagementTest : public testing::Test {
 protected:
  // State, substate, and status of the circuits, the same for the packets, and the registration.
  std::vector<int> condition() const {
    std::vector<int> numbers;
    for (const Bytes& packet : {_mobility.circuitState(_situation), _mobility.packetState(_situation)}) {
      EXPECT_EQ(packet.size(), 16u);
      numbers.insert(numbers.end(), packet.begin() + 13, packet.end());
    }
    numbers.push_back(_mobility.registrationState(_situation).at(13));
    return numbers;
  }
  // The conditions that follow, in their order.
  std::vector<std::vector<int>> conditionsWithin(std::chrono::milliseconds duration) {
    std::vector<std::vector<int>> conditions;
    for (const auto end = _now + duration; _now < end; _now += 100ms)
      if (_mobility.update(_now)) conditions.push_back(condition());
    return conditions;
  }

  std::chrono::milliseconds _now{0};
  MobilityManagement _mobility;
  const Cell _cell{};
  const Walk _walk{{2000'00, {}}, Random(1)};
  const Situation _situation{std::chrono::seconds(0), _walk, _cell};
};

const std::vector atRest{19, 8, 0, 3, 0, 0, 1}, updated{9, 0, 0, 3, 0, 0, 1};
const std::vector speaking{6, 0, 0, 3, 0, 0, 1};

TEST_F(MobilityManagementTest, APhoneThatIsSwitchedOnSearchesAndRegisters) {
  EXPECT_EQ(condition(), (std::vector{0, 0, 1, 0, 12, 1, 0}));
  EXPECT_TRUE(_mobility.isSearching());
  EXPECT_EQ(conditionsWithin(10s),
            (std::vector<std::vector<int>>{
                {19, 2, 1, 1, 6, 1, 5}, {13, 0, 1, 2, 12, 1, 2}, {3, 0, 1, 2, 12, 1, 2}, updated, atRest}));
  EXPECT_TRUE(_mobility.isRegistered());
}

TEST_F(MobilityManagementTest, AnotherAreaIsTold) {
  conditionsWithin(10s);
  _mobility.areaChanged(_now);
  EXPECT_EQ(conditionsWithin(10s),
            (std::vector<std::vector<int>>{{13, 0, 1, 3, 8, 1, 2}, {3, 0, 1, 5, 12, 1, 2}, updated, atRest}));
}

TEST_F(MobilityManagementTest, AnotherNetworkIsSearchedFirst) {
  conditionsWithin(10s);
  _mobility.networkChanged(_now);
  EXPECT_EQ(conditionsWithin(10s),
            (std::vector<std::vector<int>>{
                {19, 7, 1, 3, 6, 1, 5}, {13, 0, 1, 3, 8, 1, 2}, {3, 0, 1, 5, 12, 1, 2}, updated, atRest}));
}

TEST_F(MobilityManagementTest, ACallIsAskedForAndLastsUntilItEnds) {
  conditionsWithin(10s);
  _mobility.callBegan(_now, Access::UMTS);
  EXPECT_EQ(conditionsWithin(10s),
            (std::vector<std::vector<int>>{{14, 0, 0, 6, 12, 0, 1}, {5, 0, 0, 3, 0, 0, 1}, speaking}));
  _mobility.callBegan(_now, Access::UMTS);
  EXPECT_TRUE(conditionsWithin(10s).empty());
  _mobility.callEnded(_now);
  EXPECT_EQ(conditionsWithin(10s), (std::vector<std::vector<int>>{atRest}));
}

TEST_F(MobilityManagementTest, PacketsAreSuspendedDuringACallOverGSM) {
  conditionsWithin(10s);
  _mobility.callBegan(_now, Access::GSM);
  conditionsWithin(10s);
  EXPECT_EQ(condition(), (std::vector{6, 0, 0, 3, 7, 0, 1}));
}

TEST_F(MobilityManagementTest, AnAreaIsToldAfterTheCall) {
  conditionsWithin(10s);
  _mobility.callBegan(_now, Access::UMTS);
  conditionsWithin(10s);
  _mobility.areaChanged(_now);
  EXPECT_TRUE(conditionsWithin(10s).empty());
  _mobility.callEnded(_now);
  EXPECT_EQ(conditionsWithin(10s).size(), 4u);
  EXPECT_EQ(condition(), atRest);
}

TEST_F(MobilityManagementTest, ACallDuringARegistrationGoesOnBehindIt) {
  _mobility.callBegan(_now, Access::UMTS);
  conditionsWithin(10s);
  EXPECT_EQ(condition(), speaking);
}

}  // namespace
}  // namespace varnel::simulation
