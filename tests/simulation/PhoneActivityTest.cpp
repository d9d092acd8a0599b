#include "programs/varnel-telephonyd/simulation/PhoneActivity.h"

#include <gtest/gtest.h>

#include <set>
#include <vector>

namespace varnel::simulation {
namespace {

using namespace std::chrono_literals;
using Kind = PhoneActivity::Kind;

void runUntil(PhoneActivity& activity, Kind kind, std::chrono::milliseconds& now) {
  while (activity.kind() != kind) activity.update(now += 100ms);
}

TEST(PhoneActivity, ItTellsWhereItIsThenTransfersAndCallsInTurn) {
  PhoneActivity activity{Random(1)};
  std::vector kinds{activity.kind()};
  for (auto now = 0ms; kinds.size() < 13; now += 100ms) {
    if (activity.update(now)) kinds.push_back(activity.kind());
  }
  EXPECT_EQ(kinds,
            (std::vector{Kind::Idle, Kind::LocationAccess, Kind::LocationUpdate, Kind::Idle,
                         Kind::PacketAccess, Kind::PacketTransfer, Kind::Idle, Kind::CallAccess,
                         Kind::CallSetup, Kind::Call, Kind::CallRelease, Kind::Idle, Kind::PacketAccess}));
}

TEST(PhoneActivity, ItIsLocatedAfterTheUpdate) {
  PhoneActivity activity{Random(1)};
  auto now = 0ms;
  runUntil(activity, Kind::LocationUpdate, now);
  EXPECT_FALSE(activity.isLocated());
  runUntil(activity, Kind::Idle, now);
  EXPECT_TRUE(activity.isLocated());
  EXPECT_EQ(activity.locatedAt(), now);
}

TEST(PhoneActivity, AnotherAreaIsToldAfterTheCall) {
  PhoneActivity activity{Random(1)};
  auto now = 0ms;
  runUntil(activity, Kind::Call, now);
  activity.areaChanged();
  EXPECT_EQ(activity.kind(), Kind::Call);
  runUntil(activity, Kind::Idle, now);
  while (!activity.update(now += 100ms)) {
  }
  EXPECT_EQ(activity.kind(), Kind::LocationAccess);
}

TEST(PhoneActivity, TheLocationIsToldAgainInTime) {
  PhoneActivity activity{Random(1)};
  std::set<std::chrono::milliseconds> moments;
  for (auto now = 0ms; now < 70min; now += 100ms) {
    activity.update(now);
    if (activity.isLocated()) moments.insert(activity.locatedAt());
  }
  ASSERT_EQ(moments.size(), 3u);
  const auto between = *std::next(moments.begin()) - *moments.begin();
  EXPECT_GE(between, 30min);
  EXPECT_LE(between, 31min);
}

TEST(PhoneActivity, ChannelsOfItsOwnAreForCallsAndTheLocation) {
  PhoneActivity activity{Random(1)};
  std::set<Kind> dedicated;
  for (auto now = 0ms; now < 5min; now += 100ms) {
    activity.update(now);
    if (activity.isDedicated()) dedicated.insert(activity.kind());
  }
  EXPECT_EQ(dedicated, (std::set{Kind::LocationUpdate, Kind::CallSetup, Kind::Call, Kind::CallRelease}));
}

}  // namespace
}  // namespace varnel::simulation
