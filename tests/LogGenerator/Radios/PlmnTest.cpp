#include "LogGenerator/Radios/Plmn.h"

#include <gtest/gtest.h>

namespace varnel {
namespace {

std::string ofOctets(const Bytes& octets) { return plmnText(Packet(octets), 0); }

TEST(Plmn, DigitsLieInNibblesOfThreeOctets) {
  EXPECT_EQ(ofOctets({0x21, 0x63, 0x54}), "123-456");
  EXPECT_EQ(plmnText(Packet(Bytes{0xFF, 0x21, 0x63, 0x54}), 1), "123-456");
}

TEST(Plmn, AThirdNetworkDigitOf15IsNone) {
  EXPECT_EQ(ofOctets({0x62, 0xF2, 0x20}), "262-02");
  EXPECT_EQ(ofOctets({0x00, 0xF1, 0x00}), "001-00");
}

TEST(Plmn, ADigitAbove9MakesAnEmptyText) {
  EXPECT_EQ(ofOctets({0xFF, 0xFF, 0xFF}), "");
  EXPECT_EQ(ofOctets({0x2A, 0x63, 0x54}), "");
  EXPECT_EQ(ofOctets({0xA1, 0x63, 0x54}), "");
  EXPECT_EQ(ofOctets({0x21, 0x6A, 0x54}), "");
  EXPECT_EQ(ofOctets({0x21, 0xE3, 0x54}), "");
  EXPECT_EQ(ofOctets({0x21, 0x63, 0x5A}), "");
  EXPECT_EQ(ofOctets({0x21, 0x63, 0xF4}), "");
}

TEST(Plmn, NumbersKeepTheirLeadingZeros) {
  EXPECT_EQ(plmnText(310, 260, 3), "310-260");
  EXPECT_EQ(plmnText(262, 2, 2), "262-02");
  EXPECT_EQ(plmnText(1, 1, 3), "001-001");
  EXPECT_EQ(plmnText(999, 99, 2), "999-99");
}

TEST(Plmn, NumbersThatAreTooLargeMakeAnEmptyText) {
  EXPECT_EQ(plmnText(1000, 1, 2), "");
  EXPECT_EQ(plmnText(310, 100, 2), "");
  EXPECT_EQ(plmnText(310, 1000, 3), "");
  EXPECT_EQ(plmnText(0xFFFF, 0xFFFF, 0xFF), "");
}

TEST(Plmn, ANetworkCodeOfOneDigitMakesAnEmptyText) {
  EXPECT_EQ(plmnText(310, 1, 1), "");
  EXPECT_EQ(plmnText(310, 1, 0), "");
  EXPECT_EQ(plmnText(310, 1, 4), "");
}

}  // namespace
}  // namespace varnel
