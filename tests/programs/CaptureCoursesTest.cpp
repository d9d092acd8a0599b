#include "programs/varnel/CaptureCourses.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tests/support/DictionaryOf.h"
#include "tests/support/FakeClock.h"

namespace varnel {
namespace {

using testing::Each;
using testing::IsEmpty;

constexpr std::int64_t start = 1'700'000'000;

// A capture whose level is its second, with a display every two seconds.
class CaptureCoursesTest : public testing::Test {
 protected:
  static std::shared_ptr<const VarnelModelNode> display(int level) {
    PathDictionary paths;
    return VarnelModelNode::makeTreeFromObject_withPathDictionary(
        dictionaryOf({{"Cell", dictionaryOf({{"Level", std::to_string(level)}, {"Name", "a cell"}})}}),
        paths);
  }
  void read(int from, int to) {
    for (int second = from; second <= to; second += 2) capture.add(display(second), {start + second, 0});
  }
  // The display is that of another second now, and the only one that was shown.
  void jump(int second) {
    displays.clear();
    clock.set({start + second, 0});
    shown = display(second);
    displays.add(shown, clock.now());
  }
  const VarnelModelNode& row(std::size_t number = 0) const {
    return *shown->childNodes()->at(0)->childNodes()->at(number);
  }

  FakeClock clock;
  ValueHistory displays, capture;
  bool isPlayed = true, isWhole = true;
  std::shared_ptr<const VarnelModelNode> shown;
  CaptureCourses courses{
      {displays, clock, [this] {
         return isPlayed ? std::optional(CaptureCourses::Capture{&capture, isWhole}) : std::nullopt;
       }}};
};

TEST_F(CaptureCoursesTest, AfterAJumpTheCourseUpToThePlayedPlaceIsThere) {
  read(0, 600);
  jump(300);
  EXPECT_EQ(courses.edition(), 1u);
  const auto values = courses.course(row());
  ASSERT_EQ(values.size(), 24u);
  EXPECT_EQ(values[0], 70);
  EXPECT_EQ(values[11], 180);
  EXPECT_EQ(values[23], 300);
}

TEST_F(CaptureCoursesTest, AJumpBackForgetsWhatComesLater) {
  read(0, 600);
  jump(300);
  EXPECT_EQ(courses.course(row())[23], 300);
  jump(100);
  const auto values = courses.course(row());
  EXPECT_EQ(values[23], 100);
  EXPECT_EQ(values[14], 10);
  EXPECT_EQ(values[13], 0) << "the first display";
  EXPECT_EQ(values[12], std::nullopt) << "before the capture";
}

TEST_F(CaptureCoursesTest, FollowsThePlayedPlace) {
  read(0, 600);
  jump(300);
  EXPECT_EQ(courses.course(row())[23], 300);
  clock.set({start + 300, 900'000'000});
  EXPECT_EQ(courses.course(row())[23], 300);
  clock.set({start + 318, 0});
  EXPECT_EQ(courses.course(row())[22], 310);
  EXPECT_EQ(courses.course(row())[23], 318);
}

TEST_F(CaptureCoursesTest, UntilTheCaptureIsReadThereTheShownDisplaysHaveTheCourse) {
  isWhole = false;
  read(0, 296);
  jump(300);
  EXPECT_EQ(courses.edition(), 0u);
  auto values = courses.course(row());
  ASSERT_EQ(values.size(), 24u);
  EXPECT_EQ(values.back(), 300);
  values.pop_back();
  EXPECT_THAT(values, Each(std::nullopt));
  read(298, 302);
  EXPECT_EQ(courses.edition(), 1u);
  EXPECT_EQ(courses.course(row())[0], 70);
}

TEST_F(CaptureCoursesTest, BehindTheLastDisplayOfTheCaptureItsCourseStays) {
  read(0, 299);
  jump(300);
  EXPECT_EQ(courses.edition(), 1u);
  EXPECT_EQ(courses.course(row())[23], 298);
}

TEST_F(CaptureCoursesTest, WithoutACaptureTheShownDisplaysHaveTheCourse) {
  read(0, 600);
  isPlayed = false;
  jump(300);
  EXPECT_EQ(courses.edition(), 0u);
  EXPECT_EQ(courses.course(row()).at(22), std::nullopt);
  EXPECT_EQ(courses.course(row()).at(23), 300);
}

TEST_F(CaptureCoursesTest, ATextHasNone) {
  read(0, 600);
  jump(300);
  EXPECT_THAT(courses.course(row(1)), IsEmpty());
}

}  // namespace
}  // namespace varnel
