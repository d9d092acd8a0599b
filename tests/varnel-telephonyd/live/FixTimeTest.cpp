#include "programs/varnel-telephonyd/live/FixTime.h"

#include <gtest/gtest.h>

namespace varnel {
namespace {

// 817,048,800 s after the beginning of 2001.
const QDateTime now({2026, 11, 22}, {14, 0}, Qt::UTC);

std::int64_t microsecondsOf(const std::string& text, const QDateTime& then = now) {
  const auto date = dateOfFix(text, then);
  return date ? std::int64_t{date->seconds} * 1'000'000 + date->microseconds : -1;
}

TEST(FixTime, ATimeOfDayIsTheNearestOne) {
  EXPECT_EQ(microsecondsOf("140005"), 817'048'805'000'000);
  EXPECT_EQ(microsecondsOf("140005.25"), 817'048'805'250'000);
  EXPECT_EQ(microsecondsOf("140005."), 817'048'805'000'000);
  EXPECT_EQ(microsecondsOf("135959"), 817'048'799'000'000);
  // One second before and after midnight.
  const QDateTime lateNow({2026, 11, 22}, {23, 59, 59}, Qt::UTC),
      earlyNow({2026, 11, 22}, {0, 0, 1}, Qt::UTC);
  EXPECT_EQ(microsecondsOf("000001", lateNow), 817'084'801'000'000);
  EXPECT_EQ(microsecondsOf("235959", earlyNow), 816'998'399'000'000);
}

TEST(FixTime, ADateIsTakenAsItIs) {
  EXPECT_EQ(microsecondsOf("2026-11-20T14:00:05Z"), 816'876'005'000'000);
  EXPECT_EQ(microsecondsOf("2026-11-20T14:00:05.5"), 816'876'005'500'000);
  EXPECT_EQ(microsecondsOf("2026-11-20T15:00:05+01:00"), 816'876'005'000'000);
}

TEST(FixTime, WhatIsNoTimeIsNone) {
  for (const char* text :
       {"", "1", "14000", "1400050", "250000", "140005,5", "14:00:05", "140005.5.5", "-40005",
        "140005.0000000000", "T", "2026-13-01T00:00:00Z", "1999-01-01T00:00:00Z"})
    EXPECT_FALSE(dateOfFix(text, now)) << text;
}

}  // namespace
}  // namespace varnel
