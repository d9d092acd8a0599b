#include "base/ClockStep.h"

#include <gtest/gtest.h>

#include <limits>

namespace varnel {
namespace {

constexpr std::int64_t earliest = std::numeric_limits<std::int64_t>::min();
constexpr std::int64_t latest = std::numeric_limits<std::int64_t>::max();

TEST(ClockStep, OnByADayAtMostIsNone) {
  EXPECT_EQ(clockStep({100, 5}, {100, 5}), ClockStep::None);
  EXPECT_EQ(clockStep({100, 5}, {100, 6}), ClockStep::None);
  EXPECT_EQ(clockStep({100, 5}, {86500, 5}), ClockStep::None);
}

TEST(ClockStep, OnByMoreThanADayIsAhead) {
  EXPECT_EQ(clockStep({100, 5}, {86500, 6}), ClockStep::Ahead);
  EXPECT_EQ(clockStep({earliest, 0}, {latest, 0}), ClockStep::Ahead);
}

TEST(ClockStep, BackByTenSecondsAtMostIsAnOvertaking) {
  EXPECT_EQ(clockStep({100, 5}, {100, 4}), ClockStep::Overtaking);
  EXPECT_EQ(clockStep({100, 5}, {90, 5}), ClockStep::Overtaking);
}

TEST(ClockStep, BackByMoreIsBack) {
  EXPECT_EQ(clockStep({100, 5}, {90, 4}), ClockStep::Back);
  EXPECT_EQ(clockStep({100, 5}, {-3500, 5}), ClockStep::Back);
  EXPECT_EQ(clockStep({latest, 0}, {earliest, 0}), ClockStep::Back);
}

}  // namespace
}  // namespace varnel
