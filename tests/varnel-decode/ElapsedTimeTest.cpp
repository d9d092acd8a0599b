#include "programs/varnel-decode/ElapsedTime.h"

#include <gtest/gtest.h>

namespace varnel {
namespace {

using namespace std::chrono_literals;

ElapsedTime after(std::initializer_list<Time> records) {
  ElapsedTime elapsed;
  for (const Time time : records) elapsed.record(time);
  return elapsed;
}

TEST(ElapsedTime, CountsFromTheFirstRecord) {
  EXPECT_EQ(after({}).at({1000, 0}), 0ns);
  EXPECT_EQ(after({{1000, 250'000'000}}).at({1002, 0}), 1750ms);
  EXPECT_EQ(after({{1000, 0}, {1005, 0}}).at({1005, 0}), 5s);
}

TEST(ElapsedTime, ARecordThatAnotherOvertookChangesNothing) {
  EXPECT_EQ(after({{1000, 0}, {1005, 0}, {1003, 0}}).at({1006, 0}), 6s);
}

TEST(ElapsedTime, WhatTheClockIsSetByHasNotPassed) {
  EXPECT_EQ(after({{1000, 0}, {1005, 0}, {100, 0}}).at({103, 0}), 8s);
  EXPECT_EQ(after({{1000, 0}, {1005, 0}, {1'709'301'909, 0}}).at({1'709'301'911, 0}), 7s);
  EXPECT_EQ(after({{1000, 0}, {1005, 0}, {100, 0}, {104, 0}, {5000, 0}, {200'000, 0}}).at({200'001, 0}),
            4906s)
      << "5000 is no step of a day, 200,000 is";
}

}  // namespace
}  // namespace varnel
