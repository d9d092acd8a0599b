#include "programs/varnel-telephonyd/simulation/CDMA1xPackets.h"

#include <gtest/gtest.h>

#include "tests/support/SimulatedMessages.h"

namespace varnel::simulation {
namespace {

using namespace std::chrono_literals;

const Cell reference{.code = 0x0104}, other{.code = 0x0008};

SimulatedPacket statusOf(std::vector<ReceivedPilot> pilots, std::int64_t level_cdbm = -80'00) {
  const Bytes packet = cdma1xStatusPacket(7ms, {.state = CDMA1xConnection::State::Traffic,
                                                .bandClass = 1,
                                                .channel = 283,
                                                .level_cdbm = level_cdbm,
                                                .secondLevel_cdbm = -63'25,
                                                .transmitPower_cdbm = -12'34,
                                                .referencePilot = 0x0104,
                                                .pilots = std::move(pilots)});
  return {7ms, false, packet};
}

TEST(CDMA1xPackets, FourSubpacketsFollowOneAnother) {
  const SimulatedPacket packet = statusOf({{&reference, 0}, {&other, 0}});
  EXPECT_EQ(packet.u16(3), 0x119Cu);
  EXPECT_EQ(packet.u8(14), 4u);
  std::size_t start = 17;
  for (const auto& [identity, size] : {std::pair(1u, 8u), {2u, 16u}, {3u, 60u}, {4u, 16u}}) {
    EXPECT_EQ(packet.u8(start), identity);
    EXPECT_EQ(packet.u16(start + 2), size);
    start += size;
  }
  EXPECT_EQ(packet.packet.size(), start);
}

TEST(CDMA1xPackets, TheRadioIsToldForBothReceivers) {
  const SimulatedPacket packet = statusOf({});
  EXPECT_EQ(packet.u8(21), 8u);
  EXPECT_EQ(packet.u8(29), 1u);
  EXPECT_EQ(packet.u8(30), 1u);
  EXPECT_EQ(packet.u16(31), 283u);
  EXPECT_EQ(packet.u16(33), 283u);
  EXPECT_EQ(packet.u8(35), 256u - 50);  // -16.752 dB in steps of 0.334 dB, towards 0
  EXPECT_EQ(packet.u8(36), 0u);
  EXPECT_EQ(packet.u16(37), 65536u - 123);
}

TEST(CDMA1xPackets, LevelsOutOfRangeAreTheNearest) {
  EXPECT_EQ(statusOf({}, -140'00).u8(35), 0x80u);
  EXPECT_EQ(statusOf({}, 0).u8(35), 0x7Fu);
}

TEST(CDMA1xPackets, EnergiesAreAboveTheNoiseOfTheirSum) {
  const SimulatedPacket packet = statusOf({{&reference, 65536 / 8}, {&other, 0}});
  EXPECT_EQ(packet.u16(45), 512u);  // chips
  EXPECT_EQ(packet.u8(47), 4u);     // gain
  EXPECT_EQ(packet.u8(48), 5u);     // exponent
  EXPECT_EQ(packet.u8(49), 2u);     // pilots
  EXPECT_EQ(packet.u8(50), 2u);     // energies of fingers with each
  EXPECT_EQ(packet.u16(51), 0x0104u);
  EXPECT_EQ(packet.u16(53), 0x0104u);
  // 2^7 / (9 * 512^2 * 4) * 9360 - 1/512 = 1/8.
  EXPECT_EQ(packet.u16(53 + 20), 9360u);
  EXPECT_EQ(packet.u16(77), 0x0008u);
  EXPECT_EQ(packet.u16(77 + 20), 144u);
}

TEST(CDMA1xPackets, AFrameIsGoodOrErased) {
  for (const auto& [frame, flag] : {std::pair(Frame::Good, 0u), {Frame::Erased, 1u}}) {
    const SimulatedPacket packet{0ms, false, trafficFramePacket(0ms, frame)};
    ASSERT_EQ(packet.packet.size(), 45u);
    EXPECT_EQ(packet.u16(3), 0x119Du);
    EXPECT_EQ(packet.u8(14), 1u);
    EXPECT_EQ(packet.u8(17), 11u);
    EXPECT_EQ(packet.u16(19), 28u);
    EXPECT_EQ(packet.u8(41), flag);
  }
}

TEST(CDMA1xPackets, TheSystemIsTold) {
  const SimulatedPacket packet{0ms, false,
                               cdmaSystemPacket(0ms, {.roamingIndicator = 7,
                                                      .system = 4157,
                                                      .network = 3,
                                                      .packetZone = 250,
                                                      .protocolRevision = 6,
                                                      .baseStation = 1234})};
  ASSERT_EQ(packet.packet.size(), 186u);
  EXPECT_EQ(packet.u16(3), 0x134Fu);
  EXPECT_EQ(packet.u8(13), 2u);
  EXPECT_EQ(packet.u32(42), 7u);
  EXPECT_EQ(packet.u32(46), 2u);
  EXPECT_EQ(packet.u16(50), 4157u);
  EXPECT_EQ(packet.u16(52), 3u);
  EXPECT_EQ(packet.u8(131), 250u);
  EXPECT_EQ(packet.u8(133), 6u);
  EXPECT_EQ(packet.u16(184), 1234u);
}

}  // namespace
}  // namespace varnel::simulation
