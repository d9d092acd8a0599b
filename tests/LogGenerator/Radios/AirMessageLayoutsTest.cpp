#include <gtest/gtest.h>

#include <algorithm>
#include <cstdint>
#include <initializer_list>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include "LogGenerator/Radios/AirMessage.h"
#include "tests/LogGenerator/Radios/MessagePackets.h"
#include "tests/support/Describe.h"

namespace varnel {

namespace {

using Outcome = MessageFate::Outcome;

// A message that keeps its bytes: those of an AirMessage are the packet's or the reader's.
struct ReadMessage : AirMessage {
  std::shared_ptr<const Bytes> kept;
};

ReadMessage read(const Bytes& packet, std::uint32_t logCode) {
  AirMessageReader reader;
  const AirMessageReading reading = reader.read(Packet(packet), logCode);
  EXPECT_EQ(reading.fate.outcome, Outcome::Decoded);
  EXPECT_TRUE(reading.message);
  ReadMessage message{reading.message.value_or(AirMessage{}), nullptr};
  message.kept = std::make_shared<const Bytes>(message.bytes.begin(), message.bytes.end());
  message.bytes = *message.kept;
  return message;
}

// A text for an optional number.
template <class Number>
std::string text(const std::optional<Number>& number) {
  return number ? std::to_string(*number) : "absent";
}

std::string place(const AirMessage& message) {
  return "channel " + text(message.channelNumber) + ", cell " + text(message.physicalCell) + ", frame " +
         text(message.frame);
}

void expectBroken(const Bytes& packet, std::uint32_t logCode) {
  AirMessageReader reader;
  const AirMessageReading reading = reader.read(Packet(packet), logCode);
  EXPECT_EQ(reading.fate.outcome, Outcome::TooShort);
  EXPECT_FALSE(reading.message);
  EXPECT_EQ(AirMessageReader::fateOf(Packet(packet), logCode).outcome, Outcome::TooShort);
}

// Every packet that is shorter is broken.
void expectEveryTruncationBroken(const Bytes& packet, std::uint32_t logCode) {
  for (std::size_t size = 0; size < packet.size(); ++size) {
    SCOPED_TRACE(size);
    // A copy of its own, so that the sanitizers see a read behind its end.
    expectBroken(Bytes(packet.begin(), packet.begin() + static_cast<std::ptrdiff_t>(size)), logCode);
  }
}

void expectUnknownVersion(const Bytes& packet, std::uint32_t logCode, std::uint32_t version) {
  const MessageFate fate{Outcome::UnknownVersion, logCode, PacketVersion{version}};
  AirMessageReader reader;
  const AirMessageReading reading = reader.read(Packet(packet), logCode);
  EXPECT_EQ(reading.fate, fate);
  EXPECT_FALSE(reading.message);
  EXPECT_EQ(reading.version, PacketVersion{version});
  EXPECT_EQ(AirMessageReader::fateOf(Packet(packet), logCode), fate);
}

// The channel of the number in packets of the version: "DL-DCCH Downlink". Empty when there is no message.
std::string channelOf(const Bytes& packet, std::uint32_t logCode) {
  AirMessageReader reader;
  const AirMessageReading reading = reader.read(Packet(packet), logCode);
  if (!reading.message) return "";
  const AirMessage& message = *reading.message;
  if (message.channel.empty()) return std::string(message.name);
  return std::string(message.channel) + " " + std::string(nameOf(message.direction));
}

struct Numbered {
  std::uint8_t number;
  std::string_view channel;
};

// The number of DL-DCCH in packets of the version.
std::uint8_t lteRRCDownlinkDedicated(unsigned version) {
  if (version <= 8 || version == 13 || version == 22) return 6;
  if (version == 9 || version == 12) return 13;
  return version == 19 || version >= 26 ? 9 : 7;
}

}  // namespace

// 0xB0C0

TEST(AirMessageLayouts, EachFieldOfEachVersionOfLTEStandsByItself) {
  for (const RRCHeader& header : lteRRCHeaders) {
    SCOPED_TRACE(header.version);
    const bool isNarrowNumber = header.channelNumberWidth == 2;
    const Bytes message{0x20, 0x11, 0x22};  // too short for anything but a name
    const auto packet = [&] {
      RRCPacket result(0xB0C0, header);
      result.channel(lteRRCDownlinkDedicated(header.version)).message(message);
      return result;
    };
    const ReadMessage none = read(packet().packet(), 0xB0C0);
    EXPECT_EQ(none.name, "RRCConnectionReconfiguration");
    EXPECT_EQ(none.radio, AirMessage::Radio::LTE);
    EXPECT_EQ(none.protocol, AirMessage::Protocol::RRC);
    EXPECT_EQ(none.direction, AirMessage::Direction::Downlink);
    EXPECT_EQ(none.channel, "DL-DCCH");
    EXPECT_EQ(described(none.bytes), "<201122>");
    EXPECT_EQ(place(none), "channel 0, cell 0, frame absent");

    EXPECT_EQ(place(read(packet().cell(0x0121).packet(), 0xB0C0)), "channel 0, cell 289, frame absent");
    if (isNarrowNumber) {
      EXPECT_EQ(place(read(packet().channelNumber(0x8421).packet(), 0xB0C0)),
                "channel 33825, cell 0, frame absent");
    } else {
      EXPECT_EQ(place(read(packet().channelNumber(0x00010421).packet(), 0xB0C0)),
                "channel 66593, cell 0, frame absent");
    }
    // Ten bits are the frame's, and the four below the subframe's. The two above are not the frame's.
    EXPECT_EQ(place(read(packet().frameWord(0x2AB7).packet(), 0xB0C0)), "channel 0, cell 0, frame 683");
    EXPECT_EQ(text(read(packet().frameWord(0x2AB7).packet(), 0xB0C0).subframe), "7");
    EXPECT_EQ(text(read(packet().frameWord(0xEAB7).packet(), 0xB0C0).frame), "683");
    EXPECT_EQ(text(read(packet().frameWord(0x3FF0).packet(), 0xB0C0).frame), "1023");
  }
}

TEST(AirMessageLayouts, WhatNoFieldOfLTEHoldsChangesNothing) {
  for (const RRCHeader& header : lteRRCHeaders) {
    SCOPED_TRACE(header.version);
    const Bytes message{0x28, 0x11};
    const std::uint8_t number = lteRRCDownlinkDedicated(header.version);
    const Bytes plain = RRCPacket(0xB0C0, header)
                            .channel(number)
                            .cell(77)
                            .channelNumber(1300)
                            .frameWord(0x1230)
                            .message(message)
                            .packet();
    for (unsigned offset = 1; offset < header.size; ++offset) {
      const auto isIn = [offset](unsigned first, unsigned width) {
        return offset >= first && offset < first + width;
      };
      if (isIn(header.cellAt, 2) || isIn(header.channelNumberAt, header.channelNumberWidth) ||
          isIn(header.frameAt, 2) || isIn(header.channelAt, 1) || isIn(header.lengthAt, 2) ||
          (header.segmentAt != 0 && isIn(header.segmentAt, 1))) {
        continue;
      }
      Bytes changed = plain;
      changed.at(Packet::headerSize + offset) = 0xFF;
      const ReadMessage read = varnel::read(changed, 0xB0C0);
      EXPECT_EQ(place(read), "channel 1300, cell 77, frame 291") << offset;
      EXPECT_EQ(read.name, "RRCConnectionRelease") << offset;
      EXPECT_EQ(described(read.bytes), "<2811>") << offset;
    }
  }
}

TEST(AirMessageLayouts, EveryTruncationOfEachVersionOfLTEIsBroken) {
  for (const RRCHeader& header : lteRRCHeaders) {
    SCOPED_TRACE(header.version);
    expectEveryTruncationBroken(RRCPacket(0xB0C0, header)
                                    .channel(lteRRCDownlinkDedicated(header.version))
                                    .message({0x20, 0x11, 0x22})
                                    .packet(),
                                0xB0C0);
  }
}

TEST(AirMessageLayouts, ALengthOfLTEThatDisagreesIsBroken) {
  for (const RRCHeader& header : lteRRCHeaders) {
    SCOPED_TRACE(header.version);
    for (const std::uint32_t length : {0U, 1U, 2U, 4U, 0x103U, 0xFFFFU}) {
      expectBroken(RRCPacket(0xB0C0, header)
                       .channel(lteRRCDownlinkDedicated(header.version))
                       .message({0x20, 0x11, 0x22})
                       .number(header.lengthAt, length, 2)
                       .packet(),
                   0xB0C0);
    }
  }
}

TEST(AirMessageLayouts, OtherVersionsOfLTEAreUnknown) {
  for (const unsigned version : {0, 1, 28, 32, 37, 128, 255}) {
    SCOPED_TRACE(version);
    for (const std::size_t size : {21U, 64U}) {
      Bytes packet = PacketBuilder(0xB0C0, Packet::headerSize + size).bytes();
      packet.at(Packet::headerSize) = static_cast<std::uint8_t>(version);
      expectUnknownVersion(packet, 0xB0C0, version);
    }
    expectUnknownVersion(PacketBuilder(0xB0C0, 14).u8(13, static_cast<std::uint8_t>(version)).bytes(), 0xB0C0,
                         version);
  }
}

TEST(AirMessageLayouts, EachNumberingOfTheChannelsOfLTE) {
  const struct {
    std::initializer_list<unsigned> versions;
    std::uint8_t numbers[8];
  } numberings[] = {{{2, 3, 4, 5, 6, 7, 8, 13, 22}, {1, 2, 3, 4, 5, 6, 7, 8}},
                    {{9, 12}, {8, 9, 10, 11, 12, 13, 14, 15}},
                    {{14, 15, 16, 20, 24, 25}, {1, 2, 4, 5, 6, 7, 8, 9}},
                    {{19, 26, 27, 29, 30, 31}, {1, 3, 6, 7, 8, 9, 10, 11}}};
  constexpr std::string_view channels[] = {"BCCH-BCH Downlink", "BCCH-DL-SCH Downlink", "MCCH Downlink",
                                           "PCCH Downlink",     "DL-CCCH Downlink",     "DL-DCCH Downlink",
                                           "UL-CCCH Uplink",    "UL-DCCH Uplink"};
  for (const auto& numbering : numberings) {
    for (const unsigned version : numbering.versions) {
      for (unsigned number = 0; number < 45; ++number) {
        const auto* const found = std::ranges::find(numbering.numbers, number);
        const std::string channel = channelOf(
            lteRRC(version).channel(static_cast<std::uint8_t>(number)).message({0, 0, 0, 0}).packet(),
            0xB0C0);
        if (found != std::end(numbering.numbers)) {
          EXPECT_EQ(channel, channels[found - std::begin(numbering.numbers)]) << version << " " << number;
        } else {
          // A number that no channel has names none.
          EXPECT_EQ(channel.find("-"), std::string::npos) << version << " " << number << " " << channel;
        }
      }
    }
  }
}

TEST(AirMessageLayouts, TheNumbersOfTheNarrowBandChannels) {
  constexpr std::string_view channels[] = {
      "BCCH-BCH-NB Downlink", "BCCH-DL-SCH-NB Downlink", "PCCH-NB Downlink", "DL-CCCH-NB Downlink",
      "DL-DCCH-NB Downlink",  "UL-CCCH-NB Uplink",       "UL-DCCH-NB Uplink"};
  const auto expectNumbers = [&](std::initializer_list<unsigned> versions, const std::uint8_t(&numbers)[7]) {
    for (const unsigned version : versions) {
      for (unsigned i = 0; i < 7; ++i) {
        EXPECT_EQ(channelOf(lteRRC(version).channel(numbers[i]).message({0, 0, 0, 0}).packet(), 0xB0C0),
                  channels[i])
            << version << " " << unsigned{numbers[i]};
      }
    }
  };
  expectNumbers({19, 26, 27, 29, 30, 31}, {45, 46, 47, 48, 49, 50, 52});
  expectNumbers({20, 24, 25}, {54, 55, 56, 57, 58, 59, 61});
}

TEST(AirMessageLayouts, VersionsBeforeNarrowBandHaveNoneOfItsChannels) {
  for (const unsigned version : {2U, 7U, 8U, 9U, 12U, 13U, 14U, 15U, 16U, 22U}) {
    for (const unsigned number : {45U, 46U, 52U, 54U, 55U, 61U}) {
      EXPECT_EQ(channelOf(lteRRC(version).channel(static_cast<std::uint8_t>(number)).message({0, 0}).packet(),
                          0xB0C0)
                    .find("-NB"),
                std::string::npos)
          << version << " " << number;
    }
  }
}

TEST(AirMessageLayouts, APacketOfLTETellsItsVersion) {
  for (const RRCHeader& header : lteRRCHeaders) {
    const Bytes packet =
        RRCPacket(0xB0C0, header).channel(lteRRCDownlinkDedicated(header.version)).message({0x20}).packet();
    AirMessageReader reader;
    EXPECT_EQ(reader.read(Packet(packet), 0xB0C0).version, PacketVersion{header.version});
    EXPECT_EQ(AirMessageReader::fateOf(Packet(packet), 0xB0C0), (MessageFate{Outcome::Decoded, 0xB0C0}));
  }
}

// A header alone is no message, whatever it is of.
TEST(AirMessageLayouts, APacketWithoutAMessageIsBroken) {
  expectBroken(lteRRC(26).channel(9).message({}).packet(), 0xB0C0);
  expectBroken(nrRRC(26).channel(9).message({}).packet(), 0xB821);
  expectBroken(lteNAS(0xB0EC, {}), 0xB0EC);
  expectBroken(nrNAS(0xB80A, {}), 0xB80A);
  expectBroken(gsmRR(0x81, 0x1B, {}), 0x512F);
  expectBroken(circuitNAS(0, {}), 0x713A);
  expectBroken(umtsRRC(3, {}), 0x412F);
}

// Segments

namespace {

Bytes lteSegment(std::uint8_t segment, const Bytes& part, std::uint8_t channel = 9, unsigned version = 30) {
  return lteRRC(version).channel(channel).cell(5).channelNumber(1300).segment(segment).message(part).packet();
}

Bytes nrSegment(std::uint8_t segment, const Bytes& part, unsigned version) {
  return nrRRC(version).channel(4).cell(5).channelNumber(504990).segment(segment).message(part).packet();
}

// Reads packets with one reader.
class AirMessageSegments : public testing::Test {
 protected:
  // The bytes of the message that the packet completes, or what became of the packet.
  std::string taken(const Bytes& packet, std::uint32_t logCode = 0xB0C0) {
    const AirMessageReading reading = reader.read(Packet(packet), logCode);
    if (reading.message) return described(reading.message->bytes);
    return reading.fate.outcome == Outcome::Decoded ? "waits" : "not decoded";
  }

