#include "programs/varnel/JumpStages.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace varnel {
namespace {

using testing::ElementsAre;

constexpr std::int64_t start = 1'700'000'000;

std::vector<int> endsOf(JumpStages stages) {
  std::vector<int> ends;
  while (!stages.isDone()) {
    ends.push_back(stages.next());
    stages.reach(std::nullopt);
  }
  return ends;
}

TEST(JumpStages, AreShorterTheNearerThePlaceIs) {
  JumpStages stages(100'000);
  stages.begin(0);
  EXPECT_THAT(endsOf(stages),
              ElementsAre(10'000, 40'000, 55'000, 70'000, 85'000, 92'000, 96'000, 98'000, 99'000, 100'000));
}

TEST(JumpStages, LeaveOutWhatIsThere) {
  JumpStages stages(100'000);
  stages.begin(92'000);
  EXPECT_THAT(endsOf(stages), ElementsAre(96'000, 98'000, 99'000, 100'000));
  stages.begin(99'500);
  EXPECT_THAT(endsOf(stages), ElementsAre(100'000));
}

TEST(JumpStages, OfADayAreFew) {
  JumpStages stages(86'400'000);
  stages.begin(0);
  const auto ends = endsOf(stages);
  EXPECT_EQ(ends.size(), 20u);
  EXPECT_EQ(ends.front(), 28'800'000);
}

TEST(JumpStages, AnEndIsAsMuchLaterAsItIsAhead) {
  JumpStages stages(3000);
  stages.begin(0);
  EXPECT_EQ(stages.expect(0, {start, 0}), (Time{start + 1, 0}));
  stages.reach(Time{start + 1, 0});
  EXPECT_EQ(stages.expect(1000, {start + 1, 0}), (Time{start + 2, 0}));
  stages.reach(Time{start + 1, 500'000'000});
  EXPECT_EQ(stages.expect(1500, {start + 1, 500'000'000}), (Time{start + 3, 0}));
  stages.reach(Time{start + 3, 0});
  EXPECT_TRUE(stages.isDone());
  EXPECT_FALSE(stages.repetition());
}

TEST(JumpStages, AreRepeatedOnceWithTheTimesThatWereTold) {
  JumpStages stages(3000);
  stages.begin(0);
  stages.expect(0, {start, 0});
  stages.reach(Time{start + 1, 0});
  stages.expect(1000, {start + 1, 0});
  stages.reach(Time{start + 902, 0});
  stages.expect(2000, {start + 902, 0});
  stages.reach(Time{start + 903, 0});
  auto again = stages.repetition();
  ASSERT_TRUE(again);
  EXPECT_EQ(again->place(), 3000);
  again->begin(0);
  EXPECT_EQ(again->expect(0, {start, 0}), (Time{start + 1, 0}));
  again->reach(Time{start + 1, 0});
  EXPECT_EQ(again->expect(1000, {start + 1, 0}), (Time{start + 902, 0}));
  again->reach(Time{start + 100, 0});
  EXPECT_FALSE(again->repetition());
}

}  // namespace
}  // namespace varnel
