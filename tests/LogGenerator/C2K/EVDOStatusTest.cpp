#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <utility>

#include "tests/support/C2KHarness.h"

namespace varnel {
namespace {

using testing::IsEmpty;

class EVDOStatusTest : public C2KTest {
 protected:
  // An access terminal in the connected state, everything else 0.
  static PacketBuilder connected() { return PacketBuilder(0x1183, 50).u8(36, 5); }

  std::string shownState(std::uint8_t state) {
    return published(connected().u8(36, state).bytes(), "k1xEVDODeviceState");
  }
  std::string shownBandClass(std::uint8_t bandClass) {
    return published(connected().u8(14, static_cast<std::uint8_t>(bandClass << 3)).bytes(), "kBandClass");
  }
};

// Everything that the decoder reads, by hand, in a packet whose other bytes are set.
PacketBuilder wholeStatus() {
  return PacketBuilder(0x1183, 50)
      .fill(0xFF)
      .u8(13, 0x34)     // channel bits 0 to 7
      .u8(14, 0x35)     // band class 6, channel bits 8 to 10: 101
      .u8(15, 0xB5)     // -75
      .u8(16, 0xA6)     // -90
      .u8(17, 0x17)     // 23
      .u16(18, 0x01A4)  // 420
      .u8(36, 0x05)
      .u8(37, 0x04)
      .u16(38, 0xCDEF)
      .u8(40, 0xAB)
      .u8(41, 0x2A);
}

TEST_F(EVDOStatusTest, ShowsTenVariablesInThisOrder) {
  EXPECT_EQ(published(wholeStatus().bytes()),
            R"({kChannel: "1332", k1xEVDODeviceState: "Connected [5]", kBandClass: "2GHz band [6]", )"
            R"(kRxAGC0: "-75 dBm", kRxAGC1: "-90 dBm", kTxAGC: "+23 dBm", )"
            "kServingPNOffset: \"420 \u00D7 64chips\", "
            R"(kSessionState: "Open [4]", kUATI24: "0xabcdef", kColorCode: "42"})");
  EXPECT_THAT(log.takeTexts(), IsEmpty());
}

TEST_F(EVDOStatusTest, APacketOfAnyOtherLengthThan50IsRefused) {
  for (const std::size_t size : {49u, 51u, 13u, 100u}) {
    expectRefused(PacketBuilder(0x1183, size).bytes(),
                  "<3>Log code 0x1183 is " + std::to_string(size) + " bytes long but should be 50 bytes.");
  }
}

TEST_F(EVDOStatusTest, EveryTruncatedPacketIsRefused) {
  forEachTruncation(wholeStatus().bytes(), [](std::size_t size, const std::string& shown, const auto& lines) {
    EXPECT_EQ(shown, "{}");
    if (size < 13) {
      EXPECT_THAT(lines, IsEmpty());
    } else {
      EXPECT_THAT(lines, testing::ElementsAre("<3>Log code 0x1183 is " + std::to_string(size) +
                                              " bytes long but should be 50 bytes."));
    }
  });
}

TEST_F(EVDOStatusTest, TheChannelHas11BitsAndTheBandClassTheOther5) {
  const auto channelAndBand = [&](std::uint16_t bytes) {
    const std::string channel = published(connected().u16(13, bytes).bytes(), "kChannel");
    return channel + " " + described(display.dictionary()->get("kBandClass"));
  };
  EXPECT_EQ(channelAndBand(0x0000), R"("0" "800 MHz cellular band [0]")");
  EXPECT_EQ(channelAndBand(0x0001), R"("1" "800 MHz cellular band [0]")");
  EXPECT_EQ(channelAndBand(0x0080), R"("128" "800 MHz cellular band [0]")");
  EXPECT_EQ(channelAndBand(0x0100), R"("256" "800 MHz cellular band [0]")");
  EXPECT_EQ(channelAndBand(0x0400), R"("1024" "800 MHz cellular band [0]")");
  EXPECT_EQ(channelAndBand(0x07FF), R"("2047" "800 MHz cellular band [0]")");
  EXPECT_EQ(channelAndBand(0x0800), R"("0" "1.8 to 2.0GHz PCS band [1]")");
  EXPECT_EQ(channelAndBand(0x8000), R"("0" "[Bad Value 16]")");
  EXPECT_EQ(channelAndBand(0xFFFF), R"("2047" "[Bad Value 31]")");
}

TEST_F(EVDOStatusTest, EachBandClassHasItsText) {
  EXPECT_EQ(shownBandClass(0), R"("800 MHz cellular band [0]")");
  EXPECT_EQ(shownBandClass(1), R"("1.8 to 2.0GHz PCS band [1]")");
  EXPECT_EQ(shownBandClass(2), R"("872 to 960MHz TACS band [2]")");
  EXPECT_EQ(shownBandClass(3), R"("832 to 925MHz JTACS band [3]")");
  EXPECT_EQ(shownBandClass(4), R"("1.75 to 1.87GHz Korean PCS band [4]")");
  EXPECT_EQ(shownBandClass(5), R"("450MHz band [5]")");
  EXPECT_EQ(shownBandClass(6), R"("2GHz band [6]")");
  EXPECT_EQ(shownBandClass(7), R"("700MHz band [7]")");
  EXPECT_EQ(shownBandClass(8), R"("1800 MHz band [8]")");
  EXPECT_EQ(shownBandClass(9), R"("900 MHzband [9]")");
  EXPECT_EQ(shownBandClass(10), R"("Secondary 800 MHz band [10]")");
  EXPECT_EQ(shownBandClass(11), R"("400 MHz European PAMR band [11]")");
  EXPECT_EQ(shownBandClass(12), R"("800 MHz European PAMR band [12]")");
}

TEST_F(EVDOStatusTest, ABandClassOf13To31IsABadValue) {
  EXPECT_EQ(shownBandClass(13), R"("[Bad Value 13]")");
  for (unsigned bandClass = 14; bandClass <= 31; ++bandClass) {
    EXPECT_EQ(shownBandClass(static_cast<std::uint8_t>(bandClass)),
              "\"[Bad Value " + std::to_string(bandClass) + "]\"");
  }
}

TEST_F(EVDOStatusTest, EachAccessTerminalStateHasItsText) {
  EXPECT_EQ(shownState(0), R"("Inactive [0]")");
  EXPECT_EQ(shownState(1), R"("Acquisition [1]")");
  EXPECT_EQ(shownState(2), R"("Sync [2]")");
  EXPECT_EQ(shownState(3), R"("Idle [3]")");
  EXPECT_EQ(shownState(4), R"("Access [4]")");
  EXPECT_EQ(shownState(5), R"("Connected [5]")");
  EXPECT_EQ(shownState(6), R"("[Reserved 6]")");
  EXPECT_EQ(shownState(128), R"("[Reserved 128]")");
  EXPECT_EQ(shownState(255), R"("[Reserved 255]")");
}

TEST_F(EVDOStatusTest, EachSessionStateHasItsText) {
  const auto shown = [&](std::uint8_t session) {
    return published(connected().u8(37, session).bytes(), "kSessionState");
  };
  EXPECT_EQ(shown(0), R"("Closed [0]")");
  EXPECT_EQ(shown(1), R"("AMP setup [1]")");
  EXPECT_EQ(shown(2), R"("AT-initiated neg [2]")");
  EXPECT_EQ(shown(3), R"("Initiated neg [3]")");
  EXPECT_EQ(shown(4), R"("Open [4]")");
  EXPECT_EQ(shown(5), R"("[Reserved 5]")");
  EXPECT_EQ(shown(7), R"("[Reserved 7]")");
  EXPECT_EQ(shown(255), R"("[Reserved 255]")");
}

TEST_F(EVDOStatusTest, BelowTheAccessStateTheSecondChainAndTheTransmitterShowNA) {
  for (const std::uint8_t state : {0, 1, 2, 3}) {
    published(wholeStatus().u8(36, state).bytes());
    EXPECT_EQ(described(display.dictionary()->get("kRxAGC0")), R"("-75 dBm")") << int{state};
    EXPECT_EQ(described(display.dictionary()->get("kRxAGC1")), R"("N/A")") << int{state};
    EXPECT_EQ(described(display.dictionary()->get("kTxAGC")), R"("N/A")") << int{state};
  }
}

TEST_F(EVDOStatusTest, FromTheAccessStateOnAllThreeLevelsAreShown) {
  for (const std::uint8_t state : {4, 5, 6, 255}) {
    published(wholeStatus().u8(36, state).bytes());
    EXPECT_EQ(described(display.dictionary()->get("kRxAGC0")), R"("-75 dBm")") << int{state};
    EXPECT_EQ(described(display.dictionary()->get("kRxAGC1")), R"("-90 dBm")") << int{state};
    EXPECT_EQ(described(display.dictionary()->get("kTxAGC")), R"("+23 dBm")") << int{state};
  }
}

TEST_F(EVDOStatusTest, LevelsAreSignedAndAlwaysShowTheirSign) {
  const std::pair<std::size_t, const char*> levels[] = {{15, "kRxAGC0"}, {16, "kRxAGC1"}, {17, "kTxAGC"}};
  for (const auto& [offset, variable] : levels) {
    EXPECT_EQ(published(connected().u8(offset, 0x00).bytes(), variable), R"("+0 dBm")");
    EXPECT_EQ(published(connected().u8(offset, 0x01).bytes(), variable), R"("+1 dBm")");
    EXPECT_EQ(published(connected().u8(offset, 0x7F).bytes(), variable), R"("+127 dBm")");
    EXPECT_EQ(published(connected().u8(offset, 0x80).bytes(), variable), R"("-128 dBm")");
    EXPECT_EQ(published(connected().u8(offset, 0xFF).bytes(), variable), R"("-1 dBm")");
  }
}

TEST_F(EVDOStatusTest, APNOffsetOfFFFFIsInvalid) {
  const auto shown = [&](std::uint16_t offset) {
    return published(connected().u16(18, offset).bytes(), "kServingPNOffset");
  };
  EXPECT_EQ(shown(0xFFFF), R"("Invalid Value")");
  EXPECT_EQ(shown(0xFFFE), "\"65534 \u00D7 64chips\"");
  EXPECT_EQ(shown(0x00FF), "\"255 \u00D7 64chips\"");
  EXPECT_EQ(shown(0x8000), "\"32768 \u00D7 64chips\"");
  EXPECT_EQ(shown(0), "\"0 \u00D7 64chips\"");
}

TEST_F(EVDOStatusTest, TheUATIHas24BitsInSixDigits) {
  const auto shown = [&](std::uint16_t low, std::uint8_t high) {
    return published(connected().u16(38, low).u8(40, high).bytes(), "kUATI24");
  };
  EXPECT_EQ(shown(0x0000, 0x00), R"("0x000000")");
  EXPECT_EQ(shown(0x000F, 0x00), R"("0x00000f")");
  EXPECT_EQ(shown(0x1234, 0x00), R"("0x001234")");
  EXPECT_EQ(shown(0x0000, 0x01), R"("0x010000")");
  EXPECT_EQ(shown(0xFFFF, 0xFF), R"("0xffffff")");
}

TEST_F(EVDOStatusTest, TheColorCodeHas8Bits) {
  EXPECT_EQ(published(connected().u8(41, 0).bytes(), "kColorCode"), R"("0")");
  EXPECT_EQ(published(connected().u8(41, 255).bytes(), "kColorCode"), R"("255")");
}

}  // namespace
}  // namespace varnel
