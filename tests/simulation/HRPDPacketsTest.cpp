#include "programs/varnel-telephonyd/simulation/HRPDPackets.h"

#include <gtest/gtest.h>

#include "tests/support/SimulatedMessages.h"

namespace varnel::simulation {
namespace {

using namespace std::chrono_literals;

SimulatedPacket packetOf(const Bytes& bytes) { return {0ms, false, bytes}; }

const Cell one{.code = 0x0104}, other{.code = 0x0008};

TEST(HRPDPackets, TheStatusIsTold) {
  HRPDStatus status{.state = HRPDConnection::State::Connected,
                    .session = HRPDConnection::Session::Open,
                    .bandClass = 10,
                    .channel = 0x534,
                    .level_cdbm = -70'60,
                    .secondLevel_cdbm = -72'00,
                    .transmitPower_cdbm = 5'90,
                    .servingPilot = 0x0104,
                    .address = 0xABCDEF,
                    .colorCode = 45};
  SimulatedPacket packet = packetOf(hrpdStatusPacket(0ms, status));
  ASSERT_EQ(packet.packet.size(), 50u);
  EXPECT_EQ(packet.u16(3), 0x1183u);
  EXPECT_EQ(packet.u8(13), 0x34u);
  EXPECT_EQ(packet.u8(14), 0x55u);  // 01010 101
  EXPECT_EQ(packet.u8(15), 256u - 70);
  EXPECT_EQ(packet.u8(16), 256u - 72);
  EXPECT_EQ(packet.u8(17), 5u);
  EXPECT_EQ(packet.u16(18), 0x0104u);
  EXPECT_EQ(packet.u8(36), 5u);
  EXPECT_EQ(packet.u8(37), 4u);
  EXPECT_EQ(packet.u16(38), 0xCDEFu);
  EXPECT_EQ(packet.u8(40), 0xABu);
  EXPECT_EQ(packet.u8(41), 45u);

  status.servingPilot.reset();
  EXPECT_EQ(packetOf(hrpdStatusPacket(0ms, status)).u16(18), 0xFFFFu);
}

TEST(HRPDPackets, StrengthsOfTheActiveSetAreIn512ths) {
  const SimulatedPacket packet = packetOf(hrpdActiveSetPacket(0ms, {{&one, 32768}, {&other, 100}}));
  ASSERT_EQ(packet.packet.size(), 49u);
  EXPECT_EQ(packet.u16(3), 0x12B6u);
  EXPECT_EQ(packet.u8(15), 2u);
  EXPECT_EQ(packet.u16(25), 0x0104u);
  EXPECT_EQ(packet.u16(27), 256u);
  EXPECT_EQ(packet.u16(37), 0x0008u);
  EXPECT_EQ(packet.u16(39), 1u);  // never 0, which has no decibels
  EXPECT_EQ(packetOf(hrpdActiveSetPacket(0ms, {})).packet.size(), 25u);
}

TEST(HRPDPackets, FingersMayHaveNothingToFollow) {
  const SimulatedPacket packet = packetOf(hrpdFingersPacket(0ms, {{&one, 1024}, {}, {&other, 70'000}}));
  ASSERT_EQ(packet.packet.size(), 65u);
  EXPECT_EQ(packet.u16(3), 0x108Au);
  EXPECT_EQ(packet.u8(22), 3u);
  EXPECT_EQ(packet.u16(23), 0x0104u);
  EXPECT_EQ(packet.u16(29), 1024u);
  EXPECT_EQ(packet.u16(37), 0xFFFFu);
  EXPECT_EQ(packet.u16(51), 0x0008u);
  EXPECT_EQ(packet.u16(57), 0xFFFFu);
}

TEST(HRPDPackets, ForwardCountersStandInTheirOrder) {
  ForwardPackets packets;
  Random random(1);
  packets.receive(7232, 3, random);  // the last but one kind
  const SimulatedPacket packet = packetOf(hrpdForwardPacket(0ms, 0x01020304, packets));
  ASSERT_EQ(packet.packet.size(), 241u);
  EXPECT_EQ(packet.u16(3), 0x1192u);
  EXPECT_EQ(packet.u32(13), 0x01020304u);
  EXPECT_EQ(packet.u32(17 + 4 * 54), 3u);
  EXPECT_EQ(packet.u32(17 + 4 * 55), 0u);
}

TEST(HRPDPackets, ReverseCountersStandInTheirBlocks) {
  ReversePackets packets;
  Random random(1);
  packets.send({.activePilots = 3, .headroom_db = 33}, 1000, random);
  const SimulatedPacket packet = packetOf(hrpdReversePacket(0ms, 0x01020304, packets));
  ASSERT_EQ(packet.packet.size(), 1750u);
  EXPECT_EQ(packet.u16(3), 0x127Eu);
  EXPECT_EQ(packet.u32(14), 0x01020304u);
  // The third block, twelfth size: two, three, and four subframes, and with low latency one and two.
  for (const std::size_t offset :
       {18 + 24 * 11 + 576 * 2 + 4, 18 + 24 * 11 + 576 * 2 + 8, 18 + 24 * 11 + 576 * 2 + 12,
        306 + 24 * 11 + 576 * 2, 306 + 24 * 11 + 576 * 2 + 4})
    EXPECT_GT(packet.u32(offset), 0u) << offset;
  unsigned sum = 0;
  for (std::size_t offset = 18; offset + 4 <= 1750; offset += 4) sum += packet.u32(offset);
  unsigned expected = 0;
  for (std::size_t i = 0; i < 4; ++i) expected += packets.counts(2, 0, 11)[i] + packets.counts(2, 1, 11)[i];
  EXPECT_EQ(sum, expected);
}

}  // namespace
}  // namespace varnel::simulation
