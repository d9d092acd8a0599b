#include "programs/shared/Timestamps.h"

#include <gtest/gtest.h>

namespace varnel {
namespace {

TEST(Timestamp, MillisecondsAreCutOffNotRounded) {
  EXPECT_EQ(timestamp({1709301909, 0}), "2024-03-01T14:05:09.000Z");
  EXPECT_EQ(timestamp({1709301909, 500'000'000}), "2024-03-01T14:05:09.500Z");
  EXPECT_EQ(timestamp({1709301909, 999'999'999}), "2024-03-01T14:05:09.999Z");
  EXPECT_EQ(timestamp({-1, 1'000'000}), "1969-12-31T23:59:59.001Z");
}

TEST(TimeOfDescription, IsTheMomentOfTheDefaultTextualForm) {
  EXPECT_EQ(timeOfDescription("2024-03-01 14:05:09 +0000"), (Time{1709301909, 0}));
  EXPECT_EQ(timeOfDescription("1970-01-01 00:00:00 +0000"), (Time{0, 0}));
  EXPECT_EQ(timeOfDescription("2024-02-29 23:59:59 +0000"), (Time{1709251199, 0}));
}

TEST(TimeOfDescription, AnyOtherTextIsNone) {
  for (const char* text :
       {"", "2024-03-01", "2024-03-01 14:05:09 +0100", "2024-03-01T14:05:09 +0000",
        "2023-02-29 00:00:00 +0000", "2024-13-01 14:05:09 +0000", "2024-03-01 24:05:09 +0000",
        "2024-03-01 14:60:09 +0000", "2024-03-01 14:05:60 +0000", "2024-03-01 14:05:-9 +0000",
        "2024-03-01 14:05: 9 +0000", "-024-03-01 14:05:09 +0000", "2024-03-01 14:05:09 +0000 "}) {
    EXPECT_FALSE(timeOfDescription(text)) << text;
  }
}

}  // namespace
}  // namespace varnel
