#include "programs/varnel-telephonyd/simulation/HRPDTraffic.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <map>
#include <numeric>

namespace varnel::simulation {
namespace {

using testing::AllOf;
using testing::Ge;
using testing::Le;

// The counters that are not 0 after this many slots at this ratio.
std::map<std::size_t, std::uint32_t> received(std::int64_t carrierToInterference, std::int64_t slots) {
  ForwardPackets packets;
  Random random(1);
  packets.receive(carrierToInterference, slots, random);
  std::map<std::size_t, std::uint32_t> counts;
  for (std::size_t i = 0; i < packets.counts().size(); ++i)
    if (packets.counts()[i] != 0) counts[i] = packets.counts()[i];
  return counts;
}

TEST(ForwardPackets, BelowTheLowestRateNothingComes) { EXPECT_TRUE(received(35, 600).empty()); }

TEST(ForwardPackets, APacketOfTheLowestRateTakesSixteenSlots) {
  auto counts = received(36, 1000 * 16 + 15);
  EXPECT_EQ(counts[8] + counts[9], 1000u);
  EXPECT_EQ(counts.size(), 2u);
}

TEST(ForwardPackets, APacketOfTheHighestRateTakesOneSlot) {
  auto counts = received(7232, 1000);
  EXPECT_EQ(counts[54] + counts[55], 1000u);
  EXPECT_EQ(counts.size(), 2u);
}

TEST(ForwardPackets, TheRateIsTheHighestThatTheRatioAllows) {
  // -0.6 dB: 614.4 kbit/s in packets of two slots.
  EXPECT_EQ(received(446, 2).count(36), 1u);
  EXPECT_EQ(received(445, 4).count(27), 1u);
}

TEST(ForwardPackets, OnePacketOfAHundredIsLost) {
  auto counts = received(4778, 100'000);
  EXPECT_THAT(counts[51], AllOf(Ge(900u), Le(1100u)));
}

ReversePackets sent(const ReversePackets::Conditions& conditions, std::int64_t subframes = 150) {
  ReversePackets packets;
  Random random(1);
  packets.send(conditions, subframes, random);
  return packets;
}

std::uint32_t sumOf(const ReversePackets::ByTermination& counts) {
  return std::accumulate(counts.begin(), counts.end(), 0u);
}

TEST(ReversePackets, TheLessPowerIsLeftTheSmallerTheyAre) {
  for (const auto& [headroom_db, size] :
       std::map<std::int64_t, std::size_t>{{-5, 0}, {0, 0}, {3, 1}, {20, 6}, {33, 11}, {70, 11}}) {
    const ReversePackets packets = sent({.activePilots = 1, .headroom_db = headroom_db});
    for (std::size_t other = 0; other < ReversePackets::sizes; ++other)
      EXPECT_EQ(sumOf(packets.counts(0, 0, other)) != 0, other == size)
          << headroom_db << " dB, size " << other;
  }
}

TEST(ReversePackets, TheyAreCountedByTheSizeOfTheActiveSet) {
  for (const auto& [pilots, block] :
       std::map<std::size_t, std::size_t>{{0, 0}, {1, 0}, {2, 1}, {3, 2}, {6, 2}}) {
    const ReversePackets packets = sent({.activePilots = pilots, .headroom_db = 20});
    for (std::size_t other = 0; other < ReversePackets::activeSetSizes; ++other)
      EXPECT_EQ(sumOf(packets.counts(other, 0, 6)) != 0, other == block)
          << pilots << " pilots, block " << other;
  }
}

TEST(ReversePackets, EachTakesItsSubframes) {
  const ReversePackets packets = sent({.activePilots = 1, .headroom_db = 20}, 15'000);
  std::uint32_t subframes = 0;
  for (std::size_t mode = 0; mode < ReversePackets::modes; ++mode) {
    for (std::uint32_t i = 0; i < ReversePackets::terminations; ++i)
      subframes += packets.counts(0, mode, 6)[i] * (i + 1);
  }
  // The last packet may go on after the end.
  EXPECT_THAT(subframes, AllOf(Ge(15'000u), Le(15'003u)));
  EXPECT_EQ(packets.counts(0, 0, 6)[0], 0u);
  EXPECT_EQ(packets.counts(0, 1, 6)[2] + packets.counts(0, 1, 6)[3], 0u);
}

}  // namespace
}  // namespace varnel::simulation
