#include "LogGenerator/Decimal.h"

#include <gtest/gtest.h>

#include <bit>
#include <cmath>
#include <cstdint>
#include <cstdio>
#include <limits>
#include <random>
#include <string>

namespace varnel {
namespace {

std::string decimal(double number, int precision) {
  char room[512];
  return {room, putDecimal(room, room + sizeof room, number, precision)};
}

// What the C library shows.
std::string printed(double number, int precision) {
  char room[512];
  return {room, static_cast<std::size_t>(std::snprintf(room, sizeof room, "%.*f", precision, number))};
}

TEST(Decimal, HasItsDecimalsAndZerosBeforeThem) {
  EXPECT_EQ(decimal(0, 2), "0.00");
  EXPECT_EQ(decimal(7.0625, 2), "7.06");
  EXPECT_EQ(decimal(-0.004, 2), "-0.00");
  EXPECT_EQ(decimal(1234.5, 0), "1234");
  EXPECT_EQ(decimal(1235.5, 0), "1236");
  EXPECT_EQ(decimal(-99.96, 1), "-100.0");
  EXPECT_EQ(decimal(0.0015, 3), "0.002");
}

TEST(Decimal, AHalfGoesToTheEvenDigitAndOnlyAnExactOneIsAHalf) {
  EXPECT_EQ(decimal(0.125, 2), "0.12");
  EXPECT_EQ(decimal(0.375, 2), "0.38");
  EXPECT_EQ(decimal(2.5, 0), "2");
  EXPECT_EQ(decimal(0.015, 2), "0.01");  // 0.01499999999999999944
  EXPECT_EQ(decimal(0.045, 2), "0.04");  // 0.04499999999999999833
  EXPECT_EQ(decimal(0.035, 2), "0.04");  // 0.03500000000000000333
}

TEST(Decimal, WhatIsNotFiniteHasItsName) {
  EXPECT_EQ(decimal(std::numeric_limits<double>::infinity(), 2), "inf");
  EXPECT_EQ(decimal(-std::numeric_limits<double>::infinity(), 2), "-inf");
  EXPECT_EQ(decimal(std::numeric_limits<double>::quiet_NaN(), 2), "nan");
}

TEST(Decimal, ShowsEverySizeOfNumberAsTheLibraryDoes) {
  for (int precision = 0; precision <= 6; ++precision) {
    for (const double number :
         {9e12, std::nextafter(9e12, 0), -9e12, 1e300, 4503599627370496.5, 5e-324, 0.0, -0.0,
          std::numeric_limits<double>::max(), 0.5, 0.05, 0.005, 0.0005, 0.00049}) {
      EXPECT_EQ(decimal(number, precision), printed(number, precision)) << number << ", " << precision;
    }
  }
}

TEST(Decimal, ShowsAllThatMeasurementsCanBeAsTheLibraryDoes) {
  for (int raw = -70000; raw <= 70000; ++raw) {
    const double scaled[] = {raw * 0.0625 - 180.0, raw / 10.0, raw * 334 / 1000.0 - 63.248, raw / 512.0,
                             10 * std::log10(std::fabs(raw / 512.0))};
    for (const double number : scaled) ASSERT_EQ(decimal(number, 2), printed(number, 2)) << raw;
  }
}

TEST(Decimal, ShowsAnyBitsAsTheLibraryDoes) {
  std::mt19937_64 random(20100);
  std::uniform_int_distribution<int> exponents(1023 - 14, 1023 + 44);
  for (int i = 0; i < 300000; ++i) {
    const std::uint64_t sign = random() & std::uint64_t{1} << 63U;
    const std::uint64_t mantissa = random() >> 12U;
    const auto number = std::bit_cast<double>(sign | static_cast<std::uint64_t>(exponents(random)) << 52U |
                                              mantissa >> (i % 40) << (i % 40));
    const int precision = i % 5;
    ASSERT_EQ(decimal(number, precision), printed(number, precision)) << std::hexfloat << number;
  }
}

TEST(Decimal, KeepsToTheRoomThatItIsGiven) {
  char room[8] = "*******";
  EXPECT_EQ(std::string(room, putDecimal(room, room + 5, -1.25, 2)), "-1.25");
  EXPECT_EQ(room[5], '*');
}

}  // namespace
}  // namespace varnel
