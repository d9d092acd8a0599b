#include "LogGenerator/Radios/ChannelText.h"

#include <gtest/gtest.h>

namespace varnel::channels {
namespace {

TEST(ChannelText, LTEFrequenciesHaveOneDecimal) {
  EXPECT_EQ(lteDownlinkFrequency(5230), "751.0 MHz");
  EXPECT_EQ(lteUplinkFrequency(23230), "782.0 MHz");
  EXPECT_EQ(lteDownlinkFrequency(3800), "1844.9 MHz");
}

TEST(ChannelText, ATimeDivisionChannelIsOneOfBothDirections) {
  EXPECT_EQ(lteDownlinkFrequency(39650), "2496.0 MHz");
  EXPECT_EQ(lteUplinkFrequency(39650), "2496.0 MHz");
}

TEST(ChannelText, ANumberOfNoBandMakesAnEmptyText) {
  EXPECT_EQ(lteDownlinkFrequency(23230), "");
  EXPECT_EQ(lteUplinkFrequency(5230), "");
  EXPECT_EQ(lteBand(65535), "");
  EXPECT_EQ(nrFrequency(3279166), "");
}

TEST(ChannelText, TheBandIsThatOfTheDownlink) { EXPECT_EQ(lteBand(5230), "13"); }

std::string bandwidthText(std::uint8_t resourceBlocks) {
  Formatter formatter;
  return std::string(formatter.text(Packet(ByteView(&resourceBlocks, 1)), u8(0), lteBandwidthFormat));
}

TEST(ChannelText, LTEBandwidthsAreThoseOfTheStandard) {
  EXPECT_EQ(bandwidthText(6), "1.4 MHz");
  EXPECT_EQ(bandwidthText(15), "3 MHz");
  EXPECT_EQ(bandwidthText(25), "5 MHz");
  EXPECT_EQ(bandwidthText(50), "10 MHz");
  EXPECT_EQ(bandwidthText(75), "15 MHz");
  EXPECT_EQ(bandwidthText(100), "20 MHz");
  EXPECT_EQ(bandwidthText(0), "Unknown");
  EXPECT_EQ(bandwidthText(101), "Unknown");
}

TEST(ChannelText, NRFrequenciesHaveThreeDecimals) {
  EXPECT_EQ(nrFrequency(504990), "2524.950 MHz");
  EXPECT_EQ(nrFrequency(632628), "3489.420 MHz");
}

}  // namespace
}  // namespace varnel::channels
