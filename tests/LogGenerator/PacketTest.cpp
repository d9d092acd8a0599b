#include "LogGenerator/Packet.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <limits>

namespace varnel {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

constexpr std::size_t largest = std::numeric_limits<std::size_t>::max();

const Bytes bytes = {0x01, 0x23, 0x45, 0x67, 0x89, 0xAB, 0xCD, 0xEF};

TEST(Packet, ValuesAreLittleEndianAtAnyOffset) {
  const Packet packet(bytes);
  EXPECT_EQ(packet.size(), 8u);
  EXPECT_EQ(packet.u8(0), 0x01);
  EXPECT_EQ(packet.u8(7), 0xEF);
  EXPECT_EQ(packet.u16(0), 0x2301);
  EXPECT_EQ(packet.u16(1), 0x4523);
  EXPECT_EQ(packet.u32(0), 0x67452301u);
  EXPECT_EQ(packet.u32(3), 0xCDAB8967u);
}

TEST(Packet, BytesPastTheEndReadAsZero) {
  const Packet packet(bytes);
  EXPECT_EQ(packet.u8(8), 0);
  EXPECT_EQ(packet.u16(7), 0x00EF);
  EXPECT_EQ(packet.u16(8), 0);
  EXPECT_EQ(packet.u32(5), 0x00EFCDABu);
  EXPECT_EQ(packet.u32(6), 0x0000EFCDu);
  EXPECT_EQ(packet.u32(7), 0x000000EFu);
  EXPECT_EQ(packet.u32(8), 0u);
}

TEST(Packet, OffsetsFarPastTheEndReadAsZero) {
  const Packet packet(bytes);
  EXPECT_EQ(packet.u8(largest), 0);
  EXPECT_EQ(packet.u16(largest), 0);
  EXPECT_EQ(packet.u32(largest), 0u);
  EXPECT_EQ(packet.u32(largest - 1), 0u);
  EXPECT_EQ(packet.bits(largest, 7, 32), 0u);
}

TEST(Packet, AnEmptyPacketReadsAsZero) {
  const Packet packet{ByteView()};
  EXPECT_EQ(packet.size(), 0u);
  EXPECT_EQ(packet.u8(0), 0);
  EXPECT_EQ(packet.u32(0), 0u);
  EXPECT_EQ(packet.bits(0, 0, 32), 0u);
  EXPECT_THAT(packet.payload(), IsEmpty());
}

TEST(Packet, BitsAreALittleEndianRun) {
  const Packet packet(bytes);
  EXPECT_EQ(packet.bits(0, 0, 8), 0x01u);
  EXPECT_EQ(packet.bits(2, 0, 1), 1u);  // 0x45 is 0100 0101
  EXPECT_EQ(packet.bits(2, 1, 1), 0u);
  EXPECT_EQ(packet.bits(2, 2, 3), 1u);
  EXPECT_EQ(packet.bits(2, 6, 2), 1u);
  EXPECT_EQ(packet.bits(2, 4, 8), 0x74u);   // 0x6745 is 0110 0111 0100 0101
  EXPECT_EQ(packet.bits(2, 3, 10), 0xE8u);  // 00 1110 1000
  EXPECT_EQ(packet.bits(0, 0, 32), 0x67452301u);
}

TEST(Packet, ARunOf32BitsMayReachIntoAFifthByte) {
  const Packet packet(bytes);
  EXPECT_EQ(packet.bits(0, 4, 32), 0x96745230u);
  EXPECT_EQ(packet.bits(3, 7, 32), 0xDF9B5712u);
}

TEST(Packet, BitsPastTheEndReadAsZero) {
  const Packet packet(bytes);
  EXPECT_EQ(packet.bits(7, 4, 12), 0x00Eu);
  EXPECT_EQ(packet.bits(8, 0, 32), 0u);
}

TEST(Packet, HoldsWhatLiesInsideAndNothingElse) {
  const Packet packet(bytes);
  EXPECT_TRUE(packet.holds(0, 8));
  EXPECT_FALSE(packet.holds(0, 9));
  EXPECT_TRUE(packet.holds(7, 1));
  EXPECT_FALSE(packet.holds(7, 2));
  EXPECT_TRUE(packet.holds(8, 0));
  EXPECT_FALSE(packet.holds(9, 0));
  EXPECT_FALSE(packet.holds(largest, 1));
  EXPECT_FALSE(packet.holds(1, largest));
  EXPECT_FALSE(packet.holds(largest, largest));
}

TEST(Packet, AViewFromAnOffsetCountsFromThere) {
  const Packet rest = Packet(bytes).from(5);
  EXPECT_EQ(rest.size(), 3u);
  EXPECT_EQ(rest.u8(0), 0xAB);
  EXPECT_EQ(rest.u16(2), 0x00EF);
}

TEST(Packet, AViewFromPastTheEndIsEmpty) {
  EXPECT_EQ(Packet(bytes).from(8).size(), 0u);
  EXPECT_EQ(Packet(bytes).from(9).size(), 0u);
  EXPECT_EQ(Packet(bytes).from(largest).size(), 0u);
}

TEST(Packet, ThePayloadFollowsThe13BytesOfTheHeader) {
  Bytes long15(15, 0x11);
  long15[13] = 0x22;
  long15[14] = 0x33;
  EXPECT_THAT(Packet(long15).payload(), ElementsAre(0x22, 0x33));
}

TEST(Packet, OfAHeaderAloneOrOfLessHasAnEmptyPayload) {
  for (std::size_t size = 0; size <= 13; ++size) {
    const Bytes zeros(size);
    EXPECT_THAT(Packet(zeros).payload(), IsEmpty()) << size << " bytes";
  }
}

}  // namespace
}  // namespace varnel
