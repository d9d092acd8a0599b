#include "LogGenerator/LogMessage.h"

#include <gtest/gtest.h>

#include "tests/support/PacketBuilder.h"

namespace varnel {
namespace {

Bytes behindPrefix(Bytes packet) {
  packet.insert(packet.begin(), {0x81, 2});
  return packet;
}

TEST(LogMessage, AMessageShorterThanAHeaderIsNone) {
  EXPECT_FALSE(LogMessage::framed({}));
  EXPECT_FALSE(LogMessage::framed(Bytes(12, 1)));
  EXPECT_TRUE(LogMessage::framed(Bytes(13, 1)));
}

TEST(LogMessage, ThePrefixIsNoPartOfThePacket) {
  const Bytes bytes = behindPrefix(PacketBuilder(0xB17F, 33).u8(13, 7).bytes());
  const auto message = LogMessage::framed(bytes);
  ASSERT_TRUE(message);
  EXPECT_EQ(message->packet().size(), 33u);
  EXPECT_EQ(message->packet().u8(13), 7);
  EXPECT_EQ(message->logCode(), 0xB17Fu);
}

TEST(LogMessage, APacketBehindAPrefixMayLackTwoBytesOfItsHeader) {
  const Bytes bytes = behindPrefix(PacketBuilder(0x1192, 11).bytes());
  const auto message = LogMessage::framed(bytes);
  ASSERT_TRUE(message);
  EXPECT_EQ(message->packet().size(), 11u);
  EXPECT_EQ(message->logCode(), 0x1192u);
}

TEST(LogMessage, CodesOfTheTelephonyServerStandApart) {
  const Bytes modem = PacketBuilder(0x0001, 13).bytes();
  const Bytes server = PacketBuilder(0xFF0001, 13).bytes();
  EXPECT_EQ(LogMessage::framed(modem)->logCode(), 1u);
  EXPECT_EQ(LogMessage::framed(modem)->logType(), 1);
  EXPECT_EQ(LogMessage::framed(server)->logCode(), 0xFF0001u);
  EXPECT_EQ(LogMessage::framed(server)->logType(), 0xFF);
}

TEST(LogMessage, TwoLogTypesAreKnown) {
  for (unsigned type = 0; type < 256; ++type) {
    Bytes bytes = PacketBuilder(0xB17F, 15).u8(0, static_cast<std::uint8_t>(type)).bytes();
    if (type == 0x81) bytes.insert(bytes.begin(), {0x81, 0});
    EXPECT_EQ(LogMessage::framed(bytes)->isOfKnownType(), type == 1 || type == 0xFF) << type;
  }
}

}  // namespace
}  // namespace varnel
