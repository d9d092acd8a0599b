#include "LogGenerator/Radios/AirMessage.h"

#include <gtest/gtest.h>

#include <string>

#include "tests/support/AirMessages.h"

namespace varnel {

namespace {

using Direction = AirMessage::Direction;
using Protocol = AirMessage::Protocol;
using Radio = AirMessage::Radio;
using enum MessageFate::Outcome;

AirMessageReading readAlone(const Bytes& packet, std::uint32_t logCode) {
  AirMessageReader reader;
  return reader.read(Packet(packet), logCode);
}

std::string nameOfNAS(const Bytes& message) {
  const Bytes packet = lteNASPacket(0xB0EC, message);
  const auto reading = readAlone(packet, 0xB0EC);
  return reading.message ? std::string(reading.message->name) : "none";
}

}  // namespace

TEST(AirMessageReader, AnRRCMessageOfLTEHasItsCellAndFrame) {
  // Frame 0x2AB = 683, subframe 5, and the two bits above the frame.
  const Bytes packet = lteRRCPacket(9, {0x20, 0x01, 0x02}, 0xC000 | 683U << 4 | 5U);
  const auto reading = readAlone(packet, 0xB0C0);
  EXPECT_EQ(reading.fate, (MessageFate{Decoded, 0xB0C0}));
  EXPECT_EQ(reading.version, PacketVersion{26});
  ASSERT_TRUE(reading.message);
  const AirMessage& message = *reading.message;
  EXPECT_EQ(message.radio, Radio::LTE);
  EXPECT_EQ(message.protocol, Protocol::RRC);
  EXPECT_EQ(message.direction, Direction::Downlink);
  EXPECT_EQ(message.channel, "DL-DCCH");
  EXPECT_EQ(message.name, "RRCConnectionReconfiguration");
  EXPECT_EQ(message.channelNumber, 66536U);
  EXPECT_EQ(message.physicalCell, 411);
  EXPECT_EQ(message.frame, 683);
  EXPECT_EQ(message.subframe, 5);
  EXPECT_EQ(Bytes(message.bytes.begin(), message.bytes.end()), (Bytes{0x20, 0x01, 0x02}));
}

TEST(AirMessageReader, AFrameWordOf0IsNoFrame) {
  const Bytes packet = lteRRCPacket(11, {0x20});
  const auto reading = readAlone(packet, 0xB0C0);
  ASSERT_TRUE(reading.message);
  EXPECT_FALSE(reading.message->frame);
  EXPECT_FALSE(reading.message->subframe);
  EXPECT_EQ(reading.message->name, "RRCConnectionSetupComplete");
}

TEST(AirMessageReader, ALengthThatDisagreesIsABrokenPacket) {
  Bytes packet = lteRRCPacket(9, {0x20, 0x01});
  for (const unsigned length : {0U, 1U, 3U, 0x102U}) {
    packet.at(32) = static_cast<std::uint8_t>(length);
    packet.at(33) = static_cast<std::uint8_t>(length >> 8);
    EXPECT_EQ(readAlone(packet, 0xB0C0).fate, (MessageFate{TooShort, 0xB0C0})) << length;
    EXPECT_EQ(AirMessageReader::fateOf(Packet(packet), 0xB0C0), (MessageFate{TooShort, 0xB0C0})) << length;
  }
}

TEST(AirMessageReader, EveryTruncationIsABrokenPacket) {
  const Bytes packet = lteRRCPacket(9, {0x20, 0x01});
  for (std::size_t size = 0; size < packet.size(); ++size) {
    const auto reading = readAlone(Bytes(packet.data(), packet.data() + size), 0xB0C0);
    EXPECT_EQ(reading.fate.outcome, TooShort) << size;
    EXPECT_FALSE(reading.message) << size;
  }
}

TEST(AirMessageReader, AVersionThatIsNotListedIsNotKnown) {
  for (const unsigned version : {0U, 1U, 28U, 32U, 255U}) {
    Bytes packet = lteRRCPacket(9, {0x20});
    packet.at(13) = static_cast<std::uint8_t>(version);
    EXPECT_EQ(readAlone(packet, 0xB0C0).fate, (MessageFate{UnknownVersion, 0xB0C0, PacketVersion{version}}));
  }
}

TEST(AirMessageReader, PartsAreJoinedInTheirOrder) {
  AirMessageReader reader;
  const Bytes first = lteRRCPart(1, {0x20, 0x01}), second = lteRRCPart(2, {0x02}),
              last = lteRRCPart(7, {0x03, 0x04});
  EXPECT_FALSE(reader.read(Packet(first), 0xB0C0).message);
  const auto middle = reader.read(Packet(second), 0xB0C0);
  EXPECT_FALSE(middle.message);
  EXPECT_EQ(middle.fate, (MessageFate{Decoded, 0xB0C0}));
  const auto whole = reader.read(Packet(last), 0xB0C0);
  ASSERT_TRUE(whole.message);
  EXPECT_EQ(Bytes(whole.message->bytes.begin(), whole.message->bytes.end()),
            (Bytes{0x20, 0x01, 0x02, 0x03, 0x04}));
  EXPECT_EQ(whole.message->name, "RRCConnectionReconfiguration");
  EXPECT_FALSE(reader.read(Packet(last), 0xB0C0).message);
}

TEST(AirMessageReader, PartsOutOfOrderAreDropped) {
  AirMessageReader reader;
  const Bytes first = lteRRCPart(1, {0x20}), third = lteRRCPart(3, {0x02}), last = lteRRCPart(7, {0x03});
  reader.read(Packet(first), 0xB0C0);
  reader.read(Packet(third), 0xB0C0);
  EXPECT_FALSE(reader.read(Packet(last), 0xB0C0).message);
}

TEST(AirMessageReader, PartsOfAnotherChannelDoNotBelongToAMessage) {
  AirMessageReader reader;
  const Bytes first = lteRRCPart(1, {0x20}), other = lteRRCPart(7, {0x02}, 11);
  reader.read(Packet(first), 0xB0C0);
  EXPECT_FALSE(reader.read(Packet(other), 0xB0C0).message);
}

TEST(AirMessageReader, AMessageOfMoreThan64KiBIsDropped) {
  AirMessageReader reader;
  const Bytes first = lteRRCPart(1, Bytes(40000, 0x20)), last = lteRRCPart(7, Bytes(25537, 0x20)),
              fitting = lteRRCPart(7, Bytes(25536, 0x20));
  reader.read(Packet(first), 0xB0C0);
  EXPECT_FALSE(reader.read(Packet(last), 0xB0C0).message);
  reader.read(Packet(first), 0xB0C0);
  const auto whole = reader.read(Packet(fitting), 0xB0C0);
  ASSERT_TRUE(whole.message);
  EXPECT_EQ(whole.message->bytes.size(), 65536U);
}

TEST(AirMessageReader, ANASMessageOfLTEIsNamedByItsType) {
  EXPECT_EQ(nameOfNAS({0x07, 0x41}), "Attach request");
  EXPECT_EQ(nameOfNAS({0x52, 0x01, 0xC1}), "Activate default EPS bearer context request");
  EXPECT_EQ(nameOfNAS({0xC7, 0x01, 0x02, 0x03}), "Service request");
  EXPECT_EQ(nameOfNAS({0x17, 1, 2, 3, 4, 5, 0x07, 0x48}), "Tracking area update request");
  EXPECT_EQ(nameOfNAS({0x27, 1, 2, 3, 4, 5, 0x07, 0x48}), "Security Protected (ciphered)");
  EXPECT_EQ(nameOfNAS({0x37, 1, 2, 3, 4, 5, 0x07, 0x5D}), "Security mode command");
  EXPECT_EQ(readAlone(lteNASPacket(0xB0E0, {0x95, 0x13}), 0xB0E0).message->name,
            "Security Protected (ciphered)");
  EXPECT_EQ(nameOfNAS({0x07, 0x40}), "Unknown");
  EXPECT_EQ(nameOfNAS({0x07}), "Unknown");
  EXPECT_EQ(nameOfNAS({}), "none");
}

TEST(AirMessageReader, TheCodeOfANASMessageTellsItsDirection) {
  EXPECT_EQ(readAlone(lteNASPacket(0xB0E3, {0x02, 1, 0xD0}), 0xB0E3).message->direction, Direction::Uplink);
  EXPECT_EQ(readAlone(lteNASPacket(0xB0E2, {0x02, 1, 0xD1}), 0xB0E2).message->direction, Direction::Downlink);
}

TEST(AirMessageReader, AnotherVersionOfANASPacketIsNotKnown) {
  const Bytes packet = packetOfMessage(0xB0EC, {2, 9, 5, 0}, Bytes{0x07, 0x41});
  EXPECT_EQ(readAlone(packet, 0xB0EC).fate, (MessageFate{UnknownVersion, 0xB0EC, PacketVersion{2}}));
}

TEST(AirMessageReader, TheNumbersOfANarrowbandCellAreRead) {
  // Version 5: a channel number of 16 bits, and the length at 15.
  const Bytes packet = packetOfMessage(
      0xB0C0, {5, 13, 0, 1, 0x2C, 0x01, 0x34, 0x12, 0x15, 0x00, 8, 0, 0, 0, 0, 2, 0}, Bytes{0x20, 0x00});
  const auto reading = readAlone(packet, 0xB0C0);
  ASSERT_TRUE(reading.message);
  EXPECT_EQ(reading.message->physicalCell, 300);
  EXPECT_EQ(reading.message->channelNumber, 4660U);
  EXPECT_EQ(reading.message->frame, 1);
  EXPECT_EQ(reading.message->subframe, 5);
  EXPECT_EQ(reading.message->name, "RRCConnectionSetupComplete");
}

TEST(AirMessageReader, AChannelThatIsNotKnownHasAnUnknownMessage) {
  const Bytes packet = lteRRCPacket(200, {0x20});
  const auto reading = readAlone(packet, 0xB0C0);
  ASSERT_TRUE(reading.message);
  EXPECT_EQ(reading.message->channel, "");
  EXPECT_EQ(reading.message->name, "Unknown");
  EXPECT_EQ(reading.message->direction, Direction::Unknown);
}

TEST(AirMessageReader, AnRRCMessageOfNRHasItsCellAndFrame) {
  // Version 8: cell 700, channel 504990 (0x7B49E), frame 683 in bits 16 to 25, subframe 5 in bits 3 to 6.
  const Bytes packet = packetOfMessage(
      0xB821,
      {8, 0, 0, 0, 15, 0x60, 1, 0xBC, 0x02, 0x9E, 0xB4, 0x07, 0x00, 0x28, 0, 0xAB, 0x02, 8, 0, 0, 0, 0, 2, 0},
      Bytes{0x00, 0x01});
  const auto reading = readAlone(packet, 0xB821);
  ASSERT_TRUE(reading.message);
  EXPECT_EQ(reading.version, PacketVersion{8});
  EXPECT_EQ(reading.message->radio, Radio::NR);
  EXPECT_EQ(reading.message->physicalCell, 700);
  EXPECT_EQ(reading.message->channelNumber, 504990U);
  EXPECT_EQ(reading.message->frame, 683);
  EXPECT_EQ(reading.message->subframe, 5);
  EXPECT_EQ(reading.message->channel, "UL-DCCH");
  EXPECT_EQ(reading.message->direction, Direction::Uplink);
  EXPECT_EQ(reading.message->name, "MeasurementReport");
}

TEST(AirMessageReader, BeforeAnNRCellIsAddedTheMessageHasNone) {
  const Bytes packet = packetOfMessage(
      0xB821, {8, 0, 0, 0, 15, 0x60, 1, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 9, 0, 0, 0, 0, 1, 0}, Bytes{0x00});
  const auto reading = readAlone(packet, 0xB821);
  ASSERT_TRUE(reading.message);
  EXPECT_FALSE(reading.message->physicalCell);
  EXPECT_FALSE(reading.message->channelNumber);
  EXPECT_EQ(reading.message->channel, "");
  EXPECT_EQ(reading.message->name, "RRCReconfiguration");
  EXPECT_EQ(reading.message->direction, Direction::Downlink);
}

TEST(AirMessageReader, APacketOfUMTSMayNameItsCell) {
  // UL-CCCH of UARFCN 10638 (0x298E) and scrambling code 291.
  const Bytes packet = packetOfMessage(0x412F, {0x80, 1, 2, 0, 0x8E, 0x29, 0x23, 0x01}, Bytes{0x20, 0x00});
  const auto reading = readAlone(packet, 0x412F);
  ASSERT_TRUE(reading.message);
  EXPECT_EQ(reading.message->radio, Radio::UMTS);
  EXPECT_EQ(reading.message->channel, "UL-CCCH");
  EXPECT_EQ(reading.message->name, "RRCConnectionRequest");
  EXPECT_EQ(reading.message->channelNumber, 10638U);
  EXPECT_EQ(reading.message->physicalCell, 291);
  EXPECT_EQ(reading.message->bytes.size(), 2U);
}

TEST(AirMessageReader, ASystemInformationBlockOfUMTSIsATypeByItself) {
  const Bytes alone = packetOfMessage(0x412F, {9, 0, 2, 0, 5}, Bytes{0x42});
  const auto reading = readAlone(alone, 0x412F);
  ASSERT_TRUE(reading.message);
  EXPECT_EQ(reading.message->channel, "");
  EXPECT_EQ(reading.message->name, "SysInfoType5");
  EXPECT_EQ(reading.message->bytes.size(), 1U);
  const Bytes ofCell = packetOfMessage(0x412F, {0x89, 0, 1, 0, 0x8E, 0x29, 0x23, 0x01, 31}, Bytes{0x42});
  const auto other = readAlone(ofCell, 0x412F);
  ASSERT_TRUE(other.message);
  EXPECT_EQ(other.message->name, "SysInfoType19");
  EXPECT_EQ(other.message->physicalCell, 291);
}

TEST(AirMessageReader, ARRMessageOfTheBCCHBeginsWithItsPseudoLength) {
  const Bytes packet = packetOfMessage(0x512F, {0x81, 0x1B, 4}, Bytes{0x49, 0x06, 0x1B, 0x00});
  const auto reading = readAlone(packet, 0x512F);
  ASSERT_TRUE(reading.message);
  EXPECT_EQ(reading.message->radio, Radio::GSM);
  EXPECT_EQ(reading.message->protocol, Protocol::RR);
  EXPECT_EQ(reading.message->direction, Direction::Downlink);
  EXPECT_EQ(reading.message->channel, "BCCH");
  EXPECT_EQ(reading.message->name, "System Information Type 3");
  EXPECT_EQ(reading.message->bytes.size(), 4U);
  EXPECT_EQ(reading.message->layer2Octets, 1);
  const Bytes dedicated = gsmRRPacket(0x0D);
  const auto release = readAlone(dedicated, 0x512F);
  ASSERT_TRUE(release.message);
  EXPECT_EQ(release.message->name, "Channel Release");
  EXPECT_EQ(release.message->layer2Octets, 0);
}

TEST(AirMessageReader, SystemInformationOnTheSACCHHasAPseudoLengthAndReportsHaveNone) {
  const Bytes information = packetOfMessage(0x512F, {0x84, 0x1D, 3}, Bytes{0x49, 0x06, 0x1D});
  EXPECT_EQ(readAlone(information, 0x512F).message->layer2Octets, 1);
  const Bytes report = packetOfMessage(0x512F, {0x04, 0x15, 3}, Bytes{0x06, 0x15, 0x00});
  EXPECT_EQ(readAlone(report, 0x512F).message->layer2Octets, 0);
}

TEST(AirMessageReader, PacketsWithASubscriptionHaveItInFront) {
  const Bytes rr = packetOfMessage(0x5B2F, {1, 0x80, 0x0D, 2}, Bytes{0x06, 0x0D});
  EXPECT_EQ(readAlone(rr, 0x5B2F).message->name, "Channel Release");
  const Bytes nas = packetOfMessage(0x7B3A, {1, 1, 2, 0, 0, 0}, Bytes{0x05, 0x08});
  const auto reading = readAlone(nas, 0x7B3A);
  EXPECT_EQ(reading.message->name, "Location Updating Request");
  EXPECT_EQ(reading.message->direction, Direction::Uplink);
}

TEST(AirMessageReader, ANASMessageIsOfTheRadioThatSpokeLast) {
  AirMessageReader reader;
  const Bytes nas = packetOfMessage(0x713A, {0, 2, 0, 0, 0}, Bytes{0x05, 0x02});
  EXPECT_EQ(reader.read(Packet(nas), 0x713A).message->radio, Radio::GSM);
  const Bytes umts = packetOfMessage(0x412F, {6, 1, 1, 0}, Bytes{0x00});
  reader.read(Packet(umts), 0x412F);
  EXPECT_EQ(reader.read(Packet(nas), 0x713A).message->radio, Radio::UMTS);
  const Bytes gsm = gsmRRPacket(0x0D);
  reader.read(Packet(gsm), 0x512F);
  EXPECT_EQ(reader.read(Packet(nas), 0x713A).message->radio, Radio::GSM);
}

TEST(AirMessageReader, LongMessagesOfNRComeInPartsToo) {
  AirMessageReader reader;
  const auto part = [](unsigned segment, const Bytes& bytes) {
    const auto length = static_cast<unsigned>(bytes.size());
    return packetOfMessage(0xB821, {26, 0, 0, 0, 16, 0, 1, 5, 0, 0, 0, 0,      0, 0, 0, 0, 0,      100,
                                    0,  0, 0, 0, 0,  0, 4, 0, 0, 0, 0, length, 0, 0, 0, 0, segment},
                           bytes);
  };
  const Bytes first = part(1, {0x10}), last = part(7, {0x22, 0x33});
  EXPECT_FALSE(reader.read(Packet(first), 0xB821).message);
  const auto whole = reader.read(Packet(last), 0xB821);
  ASSERT_TRUE(whole.message);
  EXPECT_EQ(whole.message->name, "RRCRelease");
  EXPECT_EQ(whole.message->bytes.size(), 3U);
  EXPECT_FALSE(whole.message->frame);
}

TEST(AirMessageReader, EachCodeOfTheListIsRead) {
  for (const std::uint32_t code : airMessageLogCodes()) {
    const Bytes empty = PacketBuilder(code, Packet::headerSize).bytes();
    EXPECT_EQ(AirMessageReader::fateOf(Packet(empty), code), (MessageFate{TooShort, code})) << code;
  }
}

}  // namespace varnel
