#include "programs/varnel-decode/ListProgress.h"

#include <gtest/gtest.h>

namespace varnel {
namespace {

using namespace std::chrono_literals;

constexpr std::uint64_t mebibytes(std::uint64_t count) { return count << 20; }

TEST(ListProgress, ShowsBytesCapturesAndTheTimeLeft) {
  EXPECT_EQ(progressText({.bytesDone = mebibytes(25),
                          .bytesDecoded = mebibytes(25),
                          .bytes = mebibytes(100),
                          .capturesDone = 3,
                          .captures = 12,
                          .elapsed = 10s}),
            "[#####...............]  25 %  25.0 of 100.0 MiB  3 of 12 captures  0:30 left");
}

// 20 MiB in 40 s, and 50 MiB are left.
TEST(ListProgress, WhatWasLeftAsItWasTellsNothingAboutTheSpeed) {
  EXPECT_EQ(progressText({.bytesDone = mebibytes(50),
                          .bytesDecoded = mebibytes(20),
                          .bytes = mebibytes(100),
                          .capturesDone = 3,
                          .captures = 12,
                          .elapsed = 40s}),
            "[##########..........]  50 %  50.0 of 100.0 MiB  3 of 12 captures  1:40 left");
}

TEST(ListProgress, HoursHaveAPlaceOfTheirOwn) {
  EXPECT_EQ(progressText({.bytesDone = mebibytes(1),
                          .bytesDecoded = mebibytes(1),
                          .bytes = mebibytes(3601),
                          .capturesDone = 0,
                          .captures = 1,
                          .elapsed = 2s}),
            "[....................]   0 %  1.0 of 3601.0 MiB  0 of 1 captures  2:00:00 left");
}

TEST(ListProgress, WithoutSpeedThereIsNoTimeLeft) {
  EXPECT_EQ(progressText({.bytes = 0, .captures = 2}),
            "[....................]   0 %  0.0 of 0.0 MiB  0 of 2 captures");
}

}  // namespace
}  // namespace varnel
