#include "app/ValueSeries.h"

#include <gtest/gtest.h>

namespace varnel {
namespace {

double valueOf(std::string_view number) { return StoredSample::ofNumber(number).value().value(); }

StoredSample sampleOf(std::int64_t digits) {
  StoredSample sample{};
  sample.digits = digits;
  return sample;
}

TEST(StoredSample, AShownNumberIsKeptExactly) {
  EXPECT_EQ(valueOf("0"), 0);
  EXPECT_EQ(valueOf("-84.25"), -84.25);
  EXPECT_EQ(valueOf("0.1"), 0.1);
  EXPECT_EQ(valueOf("-0.5"), -0.5);
  EXPECT_EQ(valueOf("-120.003906"), -120.003906);
  EXPECT_EQ(valueOf("4294967295"), 4294967295.0);
  EXPECT_EQ(valueOf("-2147483648"), -2147483648.0);
}

TEST(StoredSample, DecimalsThatDoNotFitAreCut) {
  EXPECT_EQ(valueOf("68719476735.9"), 68719476735.0);
  EXPECT_EQ(valueOf("12345.12345678"), 12345.123456);
  EXPECT_EQ(valueOf("0.0000000000000019"), 0.000000000000001);
}

TEST(StoredSample, ANumberOfTooManyDigitsIsNone) {
  EXPECT_EQ(valueOf("68719476735"), 68719476735.0);
  EXPECT_FALSE(StoredSample::ofNumber("68719476736"));
  EXPECT_FALSE(StoredSample::ofNumber("-99999999999.5"));
  EXPECT_FALSE(StoredSample::ofNumber(""));
}

TEST(ValueSeries, SamplesComeInTheirOrderOverManyBlocks) {
  ValueSeries series;
  EXPECT_EQ(series.size(), 0U);
  for (int i = 0; i < 200; ++i) {
    if (series.isFull()) series.addBlock();
    series.add(sampleOf(i));
  }
  ASSERT_EQ(series.size(), 200U);
  EXPECT_EQ(series[0].digits, 0);
  EXPECT_EQ(series[64].digits, 64);
  EXPECT_EQ(series[199].digits, 199);
  series.dropFirst(70);
  ASSERT_EQ(series.size(), 130U);
  EXPECT_EQ(series[0].digits, 70);
  EXPECT_EQ(series[129].digits, 199);
  series.dropFirst(1000);
  ASSERT_EQ(series.size(), 1U) << "the newest one stays";
  EXPECT_EQ(series[0].digits, 199);
}

TEST(ValueSeries, WithoutMoreMemoryTheOldestSamplesMakeRoom) {
  ValueSeries series;
  for (int i = 0; i < 128; ++i) {
    if (series.isFull()) series.addBlock();
    series.add(sampleOf(i));
  }
  const std::size_t bytes = series.bytes();
  series.reuseOldestBlock();
  series.add(sampleOf(128));
  ASSERT_EQ(series.size(), 65U);
  EXPECT_EQ(series[0].digits, 64);
  EXPECT_EQ(series[64].digits, 128);
  EXPECT_EQ(series.bytes(), bytes);
}

TEST(ValueSeries, ASampleTakesAboutEightBytes) {
  ValueSeries series;
  for (int i = 0; i < 1800; ++i) {
    if (series.isFull()) series.addBlock();
    series.add(sampleOf(i));
  }
  EXPECT_LE(series.bytes(), 1800U * 9);
}

}  // namespace
}  // namespace varnel
