#include "base/Time.h"

#include <gtest/gtest.h>

#include <string>

using namespace varnel;

namespace {

// Year, month, day, hour, minute, second.
std::string calendarOf(std::int64_t seconds, TimeZone zone = {}) {
  const CalendarTime time = calendarTime({seconds, 0}, zone);
  std::string text = std::to_string(time.year);
  for (const unsigned part : {time.month, time.day, time.hour, time.minute, time.second}) {
    text += ' ' + std::to_string(part);
  }
  return text;
}

}  // namespace

TEST(DurationBetween, CountsNanosecondsInBothDirections) {
  EXPECT_EQ(durationBetween({100, 999'999'999}, {101, 1}).count(), 2);
  EXPECT_EQ(durationBetween({101, 1}, {100, 999'999'999}).count(), -2);
  EXPECT_EQ(durationBetween({-1, 0}, {1, 5}).count(), 2'000'000'005);
  EXPECT_EQ(durationBetween({7, 8}, {7, 8}).count(), 0);
}

TEST(DurationBetween, MomentsCenturiesApartAreTheLongestDuration) {
  constexpr std::int64_t longest = 9'223'372'036'854'775'807;
  EXPECT_EQ(durationBetween({0, 0}, {9'223'372'035, 999'999'999}).count(), 9'223'372'035'999'999'999);
  EXPECT_EQ(durationBetween({0, 0}, {9'223'372'036, 0}).count(), longest);
  EXPECT_EQ(durationBetween({-longest - 1, 0}, {longest, 999'999'999}).count(), longest);
  EXPECT_EQ(durationBetween({longest, 999'999'999}, {-longest - 1, 0}).count(), -longest);
}

TEST(CalendarTime, BeginsIn1970) { EXPECT_EQ(calendarOf(0), "1970 1 1 0 0 0"); }

TEST(CalendarTime, CountsLeapDays) {
  EXPECT_EQ(calendarOf(951782400), "2000 2 29 0 0 0");
  EXPECT_EQ(calendarOf(951868799), "2000 2 29 23 59 59");
  EXPECT_EQ(calendarOf(951868800), "2000 3 1 0 0 0");
  EXPECT_EQ(calendarOf(1709301909), "2024 3 1 14 5 9");
  EXPECT_EQ(calendarOf(4107542400), "2100 3 1 0 0 0");  // 2100 has no leap day
  EXPECT_EQ(calendarOf(4107542399), "2100 2 28 23 59 59");
}

TEST(CalendarTime, NegativeTimesCountBackwards) {
  EXPECT_EQ(calendarOf(-1), "1969 12 31 23 59 59");
  EXPECT_EQ(calendarOf(-86400), "1969 12 31 0 0 0");
  EXPECT_EQ(calendarOf(-86401), "1969 12 30 23 59 59");
  EXPECT_EQ(calendarOf(-2208988800), "1900 1 1 0 0 0");
}

TEST(CalendarTime, NanosecondsDoNotRoundUp) {
  EXPECT_EQ(calendarTime({59, 999999999}).second, 59U);
  EXPECT_EQ(calendarTime({-1, 999999999}).second, 59U);
}

TEST(CalendarTime, ZonesShiftTheCalendar) {
  EXPECT_EQ(calendarOf(0, {3600, false}), "1970 1 1 1 0 0");
  EXPECT_EQ(calendarOf(0, {7200, true}), "1970 1 1 2 0 0");
  EXPECT_EQ(calendarOf(0, {-3600, false}), "1969 12 31 23 0 0");
  EXPECT_EQ(calendarOf(0, {20700, false}), "1970 1 1 5 45 0");
  EXPECT_EQ(calendarOf(1709251199, {1, false}), "2024 3 1 0 0 0");
  EXPECT_EQ(calendarOf(1704067199, {-12600, false}), "2023 12 31 20 29 59");
}

TEST(DateDescription, IsInUtcWithTwoDigitsEach) {
  EXPECT_EQ(dateDescription({0, 0}), "1970-01-01 00:00:00 +0000");
  EXPECT_EQ(dateDescription({1709301909, 0}), "2024-03-01 14:05:09 +0000");
  EXPECT_EQ(dateDescription({1709301909, 999999999}), "2024-03-01 14:05:09 +0000");
  EXPECT_EQ(dateDescription({-1, 0}), "1969-12-31 23:59:59 +0000");
}

TEST(DateDescription, PadsTheYear) {
  EXPECT_EQ(dateDescription({-46388678400, 0}), "0500-01-01 00:00:00 +0000");
}

TEST(Time, IsOrderedBySecondsThenNanoseconds) {
  EXPECT_LT((Time{1, 999999999}), (Time{2, 0}));
  EXPECT_LT((Time{2, 0}), (Time{2, 1}));
  EXPECT_LT((Time{-2, 5}), (Time{-1, 0}));
  EXPECT_EQ((Time{2, 1}), (Time{2, 1}));
}