  AirMessageReader reader;
};

}  // namespace

TEST_F(AirMessageSegments, AWholeMessageIsReadAtOnce) {
  EXPECT_EQ(taken(lteSegment(0, {0x20, 0x01})), "<2001>");
}

TEST_F(AirMessageSegments, PartsAreJoinedInTheirOrder) {
  for (const unsigned version : {30U, 31U}) {
    EXPECT_EQ(taken(lteSegment(1, {0x20, 0x01}, 9, version)), "waits");
    EXPECT_EQ(taken(lteSegment(2, {0x02}, 9, version)), "waits");
    EXPECT_EQ(taken(lteSegment(3, {0x03, 0x04}, 9, version)), "waits");
    EXPECT_EQ(taken(lteSegment(7, {0x05}, 9, version)), "<200102030405>");
  }
  for (const unsigned version : {23U, 24U, 26U, 28U}) {
    EXPECT_EQ(taken(nrSegment(1, {0x00, 0x01}, version), 0xB821), "waits");
    EXPECT_EQ(taken(nrSegment(7, {0x02}, version), 0xB821), "<000102>");
  }
}

TEST_F(AirMessageSegments, SixPartsComeBeforeTheLast) {
  for (std::uint8_t segment = 1; segment <= 6; ++segment)
    EXPECT_EQ(taken(lteSegment(segment, {segment})), "waits");
  EXPECT_EQ(taken(lteSegment(7, {7})), "<01020304050607>");
}

TEST_F(AirMessageSegments, AJoinedMessageHasTheNameOfItsFirstBytes) {
  const Bytes first = lteSegment(1, {0x28}), last = lteSegment(7, {0x55});
  reader.read(Packet(first), 0xB0C0);
  const AirMessageReading reading = reader.read(Packet(last), 0xB0C0);
  ASSERT_TRUE(reading.message);
  EXPECT_EQ(reading.message->name, "RRCConnectionRelease");
  EXPECT_EQ(reading.message->channelNumber, 1300U);
  EXPECT_EQ(reading.message->physicalCell, 5U);
}

TEST_F(AirMessageSegments, APartOutOfOrderAbandonsTheMessage) {
  EXPECT_EQ(taken(lteSegment(1, {0x20})), "waits");
  EXPECT_NE(taken(lteSegment(3, {0x03})).front(), '<');
  EXPECT_NE(taken(lteSegment(7, {0x07})).front(), '<');
  EXPECT_EQ(taken(lteSegment(1, {0x28})), "waits");
  EXPECT_EQ(taken(lteSegment(7, {0x02})), "<2802>");
}

TEST_F(AirMessageSegments, APartThatComesTwiceAbandonsTheMessage) {
  EXPECT_EQ(taken(lteSegment(1, {0x20})), "waits");
  EXPECT_EQ(taken(lteSegment(2, {0x02})), "waits");
  EXPECT_NE(taken(lteSegment(2, {0x02})).front(), '<');
  EXPECT_NE(taken(lteSegment(7, {0x07})).front(), '<');
}

TEST_F(AirMessageSegments, APartWithoutABeginningYieldsNothing) {
  EXPECT_NE(taken(lteSegment(7, {0x07})).front(), '<');
  EXPECT_NE(taken(lteSegment(2, {0x02})).front(), '<');
  EXPECT_NE(taken(lteSegment(7, {0x07})).front(), '<');
}

TEST_F(AirMessageSegments, ANewBeginningAbandonsTheMessageBeforeIt) {
  EXPECT_EQ(taken(lteSegment(1, {0x20})), "waits");
  EXPECT_EQ(taken(lteSegment(2, {0x02})), "waits");
  EXPECT_EQ(taken(lteSegment(1, {0x28})), "waits");
  EXPECT_EQ(taken(lteSegment(7, {0x08})), "<2808>");
}

TEST_F(AirMessageSegments, APartOfAnotherChannelDoesNotComplete) {
  EXPECT_EQ(taken(lteSegment(1, {0x20}, 9)), "waits");
  EXPECT_NE(taken(lteSegment(7, {0x08}, 11)), "<2008>");
}

TEST_F(AirMessageSegments, ThePartsOfTwoRadiosDoNotMix) {
  EXPECT_EQ(taken(lteSegment(1, {0x20})), "waits");
  EXPECT_EQ(taken(nrSegment(1, {0x00}, 26), 0xB821), "waits");
  EXPECT_EQ(taken(lteSegment(7, {0x01})), "<2001>");
  EXPECT_EQ(taken(nrSegment(7, {0x02}, 26), 0xB821), "<0002>");
}

TEST_F(AirMessageSegments, OtherPacketsDoNotDisturbTheParts) {
  EXPECT_EQ(taken(lteSegment(1, {0x20})), "waits");
  EXPECT_EQ(taken(lteNAS(0xB0EC, {0x07, 0x42}), 0xB0EC), "<0742>");
  EXPECT_EQ(taken(lteSegment(7, {0x01})), "<2001>");
}

// A part has at most 65,535 bytes, and a message at most 65,536.
TEST_F(AirMessageSegments, AMessageThatGetsTooLongIsAbandoned) {
  EXPECT_EQ(taken(lteSegment(1, Bytes(60000, 0x20))), "waits");
  EXPECT_NE(taken(lteSegment(2, Bytes(6000, 0x20))).front(), '<');
  EXPECT_NE(taken(lteSegment(7, {0x07})).front(), '<');
  EXPECT_EQ(taken(lteSegment(0, {0x20, 0x01})), "<2001>");
}

TEST_F(AirMessageSegments, TheLongestMessageIsJoined) {
  EXPECT_EQ(taken(lteSegment(1, Bytes(60000, 0x20))), "waits");
  const Bytes last = lteSegment(7, Bytes(5536, 0x20));
  const AirMessageReading reading = reader.read(Packet(last), 0xB0C0);
  ASSERT_TRUE(reading.message);
  EXPECT_EQ(reading.message->bytes.size(), 65536U);
}

TEST_F(AirMessageSegments, AByteBehindTheLastPartIsBroken) {
  Bytes packet = lteSegment(7, {0x01, 0x02});
  packet.push_back(0);
  EXPECT_EQ(taken(packet), "not decoded");
}

// 0xB821

namespace {

std::uint8_t nrDownlinkDedicated(unsigned version) { return version == 8 ? 8 : 4; }

}  // namespace

TEST(AirMessageLayouts, EachFieldOfEachVersionOfNRStandsByItself) {
  for (const RRCHeader& header : nrRRCHeaders) {
    SCOPED_TRACE(header.version);
    const auto packet = [&] {
      RRCPacket result(0xB821, header);
      result.channel(nrDownlinkDedicated(header.version)).message({0x00, 0x11, 0x22});
      return result;
    };
    const ReadMessage first = read(packet().cell(0x0321).channelNumber(0x0007B49E).packet(), 0xB821);
    EXPECT_EQ(first.radio, AirMessage::Radio::NR);
    EXPECT_EQ(first.protocol, AirMessage::Protocol::RRC);
    EXPECT_EQ(first.name, header.version == 8 ? "MeasurementReport" : "RRCReconfiguration");
    EXPECT_EQ(first.channel, header.version == 8 ? "UL-DCCH" : "DL-DCCH");
    EXPECT_EQ(described(first.bytes), "<001122>");
    EXPECT_EQ(place(first), "channel 504990, cell 801, frame absent");
    EXPECT_EQ(place(read(packet().cell(0).channelNumber(0x00012345).packet(), 0xB821)),
              "channel 74565, cell 0, frame absent");
    EXPECT_EQ(text(read(packet().cell(1).channelNumber(0).packet(), 0xB821).physicalCell), "1");
  }
}

TEST(AirMessageLayouts, NoCellAndNoChannelOfNRAreNotTold) {
  for (const RRCHeader& header : nrRRCHeaders) {
    EXPECT_EQ(place(read(RRCPacket(0xB821, header)
                             .channel(nrDownlinkDedicated(header.version))
                             .message({0x00, 0x11})
                             .packet(),
                         0xB821)),
              "channel absent, cell absent, frame absent")
        << header.version;
  }
}

// Versions 8 and 9: the frame in the bits 16 to 25, the subframe in the bits 3 to 6.
TEST(AirMessageLayouts, EarlyVersionsOfNRTellTheFrame) {
  for (const unsigned version : {8U, 9U}) {
    const ReadMessage message = read(nrRRC(version)
                                         .channel(1)
                                         .cell(1)
                                         .channelNumber(1)
                                         .number(13, 0x02AB0038, 4)
                                         .message({0, 0, 0, 0})
                                         .packet(),
                                     0xB821);
    EXPECT_EQ(text(message.frame), "683");
    EXPECT_EQ(text(message.subframe), "7");
    // All other bits.
    const ReadMessage others = read(nrRRC(version)
                                        .channel(1)
                                        .cell(1)
                                        .channelNumber(1)
                                        .number(13, 0xFEAAFFBF, 4)
                                        .message({0, 0, 0, 0})
                                        .packet(),
                                    0xB821);
    EXPECT_EQ(text(others.frame), "682");
    EXPECT_EQ(text(others.subframe), "7");
  }
}

TEST(AirMessageLayouts, LaterVersionsOfNRDoNotTellTheFrame) {
  for (const RRCHeader& header : nrRRCHeaders) {
    if (header.version <= 9) continue;
    const ReadMessage message = read(RRCPacket(0xB821, header)
                                         .channel(1)
                                         .cell(1)
                                         .channelNumber(1)
                                         .number(header.frameAt, 0xFFFFFF, 3)
                                         .message({0, 0, 0, 0})
                                         .packet(),
                                     0xB821);
    EXPECT_EQ(text(message.frame), "absent") << header.version;
  }
}

TEST(AirMessageLayouts, WhatNoFieldOfNRHoldsChangesNothing) {
  for (const RRCHeader& header : nrRRCHeaders) {
    SCOPED_TRACE(header.version);
    const Bytes plain = RRCPacket(0xB821, header)
                            .channel(nrDownlinkDedicated(header.version))
                            .cell(77)
                            .channelNumber(504990)
                            .message({0x00, 0x11})
                            .packet();
    for (unsigned offset = 4; offset < header.size; ++offset) {
      const auto isIn = [offset](unsigned first, unsigned width) {
        return offset >= first && offset < first + width;
      };
      if (isIn(header.cellAt, 2) || isIn(header.channelNumberAt, 4) || isIn(header.channelAt, 1) ||
          isIn(header.lengthAt, 2) || (header.segmentAt != 0 && isIn(header.segmentAt, 1))) {
        continue;
      }
      Bytes changed = plain;
      changed.at(Packet::headerSize + offset) = 0xFF;
      const ReadMessage message = read(changed, 0xB821);
      EXPECT_EQ(text(message.channelNumber) + " " + text(message.physicalCell), "504990 77") << offset;
      EXPECT_EQ(described(message.bytes), "<0011>") << offset;
    }
  }
}

TEST(AirMessageLayouts, EveryTruncationOfEachVersionOfNRIsBroken) {
  for (const RRCHeader& header : nrRRCHeaders) {
    SCOPED_TRACE(header.version);
    expectEveryTruncationBroken(RRCPacket(0xB821, header)
                                    .channel(nrDownlinkDedicated(header.version))
                                    .message({0x00, 0x11, 0x22})
                                    .packet(),
                                0xB821);
  }
}

TEST(AirMessageLayouts, ALengthOfNRThatDisagreesIsBroken) {
  for (const RRCHeader& header : nrRRCHeaders) {
    SCOPED_TRACE(header.version);
    for (const std::uint32_t length : {0U, 1U, 2U, 4U, 0x103U, 0xFFFFU}) {
      expectBroken(RRCPacket(0xB821, header)
                       .channel(nrDownlinkDedicated(header.version))
                       .message({0x00, 0x11, 0x22})
                       .number(header.lengthAt, length, 2)
                       .packet(),
                   0xB821);
    }
  }
}

TEST(AirMessageLayouts, OtherVersionsOfNRAreUnknown) {
  for (const std::uint32_t version : {0U, 1U, 6U, 10U, 11U, 13U, 15U, 16U, 18U, 21U, 22U, 27U, 29U, 255U,
                                      0x108U, 0x10008U, 0x1A0000U, 0xFFFFFFFFU}) {
    SCOPED_TRACE(version);
    expectUnknownVersion(PacketBuilder(0xB821, 80).u32(13, version).bytes(), 0xB821, version);
    expectUnknownVersion(PacketBuilder(0xB821, 17).u32(13, version).bytes(), 0xB821, version);
  }
}

TEST(AirMessageLayouts, EachNumberingOfTheChannelsOfNR) {
  const std::string_view reconfiguration = "RRCReconfiguration", complete = "RRCReconfigurationComplete",
                         bearers = "RadioBearerConfig";
  const std::initializer_list<Numbered> of8 = {
      {1, "BCCH-BCH Downlink"}, {8, "UL-DCCH Uplink"}, {9, reconfiguration}, {10, complete}, {26, bearers}};
  const std::initializer_list<Numbered> of9 = {{1, "BCCH-BCH Downlink"}, {2, "BCCH-DL-SCH Downlink"},
                                               {3, "DL-CCCH Downlink"},  {4, "DL-DCCH Downlink"},
                                               {5, "PCCH Downlink"},     {6, "UL-CCCH Uplink"},
                                               {7, "UL-CCCH1 Uplink"},   {8, "UL-DCCH Uplink"},
                                               {9, reconfiguration},     {10, complete}};
  const std::initializer_list<Numbered> of20 = {{1, "BCCH-BCH Downlink"}, {2, "BCCH-DL-SCH Downlink"},
                                                {3, "DL-CCCH Downlink"},  {4, "DL-DCCH Downlink"},
                                                {5, "MCCH Downlink"},     {6, "PCCH Downlink"},
                                                {7, "UL-CCCH Uplink"},    {8, "UL-CCCH1 Uplink"},
                                                {9, "UL-DCCH Uplink"},    {36, bearers}};
  const auto expectNumbers = [](std::initializer_list<unsigned> versions,
                                std::initializer_list<Numbered> numbers) {
    for (const unsigned version : versions) {
      for (const Numbered& numbered : numbers) {
        EXPECT_EQ(channelOf(nrRRC(version).channel(numbered.number).message({0, 0, 0, 0}).packet(), 0xB821),
                  numbered.channel)
            << version << " " << unsigned{numbered.number};
      }
    }
  };
  expectNumbers({8}, of8);
  expectNumbers({9, 12, 14, 17, 19, 25}, of9);
  expectNumbers({9, 12}, {{25, bearers}, {28, "UE-MRDC-Capability"}, {29, "UE-NR-Capability"}});
  expectNumbers(
      {14}, {{28, bearers}, {31, "UE-MRDC-Capability"}, {32, "UE-NR-Capability"}, {33, "UE-NR-Capability"}});
  expectNumbers({17, 19, 25}, {{29, bearers}});
  expectNumbers({20, 23, 24, 26, 28}, of20);
  expectNumbers({20, 23, 24}, {{10, reconfiguration}, {11, complete}});
  expectNumbers({26, 28}, {{11, reconfiguration}, {12, complete}});
  expectNumbers({28}, {{10, "UL-DCCH Uplink"}});
}

TEST(AirMessageLayouts, BareTypesOfNRHaveNoChannel) {
  const ReadMessage message = read(nrRRC(8).channel(9).message({0x08, 0x11}).packet(), 0xB821);
  EXPECT_EQ(message.channel, "");
  EXPECT_EQ(message.direction, AirMessage::Direction::Downlink);
  EXPECT_EQ(read(nrRRC(8).channel(10).message({0x08, 0x11}).packet(), 0xB821).direction,
            AirMessage::Direction::Uplink);
}

// NAS messages

TEST(AirMessageLayouts, NASMessagesOfLTEAreFromTheNetworkUnderEvenCodes) {
  for (const std::uint32_t logCode :
       {0xB0E0U, 0xB0E2U, 0xB0EAU, 0xB0ECU, 0xB0E1U, 0xB0E3U, 0xB0EBU, 0xB0EDU}) {
    SCOPED_TRACE(logCode);
    const bool isSession = logCode < 0xB0EA;
    const Bytes packet = lteNAS(logCode, isSession ? Bytes{0x52, 0x01, 0xC1, 0x09} : Bytes{0x07, 0x42, 0x09});
    const ReadMessage message = read(packet, logCode);
    EXPECT_EQ(message.radio, AirMessage::Radio::LTE);
    EXPECT_EQ(message.protocol, AirMessage::Protocol::NAS);
    EXPECT_EQ(message.direction,
              logCode % 2 == 0 ? AirMessage::Direction::Downlink : AirMessage::Direction::Uplink);
    EXPECT_EQ(message.channel, "");
    EXPECT_EQ(message.name, isSession ? "Activate default EPS bearer context request" : "Attach accept");
    EXPECT_EQ(described(message.bytes), isSession ? "<5201c109>" : "<074209>");
    EXPECT_EQ(place(message), "channel absent, cell absent, frame absent");
    AirMessageReader reader;
    EXPECT_EQ(reader.read(Packet(packet), logCode).version, PacketVersion{1});
  }
}

TEST(AirMessageLayouts, OtherVersionsOfNASMessagesAreUnknown) {
  for (const std::uint32_t logCode :
       {0xB0E0U, 0xB0E1U, 0xB0E2U, 0xB0E3U, 0xB0EAU, 0xB0EBU, 0xB0ECU, 0xB0EDU}) {
    for (const unsigned version : {0U, 2U, 255U}) {
      expectUnknownVersion(containerOf(logCode, {version, 9, 5, 0}, {0x07, 0x42}), logCode, version);
    }
  }
  for (const std::uint32_t logCode : {0xB800U, 0xB801U, 0xB808U, 0xB809U, 0xB80AU, 0xB80BU, 0xB814U}) {
    expectUnknownVersion(containerOf(logCode, {2, 0, 0, 0, 15, 4, 0}, {0x7E, 0, 0x42}), logCode, 2);
    expectUnknownVersion(containerOf(logCode, {1, 0, 1, 0, 15, 4, 0}, {0x7E, 0, 0x42}), logCode, 0x10001);
  }
}

TEST(AirMessageLayouts, NASMessagesOfNRAreFromTheNetworkUnderTheirCodes) {
  const struct {
    std::uint32_t logCode;
    std::string_view direction;
  } codes[] = {{0xB800, "Downlink"}, {0xB801, "Uplink"},   {0xB808, "Downlink"},
               {0xB809, "Uplink"},   {0xB80A, "Downlink"}, {0xB80B, "Uplink"}};
  for (const auto& code : codes) {
    SCOPED_TRACE(code.logCode);
    const bool isSession = code.logCode < 0xB808;
    const ReadMessage message =
        read(nrNAS(code.logCode, isSession ? Bytes{0x2E, 0x05, 0x01, 0xC2} : Bytes{0x7E, 0x00, 0x42}),
             code.logCode);
    EXPECT_EQ(message.radio, AirMessage::Radio::NR);
    EXPECT_EQ(message.protocol, AirMessage::Protocol::NAS);
    EXPECT_EQ(nameOf(message.direction), code.direction);
    EXPECT_EQ(message.channel, "");
    EXPECT_EQ(message.name, isSession ? "PDU session establishment accept" : "Registration accept");
    EXPECT_EQ(described(message.bytes), isSession ? "<2e0501c2>" : "<7e0042>");
  }
  EXPECT_EQ(read(nrNAS(0xB814, {0x7E, 0x00, 0x4C, 0x10}), 0xB814).name, "Service request");
}

TEST(AirMessageLayouts, ANASPacketWithoutItsHeaderIsBroken) {
  for (std::size_t size = 0; size < 17; ++size) {
    Bytes packet = lteNAS(0xB0EC, {0x07, 0x42});
    packet.resize(size);
    expectBroken(packet, 0xB0EC);
  }
  for (std::size_t size = 0; size < 20; ++size) {
    Bytes packet = nrNAS(0xB80A, {0x7E, 0x00, 0x42});
    packet.resize(size);
    expectBroken(packet, 0xB80A);
  }
}

TEST(AirMessageLayouts, ANASMessageWithoutATypeIsUnknown) {
  EXPECT_EQ(read(lteNAS(0xB0EC, {0x07}), 0xB0EC).name, "Unknown");
  EXPECT_EQ(read(nrNAS(0xB80A, {0x7E}), 0xB80A).name, "Unknown");
  EXPECT_EQ(read(nrNAS(0xB800, {0x2E}), 0xB800).name, "Unknown");
}

// 0x512F, 0x5B2F

TEST(AirMessageLayouts, MessagesOfGSMTellTheirChannelAndDirection) {
  constexpr std::string_view channels[] = {"DCCH", "BCCH", "RACH", "CCCH", "SACCH", "SDCCH", "FACCH"};
  for (unsigned number = 0; number < 7; ++number) {
    for (const unsigned downlink : {0x00U, 0x80U}) {
      const ReadMessage message = read(gsmRR(downlink | number, 0x0D, {0x06, 0x0D, 0x00}), 0x512F);
      EXPECT_EQ(message.radio, AirMessage::Radio::GSM);
      EXPECT_EQ(message.protocol, AirMessage::Protocol::RR);
      EXPECT_EQ(message.channel.substr(0, channels[number].size()), channels[number]);
      EXPECT_EQ(nameOf(message.direction), downlink != 0 ? "Downlink" : "Uplink");
      // A channel request has no message type (TS 44.018 9.1.8).
      EXPECT_EQ(message.name, number == 2 ? "Channel Request" : "Channel Release");
      EXPECT_EQ(described(message.bytes), "<060d00>");
      EXPECT_EQ(place(message), "channel absent, cell absent, frame absent");
    }
  }
}

TEST(AirMessageLayouts, MessagesOfGSMBroadcastAndCommonChannelsHaveAPseudoLength) {
  for (const unsigned number : {1U, 3U}) {
    const ReadMessage message = read(gsmRR(0x80 | number, 0x1B, {0x49, 0x06, 0x1B, 0x00}), 0x512F);
    EXPECT_EQ(message.name, "System Information Type 3");
    EXPECT_EQ(unsigned{message.layer2Octets}, 1U);
    EXPECT_EQ(message.bytes.size(), 4U);
  }
  for (const unsigned number : {0U, 5U, 6U}) {
    EXPECT_EQ(unsigned{read(gsmRR(0x80 | number, 0x0D, {0x06, 0x0D}), 0x512F).layer2Octets}, 0U);
  }
}

TEST(AirMessageLayouts, ASubscriptionComesBeforeAMessageOfGSM) {
  for (const unsigned subscription : {0U, 1U, 2U}) {
    const ReadMessage message =
        read(containerOf(0x5B2F, {subscription, 0x80, 0x0D, 3}, {0x06, 0x0D, 0x00}), 0x5B2F);
    EXPECT_EQ(message.name, "Channel Release");
    EXPECT_EQ(message.channel, "DCCH");
    EXPECT_EQ(described(message.bytes), "<060d00>");
  }
}

TEST(AirMessageLayouts, EveryTruncationOfAMessageOfGSMIsBroken) {
  expectEveryTruncationBroken(gsmRR(0x80, 0x0D, {0x06, 0x0D, 0x00}), 0x512F);
  expectEveryTruncationBroken(containerOf(0x5B2F, {1, 0x80, 0x0D, 3}, {0x06, 0x0D, 0x00}), 0x5B2F);
  expectBroken(containerOf(0x512F, {0x80, 0x0D, 2}, {0x06, 0x0D, 0x00}), 0x512F);
  expectBroken(containerOf(0x5B2F, {1, 0x80, 0x0D, 4}, {0x06, 0x0D, 0x00}), 0x5B2F);
}

// 0x713A, 0x7B3A

TEST(AirMessageLayouts, NASMessagesOfGSMTellTheirDirection) {
  const ReadMessage down = read(circuitNAS(0, {0x05, 0x02, 0x62}), 0x713A);
  EXPECT_EQ(down.radio, AirMessage::Radio::GSM);
  EXPECT_EQ(down.protocol, AirMessage::Protocol::NAS);
  EXPECT_EQ(down.direction, AirMessage::Direction::Downlink);
  EXPECT_EQ(down.name, "Location Updating Accept");
  EXPECT_EQ(down.channel, "");
  EXPECT_EQ(described(down.bytes), "<050262>");
  EXPECT_EQ(read(circuitNAS(1, {0x05, 0x08}), 0x713A).direction, AirMessage::Direction::Uplink);
  const ReadMessage second = read(containerOf(0x7B3A, {1, 0, 3, 0, 0, 0}, {0x05, 0x02, 0x62}), 0x7B3A);
  EXPECT_EQ(second.direction, AirMessage::Direction::Downlink);
  EXPECT_EQ(described(second.bytes), "<050262>");
  EXPECT_EQ(read(containerOf(0x7B3A, {0, 1, 2, 0, 0, 0}, {0x05, 0x08}), 0x7B3A).direction,
            AirMessage::Direction::Uplink);
}

TEST(AirMessageLayouts, EveryTruncationOfANASMessageOfGSMIsBroken) {
  expectEveryTruncationBroken(circuitNAS(0, {0x05, 0x02, 0x62}), 0x713A);
  expectEveryTruncationBroken(containerOf(0x7B3A, {1, 0, 3, 0, 0, 0}, {0x05, 0x02, 0x62}), 0x7B3A);
  // The length has four bytes.
  for (const unsigned at : {1U, 2U, 3U, 4U}) {
    Bytes packet = circuitNAS(0, {0x05, 0x02, 0x62});
    ++packet.at(Packet::headerSize + at);
    expectBroken(packet, 0x713A);
  }
}

TEST(AirMessageLayouts, ANASMessageIsOfTheRadioThatSpokeLast) {
  AirMessageReader reader;
  const auto radioOf = [&](const Bytes& packet, std::uint32_t logCode) {
    const AirMessageReading reading = reader.read(Packet(packet), logCode);
    return reading.message ? std::string(nameOf(reading.message->radio)) : "no message";
  };
  const Bytes nas = circuitNAS(0, {0x05, 0x02});
  EXPECT_EQ(radioOf(nas, 0x713A), "GSM");
  EXPECT_EQ(radioOf(umtsRRC(6, {0x40, 0, 0}), 0x412F), "UMTS");
  EXPECT_EQ(radioOf(nas, 0x713A), "UMTS");
  EXPECT_EQ(radioOf(gsmRR(0x80, 0x0D, {0x06, 0x0D}), 0x512F), "GSM");
  EXPECT_EQ(radioOf(nas, 0x713A), "GSM");
}

// 0x412F

TEST(AirMessageLayouts, EachChannelOfUMTS) {
  constexpr Numbered channels[] = {
      {0, "UL-CCCH Uplink"},   {1, "UL-DCCH Uplink"},    {2, "DL-CCCH Downlink"},
      {3, "DL-DCCH Downlink"}, {4, "BCCH-BCH Downlink"}, {5, "BCCH-FACH Downlink"},
      {6, "PCCH Downlink"},    {7, "MCCH Downlink"},     {8, "MSCH Downlink"}};
  for (const Numbered& numbered : channels) {
    const ReadMessage message = read(umtsRRC(numbered.number, {0, 0x11, 0x22}), 0x412F);
    EXPECT_EQ(message.radio, AirMessage::Radio::UMTS);
    EXPECT_EQ(message.protocol, AirMessage::Protocol::RRC);
    EXPECT_EQ(std::string(message.channel) + " " + std::string(nameOf(message.direction)), numbered.channel);
    EXPECT_EQ(described(message.bytes), "<001122>");
    EXPECT_EQ(place(message), "channel absent, cell absent, frame absent");

    const ReadMessage withCell =
        read(umtsRRCWithCell(numbered.number | 0x80U, 10638, 291, {0, 0x11, 0x22}), 0x412F);
    EXPECT_EQ(std::string(withCell.channel) + " " + std::string(nameOf(withCell.direction)),
              numbered.channel);
    EXPECT_EQ(withCell.name, message.name);
    EXPECT_EQ(described(withCell.bytes), "<001122>");
    EXPECT_EQ(place(withCell), "channel 10638, cell 291, frame absent");
  }
}

TEST(AirMessageLayouts, TheSystemInformationContainerOfUMTSComesDown) {
  EXPECT_EQ(read(umtsRRC(10, {0, 0x11}), 0x412F).direction, AirMessage::Direction::Downlink);
  EXPECT_EQ(read(umtsRRCWithCell(0x8A, 10638, 291, {0, 0x11}), 0x412F).physicalCell, 291U);
}

TEST(AirMessageLayouts, ASystemInformationBlockBeginsBehindItsType) {
  for (const unsigned channel : {0x09U, 0xFEU, 0xFFU}) {
    const ReadMessage message = read(umtsRRC(channel, {5, 0x11, 0x22}), 0x412F);
    EXPECT_EQ(message.name, "SysInfoType5");
    EXPECT_EQ(message.direction, AirMessage::Direction::Downlink);
    EXPECT_EQ(described(message.bytes), "<1122>");
  }
  for (const unsigned channel : {0x89U, 0xF0U}) {
    const ReadMessage message = read(umtsBlockWithCell(channel, 10638, 291, 5, {0x11, 0x22}), 0x412F);
    EXPECT_EQ(message.name, "SysInfoType5");
    EXPECT_EQ(described(message.bytes), "<1122>");
    EXPECT_EQ(place(message), "channel 10638, cell 291, frame absent");
  }
}

TEST(AirMessageLayouts, EveryTruncationOfAMessageOfUMTSIsBroken) {
  expectEveryTruncationBroken(umtsRRC(3, {0, 0x11, 0x22}), 0x412F);
  expectEveryTruncationBroken(umtsRRCWithCell(0x83, 10638, 291, {0, 0x11, 0x22}), 0x412F);
  expectEveryTruncationBroken(umtsRRC(9, {5, 0x11, 0x22}), 0x412F);
  expectEveryTruncationBroken(umtsBlockWithCell(0xF0, 10638, 291, 5, {0x11, 0x22}), 0x412F);
}

TEST(AirMessageLayouts, EveryLogCodeOfAMessageIsListed) {
  const auto codes = airMessageLogCodes();
  for (const std::uint32_t logCode :
       {0xB0C0U, 0xB0E0U, 0xB0E1U, 0xB0E2U, 0xB0E3U, 0xB0EAU, 0xB0EBU, 0xB0ECU, 0xB0EDU, 0xB821U, 0xB800U,
        0xB801U, 0xB808U, 0xB809U, 0xB80AU, 0xB80BU, 0xB814U, 0x412FU, 0x512FU, 0x5B2FU, 0x713AU, 0x7B3AU}) {
    EXPECT_EQ(std::ranges::count(codes, logCode), 1) << logCode;
  }
}

}  // namespace varnel
