#include "app/DateFormatter.h"

#include <gtest/gtest.h>

#include "app/Status.h"

namespace varnel {
namespace {

// 2024-03-01 14:05:09 UTC.
constexpr Time friday{1709301909, 0};

TEST(DateFormatter, TheUpdateStatus) {
  EXPECT_EQ(DateFormatter(updateStatusPattern).string(friday, {}), "Updated 2024-03-01 at 14:05:09");
}

TEST(DateFormatter, ShowsTheTimeOfTheZone) {
  EXPECT_EQ(DateFormatter(updateStatusPattern).string(friday, {36000, false}),
            "Updated 2024-03-02 at 00:05:09");
}

TEST(DateFormatter, PadsToTheLengthOfTheRun) {
  EXPECT_EQ(DateFormatter("yyyyy|M|dd|HHH|m|ss").string(friday, {}), "02024|3|01|014|5|09");
}

TEST(DateFormatter, WhatIsBetweenApostrophesIsItself) {
  EXPECT_EQ(DateFormatter("'yyyy' HH 'mm'").string(friday, {}), "yyyy 14 mm");
}

}  // namespace
}  // namespace varnel
