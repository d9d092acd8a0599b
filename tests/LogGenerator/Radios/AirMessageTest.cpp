#include "LogGenerator/Radios/AirMessage.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <initializer_list>
#include <string>

#include "tests/support/PacketBuilder.h"

namespace varnel {

namespace {

using Direction = AirMessage::Direction;
using Protocol = AirMessage::Protocol;
using Radio = AirMessage::Radio;
using enum MessageFate::Outcome;

Bytes packetOf(std::uint32_t logCode, std::initializer_list<unsigned> header, ByteView message) {
  Bytes packet = PacketBuilder(logCode, Packet::headerSize + header.size() + message.size()).bytes();
  auto next = std::ranges::transform(header, packet.begin() + Packet::headerSize, [](unsigned byte) {
                return static_cast<std::uint8_t>(byte);
              }).out;
  std::ranges::copy(message, next);
  return packet;
}

// Version 26: cell 411, channel 66536, the frame word, and a message on the channel with this number.
Bytes lteRRC(unsigned channel, const Bytes& message, unsigned frameWord = 0) {
  const auto length = static_cast<unsigned>(message.size());
  return packetOf(0xB0C0,
                  {26,
                   15,
                   0x10,
                   15,
                   2,
                   0,
                   0x9B,
                   0x01,
                   0xE8,
                   0x03,
                   0x01,
                   0x00,
                   frameWord & 0xFF,
                   frameWord >> 8,
                   channel,
                   0,
                   0,
                   0,
                   0,
                   length & 0xFF,
                   length >> 8},
                  message);
}

// Version 30 of a packet with a part of a message on DL-DCCH.
Bytes ltePart(unsigned segment, const Bytes& part, unsigned channel = 9) {
  const auto length = static_cast<unsigned>(part.size());
  return packetOf(0xB0C0, {30,          16, 0, 16,     0,       0, 1, 0, 0x64, 0,
                           0,           0,  0, 0,      channel, 0, 0, 0, 0,    length & 0xFF,
                           length >> 8, 0,  0, segment},
                  part);
}

Bytes lteNAS(std::uint32_t logCode, const Bytes& message) { return packetOf(logCode, {1, 9, 5, 0}, message); }

AirMessageReading readAlone(const Bytes& packet, std::uint32_t logCode) {
  AirMessageReader reader;
  return reader.read(Packet(packet), logCode);
}

std::string nameOfNAS(const Bytes& message) {
  const Bytes packet = lteNAS(0xB0EC, message);
  const auto reading = readAlone(packet, 0xB0EC);
  return reading.message ? std::string(reading.message->name) : "none";
}

}  // namespace

TEST(AirMessageReader, AnRRCMessageOfLTEHasItsCellAndFrame) {
  // Frame 0x2AB = 683, subframe 5, and the two bits above the frame.
  const Bytes packet = lteRRC(9, {0x20, 0x01, 0x02}, 0xC000 | 683U << 4 | 5U);
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
  const Bytes packet = lteRRC(11, {0x20});
  const auto reading = readAlone(packet, 0xB0C0);
  ASSERT_TRUE(reading.message);
  EXPECT_FALSE(reading.message->frame);
  EXPECT_FALSE(reading.message->subframe);
  EXPECT_EQ(reading.message->name, "RRCConnectionSetupComplete");
}

TEST(AirMessageReader, ALengthThatDisagreesIsABrokenPacket) {
  Bytes packet = lteRRC(9, {0x20, 0x01});
  for (const unsigned length : {0U, 1U, 3U, 0x102U}) {
    packet.at(32) = static_cast<std::uint8_t>(length);
    packet.at(33) = static_cast<std::uint8_t>(length >> 8);
    EXPECT_EQ(readAlone(packet, 0xB0C0).fate, (MessageFate{TooShort, 0xB0C0})) << length;
    EXPECT_EQ(AirMessageReader::fateOf(Packet(packet), 0xB0C0), (MessageFate{TooShort, 0xB0C0})) << length;
  }
}

TEST(AirMessageReader, EveryTruncationIsABrokenPacket) {
  const Bytes packet = lteRRC(9, {0x20, 0x01});
  for (std::size_t size = 0; size < packet.size(); ++size) {
    const auto reading = readAlone(Bytes(packet.data(), packet.data() + size), 0xB0C0);
    EXPECT_EQ(reading.fate.outcome, TooShort) << size;
    EXPECT_FALSE(reading.message) << size;
  }
}

TEST(AirMessageReader, AVersionThatIsNotListedIsNotKnown) {
  for (const unsigned version : {0U, 1U, 28U, 32U, 255U}) {
    Bytes packet = lteRRC(9, {0x20});
    packet.at(13) = static_cast<std::uint8_t>(version);
    EXPECT_EQ(readAlone(packet, 0xB0C0).fate, (MessageFate{UnknownVersion, 0xB0C0, PacketVersion{version}}));
  }
}

TEST(AirMessageReader, PartsAreJoinedInTheirOrder) {
  AirMessageReader reader;
  const Bytes first = ltePart(1, {0x20, 0x01}), second = ltePart(2, {0x02}), last = ltePart(7, {0x03, 0x04});
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
  const Bytes first = ltePart(1, {0x20}), third = ltePart(3, {0x02}), last = ltePart(7, {0x03});
  reader.read(Packet(first), 0xB0C0);
  reader.read(Packet(third), 0xB0C0);
  EXPECT_FALSE(reader.read(Packet(last), 0xB0C0).message);
}

TEST(AirMessageReader, PartsOfAnotherChannelDoNotBelongToAMessage) {
  AirMessageReader reader;
  const Bytes first = ltePart(1, {0x20}), other = ltePart(7, {0x02}, 11);
  reader.read(Packet(first), 0xB0C0);
  EXPECT_FALSE(reader.read(Packet(other), 0xB0C0).message);
}

TEST(AirMessageReader, AMessageOfMoreThan64KiBIsDropped) {
  AirMessageReader reader;
  const Bytes first = ltePart(1, Bytes(40000, 0x20)), last = ltePart(7, Bytes(25537, 0x20)),
              fitting = ltePart(7, Bytes(25536, 0x20));
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
  EXPECT_EQ(nameOfNAS({0x95, 0x13}), "Security Protected (ciphered)");
  EXPECT_EQ(nameOfNAS({0x07, 0x40}), "Unknown");
  EXPECT_EQ(nameOfNAS({0x07}), "Unknown");
  EXPECT_EQ(nameOfNAS({}), "none");
}

TEST(AirMessageReader, TheCodeOfANASMessageTellsItsDirection) {
  EXPECT_EQ(readAlone(lteNAS(0xB0E3, {0x02, 1, 0xD0}), 0xB0E3).message->direction, Direction::Uplink);
  EXPECT_EQ(readAlone(lteNAS(0xB0E2, {0x02, 1, 0xD1}), 0xB0E2).message->direction, Direction::Downlink);
}

TEST(AirMessageReader, AnotherVersionOfANASPacketIsNotKnown) {
  const Bytes packet = packetOf(0xB0EC, {2, 9, 5, 0}, Bytes{0x07, 0x41});
  EXPECT_EQ(readAlone(packet, 0xB0EC).fate, (MessageFate{UnknownVersion, 0xB0EC, PacketVersion{2}}));
}

}  // namespace varnel
