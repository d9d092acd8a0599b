#include "programs/varnel-telephonyd/simulation/PacketWriter.h"

#include <gtest/gtest.h>

#include <stdexcept>

namespace varnel::simulation {
namespace {

using namespace std::chrono_literals;

TEST(PacketWriter, TheHeaderHasThirteenBytes) {
  EXPECT_EQ(PacketWriter(0xB0C2, 1027ms, 15).finish(),
            (Bytes{1, 14, 0, 0xC2, 0xB0, 3, 4, 0, 0, 0, 0, 0, 0, 0, 0}));
}

TEST(PacketWriter, NumbersAreLittleEndianAtOffsetsFromTheStart) {
  const Bytes packet =
      PacketWriter(0, 0ms, 21).u8(13, 0x11).u16(14, 0x2233).u32(16, 0x44556677).u8(20, -1).finish();
  EXPECT_EQ(Bytes(packet.begin() + 13, packet.end()),
            (Bytes{0x11, 0x33, 0x22, 0x77, 0x66, 0x55, 0x44, 0xFF}));
}

TEST(PacketWriter, AFieldOfBitsGoesOnIntoTheNextBytes) {
  const Bytes packet =
      PacketWriter(0, 0ms, 17).bits(13, 1, 3, 5).bits(13, 4, 9, 0x1A5).bits(14, 7, 10, 0x201).finish();
  // From the lowest bit: 0 101 | 0xA5 and 1 | 00 | 0x201
  EXPECT_EQ(Bytes(packet.begin() + 13, packet.end()), (Bytes{0x5A, 0x9A, 0x00, 0x01}));
}

TEST(PacketWriter, AFieldOfBitsHoldsTheNearestNumberThatItCan) {
  const Bytes packet = PacketWriter(0, 0ms, 15).bits(13, 0, 7, 128).bits(14, 0, 8, -1).finish();
  EXPECT_EQ(Bytes(packet.begin() + 13, packet.end()), (Bytes{0x7F, 0x00}));
}

TEST(PacketWriter, OffsetsCountFromTheLastRecord) {
  PacketWriter writer(0, 0ms, 14);
  writer.u8(13, 2).record(2).u8(0, 0x11).bits(1, 4, 4, 3).record(3).u16(1, 0x2233);
  EXPECT_EQ(writer.finish(), (Bytes{1, 18, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 2, 0x11, 0x30, 0, 0x33, 0x22}));
}

TEST(PacketWriter, ZerosFillThePacketUpToTheNextRecord) {
  EXPECT_EQ(PacketWriter(0, 0ms, 13).record(1).u8(0, 7).padTo(16).record(1).u8(0, 8).finish(),
            (Bytes{1, 16, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 7, 0, 0, 8}));
}

TEST(PacketWriter, NothingIsWrittenPastTheEnd) {
  PacketWriter writer(0, 0ms, 14);
  EXPECT_THROW(writer.u16(13, 1), std::out_of_range);
  EXPECT_THROW(writer.bits(13, 7, 2, 0), std::out_of_range);
  EXPECT_THROW(writer.record(2).u8(2, 1), std::out_of_range);
}

TEST(PacketWriter, AServerMessageIsAHeaderAndItsPayload) {
  EXPECT_EQ(serverMessage(2, 0ms, Bytes{7, 8}), (Bytes{0xFF, 14, 0, 2, 0, 0, 0, 0, 0, 0, 0, 0, 0, 7, 8}));
}

}  // namespace
}  // namespace varnel::simulation
