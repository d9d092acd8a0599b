#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tests/support/C2KHarness.h"

namespace varnel {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

constexpr std::uint8_t ss = 1, rf = 2, ai = 3, fi = 4;

// Subpackets of a status: system state, RF, active-set info, finger info. Bytes that are not read are 0xFF.
SubpacketBuilder& addSystemState(SubpacketBuilder& packet, std::uint8_t deviceState) {
  return packet.add(ss, 8).fill(0xFF).u8(4, deviceState);
}
SubpacketBuilder& addRF(SubpacketBuilder& packet) {
  return packet.add(rf, 16)
      .fill(0xFF)
      .u8(4, 1)     // chain 0: band class,
      .u16(6, 600)  // channel,
      .u8(10, 10)   // 3.34 above -63.248
      .u8(5, 0)     // chain 1 likewise
      .u16(8, 1175)
      .u8(11, 0xEC)   // -20: 6.68 below -63.248
      .u16(12, 235);  // 23.5 dBm
}
// One pilot, the reference one: 2 × 9 / 9 - 1 = 1.
SubpacketBuilder& addActiveSet(SubpacketBuilder& packet) {
  return packet.add(ai, 28)
      .fill(0xFF)
      .u16(4, 1)
      .u8(6, 1)
      .u8(7, 2)
      .u8(8, 1)
      .u8(9, 0)
      .u16(10, 420)
      .u16(12, 420)
      .u16(24, 9);
}

// 77 bytes: the subpackets begin at 17, 25, 41 and 69.
SubpacketBuilder status(std::uint8_t deviceState) {
  SubpacketBuilder packet(0x119C);
  addSystemState(packet, deviceState);
  addRF(packet);
  addActiveSet(packet);
  packet.add(fi, 8).fill(0xFF);
  return packet;
}

constexpr std::uint8_t paging = 6, traffic = 8;

constexpr const char* shownInTraffic =
    R"({k1xDeviceState: "Traffic [8]", )"
    R"(k1xRx0BandClass: "1.8 to 2.0GHz PCS band [1]", k1xRx0ChanNum: "600", k1xRxAGC0: "-59.91 dBm", )"
    R"(k1xRx1BandClass: "800 MHz cellular band [0]", k1xRx1ChanNum: "1175", k1xRxAGC1: "-69.93 dBm", )"
    R"(k1xTxAGC: "+23.50 dBm", )"
    R"~(k1xActiveSetInfo: {_sorted: "_sorted", 0;420: "(ref pilot) +0.00 dB"}})~";

std::string missing(int systemState, int radio, int activeSet, int finger) {
  return "<4>Log code 0x119c: missing subpacket (ss=" + std::to_string(systemState) +
         ",rf=" + std::to_string(radio) + ",ai=" + std::to_string(activeSet) +
         ",fi=" + std::to_string(finger) + ").";
}

class OneXStatusTest : public C2KTest {
 protected:
  // A status in traffic whose RF subpacket has one value of its own.
  std::string shownOfRF8(std::size_t offset, std::uint8_t value, std::string_view variable) {
    Bytes packet = status(traffic).bytes();
    packet[25 + offset] = value;
    return published(packet, variable);
  }
  std::string shownOfRF16(std::size_t offset, std::uint16_t value, std::string_view variable) {
    Bytes packet = status(traffic).bytes();
    packet[25 + offset] = static_cast<std::uint8_t>(value);
    packet[26 + offset] = static_cast<std::uint8_t>(value >> 8);
    return published(packet, variable);
  }
};

TEST_F(OneXStatusTest, InTrafficBothChainsAndTheTransmitterAreShown) {
  EXPECT_EQ(published(status(traffic).bytes()), shownInTraffic);
  EXPECT_THAT(log.takeTexts(), IsEmpty());
}

TEST_F(OneXStatusTest, OutsideTrafficTheSecondChainAndTheTransmitterShowNA) {
  EXPECT_EQ(
      published(status(paging).bytes()),
      R"({k1xDeviceState: "Paging [6]", )"
      R"(k1xRx0BandClass: "1.8 to 2.0GHz PCS band [1]", k1xRx0ChanNum: "600", k1xRxAGC0: "-59.91 dBm", )"
      R"(k1xRx1BandClass: "N/A", k1xRx1ChanNum: "N/A", k1xRxAGC1: "N/A", k1xTxAGC: "N/A", )"
      R"~(k1xActiveSetInfo: {_sorted: "_sorted", 0;420: "(ref pilot) +0.00 dB"}})~");
  EXPECT_THAT(log.takeTexts(), IsEmpty());
}

TEST_F(OneXStatusTest, EveryStateBut8IsOutsideTraffic) {
  for (unsigned state = 0; state < 256; ++state) {
    published(status(static_cast<std::uint8_t>(state)).bytes());
    for (const char* variable : {"k1xRx1BandClass", "k1xRx1ChanNum", "k1xRxAGC1", "k1xTxAGC"}) {
      const bool isNA = described(display.dictionary()->get(variable)) == R"("N/A")";
      EXPECT_EQ(isNA, state != 8) << variable << " in state " << state;
    }
  }
}

TEST_F(OneXStatusTest, EachDeviceStateHasItsText) {
  const auto shown = [&](std::uint8_t state) { return published(status(state).bytes(), "k1xDeviceState"); };
  EXPECT_EQ(shown(0), R"("Inactive [0]")");
  EXPECT_EQ(shown(1), R"("Deep sleep in start state [1]")");
  EXPECT_EQ(shown(2), R"("Initial state for CDMA operation [2]")");
  EXPECT_EQ(shown(3), R"("Acquisition [3]")");
  EXPECT_EQ(shown(4), R"("Sync [4]")");
  EXPECT_EQ(shown(5), R"("Slew [5]")");
  EXPECT_EQ(shown(6), R"("Paging [6]")");
  EXPECT_EQ(shown(7), R"("Slotted mode sleep state [7]")");
  EXPECT_EQ(shown(8), R"("Traffic [8]")");
  EXPECT_EQ(shown(9), R"("UnSlew [9]")");
  EXPECT_EQ(shown(10), R"("Operation in PCG state [10]")");
  EXPECT_EQ(shown(11), R"("Powerup state [11]")");
  EXPECT_EQ(shown(12), R"("[Bad Value 12]")");
  EXPECT_EQ(shown(128), R"("[Bad Value 128]")");
  EXPECT_EQ(shown(255), R"("[Bad Value 255]")");
}

TEST_F(OneXStatusTest, BandClassesOfBothChainsComeFromTheTable) {
  for (const auto& [offset, variable] : {std::pair(4, "k1xRx0BandClass"), std::pair(5, "k1xRx1BandClass")}) {
    const auto shown = [this, at = static_cast<std::size_t>(offset), name = variable](std::uint8_t value) {
      return shownOfRF8(at, value, name);
    };
    EXPECT_EQ(shown(0), R"("800 MHz cellular band [0]")");
    EXPECT_EQ(shown(1), R"("1.8 to 2.0GHz PCS band [1]")");
    EXPECT_EQ(shown(2), R"("872 to 960MHz TACS band [2]")");
    EXPECT_EQ(shown(3), R"("832 to 925MHz JTACS band [3]")");
    EXPECT_EQ(shown(4), R"("1.75 to 1.87GHz Korean PCS band [4]")");
    EXPECT_EQ(shown(5), R"("450MHz band [5]")");
    EXPECT_EQ(shown(6), R"("2GHz band [6]")");
    EXPECT_EQ(shown(7), R"("700MHz band [7]")");
    EXPECT_EQ(shown(8), R"("1800 MHz band [8]")");
    EXPECT_EQ(shown(9), R"("900 MHzband [9]")");
    EXPECT_EQ(shown(10), R"("Secondary 800 MHz band [10]")");
    EXPECT_EQ(shown(11), R"("400 MHz European PAMR band [11]")");
    EXPECT_EQ(shown(12), R"("800 MHz European PAMR band [12]")");
    EXPECT_EQ(shown(13), R"("[Bad Value 13]")");
    EXPECT_EQ(shown(255), R"("[Bad Value 255]")");
  }
}

TEST_F(OneXStatusTest, ChannelsHave16Bits) {
  EXPECT_EQ(shownOfRF16(6, 0, "k1xRx0ChanNum"), R"("0")");
  EXPECT_EQ(shownOfRF16(6, 0x1234, "k1xRx0ChanNum"), R"("4660")");
  EXPECT_EQ(shownOfRF16(6, 0xFFFF, "k1xRx0ChanNum"), R"("65535")");
  EXPECT_EQ(shownOfRF16(8, 0, "k1xRx1ChanNum"), R"("0")");
  EXPECT_EQ(shownOfRF16(8, 0x1234, "k1xRx1ChanNum"), R"("4660")");
  EXPECT_EQ(shownOfRF16(8, 0xFFFF, "k1xRx1ChanNum"), R"("65535")");
}

TEST_F(OneXStatusTest, TheReceiveAGCIsComputedInRealNumbers) {
  for (const auto& [offset, variable] : {std::pair(10, "k1xRxAGC0"), std::pair(11, "k1xRxAGC1")}) {
    const auto shown = [this, at = static_cast<std::size_t>(offset), name = variable](std::uint8_t value) {
      return shownOfRF8(at, value, name);
    };
    EXPECT_EQ(shown(0), R"("-63.25 dBm")");
    EXPECT_EQ(shown(1), R"("-62.91 dBm")");
    EXPECT_EQ(shown(10), R"("-59.91 dBm")");
    EXPECT_EQ(shown(100), R"("-29.85 dBm")");
    EXPECT_EQ(shown(0x7F), R"("-20.83 dBm")");
    EXPECT_EQ(shown(0xFF), R"("-63.58 dBm")");
    EXPECT_EQ(shown(0x80), R"("-106.00 dBm")");
  }
}

TEST_F(OneXStatusTest, TheTransmitPowerIsInTenthsOfADecibel) {
  const auto shown = [&](std::uint16_t value) { return shownOfRF16(12, value, "k1xTxAGC"); };
  EXPECT_EQ(shown(0), R"("+0.00 dBm")");
  EXPECT_EQ(shown(1), R"("+0.10 dBm")");
  EXPECT_EQ(shown(235), R"("+23.50 dBm")");
  EXPECT_EQ(shown(0xFFFF), R"("-0.10 dBm")");
  EXPECT_EQ(shown(0xFDE1), R"("-54.30 dBm")");
  EXPECT_EQ(shown(0x7FFF), R"("+3276.70 dBm")");
  EXPECT_EQ(shown(0x8000), R"("-3276.80 dBm")");
}

// The subpackets and the walk over them.

TEST_F(OneXStatusTest, A16BytePacketIsTooShortAndA17ByteOneLacksItsSubpackets) {
  expectRefused(PacketBuilder(0x119C, 16).u8(14, 1).bytes(),
                "<3>Log code 0x119c is 16 bytes long but must be at least 17 bytes.");
  expectRefused(PacketBuilder(0x119C, 13).bytes(),
                "<3>Log code 0x119c is 13 bytes long but must be at least 17 bytes.");
  expectRefused(PacketBuilder(0x119C, 17).bytes(), missing(0, 0, 0, 0));
  expectRefused(PacketBuilder(0x119C, 17).u8(14, 255).bytes(), missing(0, 0, 0, 0));
}

TEST_F(OneXStatusTest, OnlyByte14OfTheContainerIsRead) {
  Bytes packet = status(traffic).bytes();
  for (const std::size_t offset : {1u, 2u, 5u, 12u, 13u, 15u, 16u}) packet[offset] = 0xFF;
  EXPECT_EQ(published(packet), shownInTraffic);
}

TEST_F(OneXStatusTest, ACountOf0FindsNothingWhateverFollows) {
  expectRefused(status(traffic).count(0).bytes(), missing(0, 0, 0, 0));
}

TEST_F(OneXStatusTest, TheCountEndsTheWalk) {
  expectRefused(status(traffic).count(1).bytes(), missing(1, 0, 0, 0));
  expectRefused(status(traffic).count(2).bytes(), missing(1, 1, 0, 0));
  expectRefused(status(traffic).count(3).bytes(), missing(1, 1, 1, 0));
}

TEST_F(OneXStatusTest, ALargerCountDoesNoHarmWhenAllAreFound) {
  EXPECT_EQ(published(status(traffic).count(255).bytes()), shownInTraffic);
  EXPECT_THAT(log.takeTexts(), IsEmpty());
}

TEST_F(OneXStatusTest, EachMissingSubpacketIsNamedAndNothingIsPublished) {
  const auto without = [](std::uint8_t id) {
    Bytes packet = status(traffic).bytes();
    constexpr std::size_t starts[] = {17, 25, 41, 69};
    packet[starts[id - 1]] = 9;
    return packet;
  };
  expectRefused(without(ss), missing(0, 1, 1, 1));
  expectRefused(without(rf), missing(1, 0, 1, 1));
  expectRefused(without(ai), missing(1, 1, 0, 1));
  expectRefused(without(fi), missing(1, 1, 1, 0));
}

TEST_F(OneXStatusTest, TheOrderOfTheSubpacketsIsFreeAndOthersAreSkipped) {
  SubpacketBuilder packet(0x119C);
  packet.add(fi, 4);
  packet.add(9, 300).fill(0x02);
  addActiveSet(packet);
  packet.add(0, 5);
  addRF(packet);
  packet.add(255, 4);
  addSystemState(packet, traffic);
  EXPECT_EQ(published(packet.bytes()), shownInTraffic);
  EXPECT_THAT(log.takeTexts(), IsEmpty());
}

TEST_F(OneXStatusTest, OfTwoSubpacketsWithTheSameIdTheFirstCounts) {
  SubpacketBuilder packet = status(traffic);
  addSystemState(packet, 0);
  packet.add(rf, 16).fill(0xFF);
  packet.add(ai, 28);
  EXPECT_EQ(published(packet.bytes()), shownInTraffic);
}

TEST_F(OneXStatusTest, ASubpacketOfSize0HoldsTheWalkUntilTheCountRunsOut) {
  SubpacketBuilder packet(0x119C);
  packet.add(9, 4, 0);
  addSystemState(packet, traffic);
  addRF(packet);
  addActiveSet(packet);
  packet.add(fi, 4);
  expectRefused(packet.count(255).bytes(), missing(0, 0, 0, 0));
}

TEST_F(OneXStatusTest, AWantedSubpacketOfSize0IsFoundAllTheSame) {
  Bytes packet = status(traffic).bytes();
  packet[69 + 2] = 0;
  EXPECT_EQ(published(packet), shownInTraffic);
  packet[17 + 2] = 0;
  expectRefused(packet, missing(1, 0, 0, 0));
}

TEST_F(OneXStatusTest, AnOversizedSubpacketEndsTheSearchesThatReachIt) {
  Bytes packet = status(traffic).bytes();
  packet[25 + 2] = packet[25 + 3] = 0xFF;
  EXPECT_EQ(published(packet), "{}");
  const char* line = "<3>Log code error in subpkt#1: bad size (65535).";
  EXPECT_THAT(log.takeTexts(), ElementsAre(line, line, line, missing(1, 0, 0, 0)));
}

TEST_F(OneXStatusTest, AMatchingSubpacketThatIsOversizedIsRefusedToo) {
  Bytes packet = status(traffic).bytes();
  packet[17 + 3] = 0x10;
  EXPECT_EQ(published(packet), "{}");
  const char* line = "<3>Log code error in subpkt#0: bad size (4104).";
  EXPECT_THAT(log.takeTexts(), ElementsAre(line, line, line, line, missing(0, 0, 0, 0)));
}

TEST_F(OneXStatusTest, ASubpacketMayEndUpTo16BytesPastThePacket) {
  Bytes packet = status(traffic).bytes();
  packet[69 + 2] = 24;  // the packet has 77 bytes, and 69 + 24 is 77 + 16
  EXPECT_EQ(published(packet), shownInTraffic);
  EXPECT_THAT(log.takeTexts(), IsEmpty());
  packet[69 + 2] = 25;
  EXPECT_EQ(published(packet), "{}");
  EXPECT_THAT(log.takeTexts(),
              ElementsAre("<3>Log code error in subpkt#3: bad size (25).", missing(1, 1, 1, 0)));
}

TEST_F(OneXStatusTest, TheSizeOfASubpacketDoesNotBoundItsFields) {
  SubpacketBuilder packet(0x119C);
  packet.add(ss, 4);
  packet.add(8, 4);  // its id lies where the device state does
  addRF(packet);
  addActiveSet(packet);
  packet.add(fi, 4);
  EXPECT_EQ(published(packet.bytes()), shownInTraffic);
}

TEST_F(OneXStatusTest, FieldsPastTheEndOfThePacketAre0) {
  SubpacketBuilder builder(0x119C);
  addActiveSet(builder);
  addRF(builder);
  builder.add(fi, 8);
  addSystemState(builder, traffic);
  Bytes packet = builder.bytes();
  packet.resize(69 + 4);
  EXPECT_EQ(published(packet, "k1xDeviceState"), R"("Inactive [0]")");
  EXPECT_THAT(log.takeTexts(), IsEmpty());
}

TEST_F(OneXStatusTest, EveryTruncatedPacketShowsWhatThePrescribedBoundLetsThrough) {
  const Bytes packet = status(traffic).bytes();
  forEachTruncation(packet, [](std::size_t size, const std::string& shown, const auto& lines) {
    EXPECT_EQ(shown, size >= 70 ? shownInTraffic : "{}");
    if (size < 13 || size >= 70) {
      EXPECT_THAT(lines, IsEmpty());
    } else if (size < 17) {
      EXPECT_THAT(lines, ElementsAre("<3>Log code 0x119c is " + std::to_string(size) +
                                     " bytes long but must be at least 17 bytes."));
    } else if (size == 17) {
      EXPECT_THAT(lines, ElementsAre(missing(0, 0, 0, 0)));
    } else if (size <= 25) {
      EXPECT_THAT(lines, ElementsAre(missing(1, 0, 0, 0)));
    } else if (size <= 41) {
      EXPECT_THAT(lines, ElementsAre(missing(1, 1, 0, 0)));
    } else if (size <= 43) {  // the size of the third reads as 0
      EXPECT_THAT(lines, ElementsAre(missing(1, 1, 1, 0)));
    } else if (size <= 52) {  // it would end at 69
      const char* line = "<3>Log code error in subpkt#2: bad size (28).";
      EXPECT_THAT(lines, ElementsAre(line, line, missing(1, 1, 0, 0)));
    } else {
      EXPECT_THAT(lines, ElementsAre(missing(1, 1, 1, 0)));
    }
  });
}

// The active set.

struct ActiveSet {
  std::uint16_t integration = 1;  // N
  std::uint8_t gain = 1;          // G
  std::uint8_t exponent = 2;      // E: 2 × energy / (9 × N² × G) - 1 / N
  std::uint8_t pilots = 1;        // n
  std::uint8_t extensions = 0;    // m
  std::uint16_t reference = 0xFFFF;
};

class ActiveSetInfoTest : public C2KTest {
 protected:
  // A status whose active set comes last, with that many bytes and zeros for all pilots.
  static SubpacketBuilder statusWith(const ActiveSet& activeSet, std::size_t size) {
    SubpacketBuilder packet(0x119C);
    addSystemState(packet, traffic);
    addRF(packet);
    packet.add(fi, 8);
    packet.add(ai, size);
    return packet.u16(4, activeSet.integration)
        .u8(6, activeSet.gain)
        .u8(7, activeSet.exponent)
        .u8(8, activeSet.pilots)
        .u8(9, activeSet.extensions)
        .u16(10, activeSet.reference);
  }
  std::string shownActiveSet(const SubpacketBuilder& packet) {
    return published(packet.bytes(), "k1xActiveSetInfo");
  }
  // The strength of a single pilot of PN 7.
  std::string shownStrength(std::uint16_t integration, std::uint8_t gain, std::uint8_t exponent,
                            std::uint16_t energy) {
    published(statusWith({integration, gain, exponent}, 26).u16(12, 7).u16(24, energy).bytes());
    const Dictionary* pilots = display.dictionary()->get("k1xActiveSetInfo").dictionary();
    return pilots ? described(pilots->get("0;7")) : "no pilots";
  }
};

TEST_F(ActiveSetInfoTest, WithoutPilotsItHoldsItsMarkerAlone) {
  EXPECT_EQ(shownActiveSet(statusWith({.pilots = 0}, 12)), R"({_sorted: "_sorted"})");
}

TEST_F(ActiveSetInfoTest, ThePilotOfTheReferencePNIsMarked) {
  EXPECT_EQ(shownActiveSet(statusWith({.reference = 7}, 26).u16(12, 7).u16(24, 9)),
            R"~({_sorted: "_sorted", 0;7: "(ref pilot) +0.00 dB"})~");
  EXPECT_EQ(shownActiveSet(statusWith({.reference = 6}, 26).u16(12, 7).u16(24, 9)),
            R"({_sorted: "_sorted", 0;7: "+0.00 dB"})");
  EXPECT_EQ(shownActiveSet(statusWith({.reference = 0x0107}, 26).u16(12, 7).u16(24, 9)),
            R"({_sorted: "_sorted", 0;7: "+0.00 dB"})");
}

TEST_F(ActiveSetInfoTest, WithoutExtensionsTheEnergyOfAPilotIsThePNOfTheNext) {
  EXPECT_EQ(shownActiveSet(statusWith({.pilots = 2}, 38).u16(12, 420).u16(24, 9).u16(36, 18)),
            R"({_sorted: "_sorted", 0;420: "+0.00 dB", 1;9: "+4.77 dB"})");
}

TEST_F(ActiveSetInfoTest, TheExtensionsWidenTheRecordsByMultiplesOf4) {
  const std::string shown = R"~({_sorted: "_sorted", 0;420: "+0.00 dB", 1;84: "(ref pilot) +4.77 dB"})~";
  EXPECT_EQ(shownActiveSet(statusWith({.pilots = 2, .extensions = 1, .reference = 84}, 50)
                               .u16(12, 420)
                               .u16(28, 9)
                               .u16(32, 84)
                               .u16(48, 18)),
            shown);
  EXPECT_EQ(shownActiveSet(statusWith({.pilots = 2, .extensions = 2, .reference = 84}, 58)
                               .u16(12, 420)
                               .u16(32, 9)
                               .u16(36, 84)
                               .u16(56, 18)),
            shown);
  EXPECT_EQ(shownActiveSet(statusWith({.pilots = 2, .extensions = 3, .reference = 84}, 70)
                               .u16(12, 420)
                               .u16(36, 9)
                               .u16(44, 84)
                               .u16(68, 18)),
            shown);
  EXPECT_EQ(shownActiveSet(statusWith({.pilots = 2, .extensions = 4, .reference = 84}, 78)
                               .u16(12, 420)
                               .u16(40, 9)
                               .u16(48, 84)
                               .u16(76, 18)),
            shown);
  EXPECT_EQ(shownActiveSet(statusWith({.pilots = 2, .extensions = 255, .reference = 84}, 2590)
                               .u16(12, 420)
                               .u16(1044, 9)
                               .u16(1556, 84)
                               .u16(2588, 18)),
            shown);
}

TEST_F(ActiveSetInfoTest, TheStrengthFollowsFromEnergyIntegrationGainAndExponent) {
  EXPECT_EQ(shownStrength(1, 1, 2, 9), R"("+0.00 dB")");         // 2 - 1
  EXPECT_EQ(shownStrength(1, 1, 2, 18), R"("+4.77 dB")");        // 4 - 1
  EXPECT_EQ(shownStrength(1, 1, 3, 9), R"("+8.45 dB")");         // 8 - 1
  EXPECT_EQ(shownStrength(1, 1, 0, 792), R"("+10.00 dB")");      // 792 / 72 - 1
  EXPECT_EQ(shownStrength(1, 1, 1, 198), R"("+10.00 dB")");      // 198 / 18 - 1
  EXPECT_EQ(shownStrength(64, 8, 5, 2304), R"("-0.07 dB")");     // 1 - 1/64
  EXPECT_EQ(shownStrength(64, 8, 5, 612), R"("-6.02 dB")");      // 17/64 - 1/64
  EXPECT_EQ(shownStrength(2, 1, 2, 27), R"("+0.00 dB")");        // 1.5 - 0.5
  EXPECT_EQ(shownStrength(1, 255, 2, 65535), R"("+17.49 dB")");  // 514 / 9 - 1
}

TEST_F(ActiveSetInfoTest, LargeFactorsDoNotOverflow) {
  EXPECT_EQ(shownStrength(32768, 128, 20, 90), R"("+10.00 dB")");  // 10 - 1/32768
  EXPECT_EQ(shownStrength(1, 1, 255, 9), R"("+1526.22 dB")");      // 2^507
}

TEST_F(ActiveSetInfoTest, TheFloorIsMinus50Decibels) {
  EXPECT_EQ(shownStrength(1, 1, 2, 0), R"("-50.00 dB")");
  EXPECT_EQ(shownStrength(1, 1, 2, 4), R"("-50.00 dB")");    // 8/9 - 1
  EXPECT_EQ(shownStrength(64, 8, 5, 36), R"("-50.00 dB")");  // 1/64 - 1/64
  EXPECT_EQ(shownStrength(65535, 255, 0, 1), R"("-50.00 dB")");
}

TEST_F(ActiveSetInfoTest, WhatIsNoNumberShowsTheFloor) {
  EXPECT_EQ(shownStrength(0, 1, 2, 9), R"("-50.00 dB")");  // infinity less infinity
  EXPECT_EQ(shownStrength(0, 1, 2, 0), R"("-50.00 dB")");
  EXPECT_EQ(shownStrength(0, 0, 2, 9), R"("-50.00 dB")");
  EXPECT_EQ(shownStrength(1, 0, 2, 0), R"("-50.00 dB")");  // 0 / 0
}

TEST_F(ActiveSetInfoTest, WithoutGainAnyEnergyIsInfinite) {
  EXPECT_EQ(shownStrength(1, 0, 2, 9), R"("+inf dB")");
}

TEST_F(ActiveSetInfoTest, PilotsPastTheEndOfThePacketShowPN0AndTheFloor) {
  const std::string shown =
      shownActiveSet(statusWith({.pilots = 255, .reference = 7}, 26).u16(12, 7).u16(24, 9));
  EXPECT_THAT(shown, HasSubstr(R"~({_sorted: "_sorted", 0;7: "(ref pilot) +0.00 dB", 1;9: "-50.00 dB", )~"
                               R"~(2;0: "-50.00 dB", )~"));
  EXPECT_THAT(shown, HasSubstr(R"(, 254;0: "-50.00 dB"})"));
  EXPECT_EQ(display.dictionary()->get("k1xActiveSetInfo").dictionary()->size(), 256u);
}

TEST_F(ActiveSetInfoTest, ATruncatedPilotReadsAsFarAsThePacketGoes) {
  // The active set begins at 49 and claims 28 bytes.
  const SubpacketBuilder whole =
      statusWith({.reference = 0x01FF}, 28).u16(10, 0x01FF).u16(12, 0x01A4).u16(24, 0x0109);
  const auto shown = [&](std::size_t size) {
    Bytes packet = whole.bytes();
    packet.resize(size);
    return published(packet, "k1xActiveSetInfo");
  };
  EXPECT_EQ(shown(75), R"({_sorted: "_sorted", 0;420: "+17.63 dB"})");  // 530 / 9 - 1
  EXPECT_EQ(shown(74), R"({_sorted: "_sorted", 0;420: "+0.00 dB"})");
  EXPECT_EQ(shown(73), R"({_sorted: "_sorted", 0;420: "-50.00 dB"})");
  EXPECT_EQ(shown(63), R"({_sorted: "_sorted", 0;420: "-50.00 dB"})");
  EXPECT_EQ(shown(62), R"({_sorted: "_sorted", 0;164: "-50.00 dB"})");
  EXPECT_EQ(shown(61), R"({_sorted: "_sorted", 0;0: "-50.00 dB"})");
  EXPECT_EQ(shown(60), "absent");  // 49 + 28 is 60 + 17
  EXPECT_THAT(log.takeTexts(),
              ElementsAre("<3>Log code error in subpkt#3: bad size (28).", missing(1, 1, 0, 1)));
}

// The old traffic frame-error rate.

TEST_F(OneXStatusTest, OutsideTrafficTheLastTrafficFERIsShownOnceMoreAsOldAndForgotten) {
  state.set("TrafficFER", Value::ofReal(0.5));
  EXPECT_THAT(published(status(paging).bytes()),
              HasSubstr(R"~(0;420: "(ref pilot) +0.00 dB"}, k1xTrafficFER: "50.00% (old)"})~"));
  EXPECT_FALSE(state.has("TrafficFER"));
  EXPECT_EQ(published(status(paging).bytes(), "k1xTrafficFER"), "absent");
}

TEST_F(OneXStatusTest, InTrafficTheTrafficFERIsLeftAlone) {
  state.set("TrafficFER", Value::ofReal(0.5));
  EXPECT_EQ(published(status(traffic).bytes(), "k1xTrafficFER"), "absent");
  EXPECT_EQ(state.get("TrafficFER").real(), 0.5);
}

TEST_F(OneXStatusTest, AMissingSubpacketLeavesTheTrafficFERAlone) {
  state.set("TrafficFER", Value::ofReal(0.5));
  expectRefused(status(paging).count(3).bytes(), missing(1, 1, 1, 0));
  EXPECT_EQ(state.get("TrafficFER").real(), 0.5);
}

TEST_F(OneXStatusTest, TheOldTrafficFERHasTwoDecimals) {
  const auto shown = [&](double rate) {
    state.set("TrafficFER", Value::ofReal(rate));
    return published(status(paging).bytes(), "k1xTrafficFER");
  };
  EXPECT_EQ(shown(0.0), R"~("0.00% (old)")~");
  EXPECT_EQ(shown(0.015625), R"~("1.56% (old)")~");
  EXPECT_EQ(shown(0.031005859375), R"~("3.10% (old)")~");
  EXPECT_EQ(shown(1.0), R"~("100.00% (old)")~");
}

TEST_F(OneXStatusTest, ATrafficFERThatIsAnIntegerIsANumberToo) {
  state.set("TrafficFER", Value::ofInteger(1));
  EXPECT_EQ(published(status(paging).bytes(), "k1xTrafficFER"), R"~("100.00% (old)")~");
  EXPECT_FALSE(state.has("TrafficFER"));
}

TEST_F(OneXStatusTest, ATrafficFERThatIsNoNumberIsNotShown) {
  state.set("TrafficFER", "0.5");
  EXPECT_EQ(published(status(paging).bytes(), "k1xTrafficFER"), "absent");
}

}  // namespace
}  // namespace varnel
