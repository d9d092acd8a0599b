#include "app/RowCourse.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tests/support/DictionaryOf.h"

namespace varnel {
namespace {

using testing::IsEmpty;

class RowCourseTest : public testing::Test {
 protected:
  void add(std::int64_t second, const std::string& level) {
    PathDictionary paths;
    tree = VarnelModelNode::makeTreeFromObject_withPathDictionary(
        dictionaryOf({{"Cell", dictionaryOf({{"Level", level}, {"Name", "a cell"}})}}), paths);
    history.add(tree, {1700000000 + second, 0});
  }
  const VarnelModelNode& row(std::size_t number) const {
    return *tree->childNodes()->at(0)->childNodes()->at(number);
  }
  std::vector<std::optional<double>> course() const { return recentCourse(history, row(0)); }

  ValueHistory history;
  std::shared_ptr<const VarnelModelNode> tree;
};

TEST_F(RowCourseTest, HasTheLastValueOfEachTenSeconds) {
  for (int second = 0; second <= 24; second += 2) add(second, std::to_string(second));
  const auto values = course();
  ASSERT_EQ(values.size(), 24u);
  EXPECT_EQ(values[19], std::nullopt) << "before the first display";
  EXPECT_EQ(values[20], 0);
  EXPECT_EQ(values[21], 10);
  EXPECT_EQ(values[22], 20);
  EXPECT_EQ(values[23], 24);
}

TEST_F(RowCourseTest, MovesOnlyWhenTenSecondsAreOver) {
  add(0, "1");
  add(2, "2");
  EXPECT_EQ(course()[22], 1);
  EXPECT_EQ(course()[23], 2);
  add(10, "3");
  EXPECT_EQ(course()[22], 1);
  EXPECT_EQ(course()[23], 3);
  add(12, "4");
  EXPECT_EQ(course()[21], 1);
  EXPECT_EQ(course()[22], 3);
  EXPECT_EQ(course()[23], 4);
}

TEST_F(RowCourseTest, OfAStandingNumberStandsUntilFourMinutesAreOver) {
  for (int second = 0; second <= 8; second += 2) add(second, std::to_string(second));
  const auto former = course();
  EXPECT_EQ(former[22], 0);
  EXPECT_EQ(former[23], 8);
  for (int second = 10; second <= 246; second += 2) {
    add(second, "8");
    ASSERT_EQ(course(), former) << second;
  }
  for (int second = 248; second <= 250; second += 2) add(second, "8");
  EXPECT_EQ(course(), (std::vector<std::optional<double>>(24, 8)));
}

TEST_F(RowCourseTest, AtAnEarlierPointKnowsNothingLater) {
  for (int second = 0; second <= 40; second += 2) add(second, std::to_string(second));
  const auto series = history.seriesOfKey("/Cell/Level");
  ASSERT_TRUE(series);
  const auto values = recentCourse(history, *series, std::chrono::milliseconds(24'500));
  ASSERT_EQ(values.size(), 24u);
  EXPECT_EQ(values[20], 0);
  EXPECT_EQ(values[21], 10);
  EXPECT_EQ(values[22], 20);
  EXPECT_EQ(values[23], 24);
  EXPECT_EQ(recentCourse(history, *series, std::chrono::seconds(40)), course());
}

TEST_F(RowCourseTest, FourMinutesAfterTheLastSampleThereIsNone) {
  add(0, "1");
  add(2, "2");
  const auto series = history.seriesOfKey("/Cell/Level");
  ASSERT_TRUE(series);
  EXPECT_EQ(recentCourse(history, *series, std::chrono::seconds(242)).back(), 2);
  EXPECT_THAT(recentCourse(history, *series, std::chrono::seconds(243)), IsEmpty());
}

TEST_F(RowCourseTest, ATextHasNoCourse) {
  add(0, "1");
  EXPECT_THAT(recentCourse(history, row(1)), IsEmpty());
}

TEST(RowIdentity, IsANameAndNoMeasure) {
  for (const char* name : {"Tracking Area Code", "NR-ARFCN", "Band", "PN", "C-RNTI"})
    EXPECT_TRUE(isIdentity(name)) << name;
  for (const char* name : {"RSRP", "RSSI", "Timing Advance", "QCI", "Rank", ""})
    EXPECT_FALSE(isIdentity(name)) << name;
}

}  // namespace
}  // namespace varnel
