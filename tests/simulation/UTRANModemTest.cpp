#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <map>
#include <set>
#include <vector>

#include "platform/TelephonyService.h"
#include "tests/support/DistinctValues.h"
#include "tests/support/SimulatedMessages.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;
using testing::AllOf;
using testing::AnyOf;
using testing::Each;
using testing::Ge;
using testing::Le;
using testing::UnorderedElementsAre;

using Message = SimulatedPacket;

constexpr unsigned disconnected = 0, connecting = 1, cellFach = 2, cellDCH = 3, cellPCH = 4, uraPCH = 5;

std::vector<Message> messages(std::uint64_t seed, std::chrono::milliseconds duration) {
  return simulatedMessages("kalvi-utran-2", seed, duration);
}

std::vector<Message> messagesOf(unsigned code, std::chrono::milliseconds duration) {
  return simulatedMessagesOf(code, "kalvi-utran-2", 1, duration);
}

TEST(UTRANModem, TheMessagesAreTheSameOnEveryMachine) {
  const Message first = messagesOf(0xD0E2, 1s).at(0);
  EXPECT_EQ(first.packet,
            (Bytes{0x01, 0x19, 0x00, 0xE2, 0xD0, 0x14, 0x00, 0x00, 0x00, 0x00, 0x00, 0x00, 0x00,
                   0x01, 0x00, 0x2D, 0x00, 0x46, 0x27, 0x46, 0x27, 0x66, 0x1F, 0x02, 0x00, 0x00}));
}

TEST(UTRANModem, StatesFollowOneAnotherAsInANetwork) {
  const std::map<unsigned, std::set<unsigned>> allowed = {
      {disconnected, {connecting}}, {connecting, {cellDCH}},
      {cellDCH, {cellFach}},        {cellFach, {disconnected, cellDCH, cellPCH, uraPCH}},
      {cellPCH, {cellFach}},        {uraPCH, {cellFach}},
  };
  for (const std::uint64_t seed : {1, 2, 3}) {
    unsigned state = disconnected;
    std::set<unsigned> states;
    for (const Message& message : messages(seed, 5min)) {
      if (message.code() != 0xD0E0) continue;
      ASSERT_EQ(message.packet.size(), 15u);
      EXPECT_EQ(message.u8(13), 1u);  // version
      const unsigned next = message.u8(14);
      EXPECT_TRUE(next == state || allowed.at(state).contains(next)) << state << " to " << next;
      states.insert(state = next);
    }
    EXPECT_THAT(states, UnorderedElementsAre(disconnected, connecting, cellFach, cellDCH, cellPCH, uraPCH));
  }
}

TEST(UTRANModem, ServingCellsAreBelievable) {
  for (const Message& cell : messagesOf(0xD0E2, 40min)) {
    ASSERT_EQ(cell.packet.size(), 26u);
    EXPECT_EQ(cell.u8(14), 0u);
    // The band around 2017 MHz; both directions share a carrier.
    EXPECT_THAT(cell.u16(19), AnyOf(10054u, 10062u, 10070u));
    EXPECT_EQ(cell.u16(17), cell.u16(19));
    EXPECT_LT(cell.u32(21), 1u << 28);
    EXPECT_EQ(cell.u8(25), 0u);
  }
}

// One round through the town.
TEST(UTRANModem, TheWalkLeadsThroughCellsOfEveryCarrierAndArea) {
  const auto cells = messagesOf(0xD0E2, 40min);
  EXPECT_GE(distinctValues(cells, [](const Message& cell) { return cell.u32(21); }).size(), 20u);
  EXPECT_EQ(distinctValues(cells, [](const Message& cell) { return cell.u16(19); }).size(), 3u);
  EXPECT_EQ(distinctValues(cells, [](const Message& cell) { return cell.u8(15); }).size(), 3u);
}

TEST(UTRANModem, TheServingCellChangesWithinMinutes) {
  for (const std::uint64_t seed : {1, 2, 3, 4, 5}) {
    std::set<unsigned> identities;
    for (const Message& message : messages(seed, 5min))
      if (message.code() == 0xD0E2) identities.insert(message.u32(21));
    EXPECT_GE(identities.size(), 3u) << seed;
  }
}

TEST(UTRANModem, TheCellMonitorAgreesWithTheModem) {
  std::map<std::int64_t, std::int64_t> channels;
  for (const Message& message : messages(1, 5min)) {
    if (message.code() == 0xD0E2) channels[message.u32(21)] = message.u16(19);
    if (message.code() != 0xFF0001) continue;
    const Value records = message.payload();
    const auto serving = std::ranges::count_if(*records.array(), [](const Value& record) {
      return textOf(record, cellMonitor::cellType) == cellMonitor::serving;
    });
    EXPECT_EQ(serving, 1);
    const Value& cell = records.array()->at(0);
    EXPECT_EQ(textOf(cell, cellMonitor::radioAccessTechnology), "UTRAN");
    ASSERT_TRUE(channels.contains(numberOf(cell, cellMonitor::cellIdentity)));
    EXPECT_EQ(numberOf(cell, cellMonitor::uarfcn), channels[numberOf(cell, cellMonitor::cellIdentity)]);
    EXPECT_EQ(numberOf(cell, cellMonitor::bandInfo), 34);
    EXPECT_THAT(numberOf(cell, cellMonitor::lac), AllOf(Ge(1), Le(0xFFFD)));
    EXPECT_THAT(numberOf(cell, cellMonitor::scramblingCode), AllOf(Ge(0), Le(127)));
    EXPECT_THAT(numberOf(cell, cellMonitor::rscp), AllOf(Ge(-110), Le(-40)));
  }
}

// A record of 0xD00A.
struct Neighbor {
  Neighbor(const Message& message, std::size_t record)
      : channel(message.u16(record) & 0x3FFF),
        code(message.u16(record + 1) >> 6 & 0x7F),
        level(message.u16(record + 2) >> 5 & 0xFF),
        set(message.u8(record + 3) >> 5 & 3),
        isDetectedJointly(message.u8(record + 3) >> 7) {}

  unsigned channel, code, level, set, isDetectedJointly;
};

std::vector<Neighbor> neighbors(const Message& message) {
  const unsigned count = message.u8(16) >> 1;
  EXPECT_EQ(message.packet.size(), 168 + 16 * count);
  std::vector<Neighbor> cells;
  for (std::size_t i = 0; i < count; ++i) cells.emplace_back(message, 168 + 16 * i);
  return cells;
}

TEST(UTRANModem, NeighborsAreBelievable) {
  for (const Message& message : messagesOf(0xD00A, 20min)) {
    const auto cells = neighbors(message);
    for (const Neighbor& cell : cells) {
      EXPECT_THAT(cell.channel, AnyOf(10054u, 10062u, 10070u));
      // From -105 to -40 dBm, in halves above -140.
      EXPECT_THAT(cell.level, AllOf(Ge(70u), Le(200u)));
      EXPECT_LE(cell.set, 2u);
    }
    EXPECT_EQ(distinctValues(cells, &Neighbor::code).size(), cells.size());
  }
}

TEST(UTRANModem, NeighborsOfTheServingCarrierAreDetectedJointly) {
  unsigned servingChannel = 0;
  for (const Message& message : messages(1, 20min)) {
    if (message.code() == 0xD0E2) servingChannel = message.u16(19);
    if (message.code() != 0xD00A) continue;
    for (const Neighbor& cell : neighbors(message))
      EXPECT_EQ(cell.isDetectedJointly, cell.channel == servingChannel ? 1u : 0u);
  }
}

TEST(UTRANModem, NeighborsAreOfTheSetsOfTheState) {
  unsigned state = disconnected;
  std::set<unsigned> sets;
  for (const Message& message : messages(1, 20min)) {
    if (message.code() == 0xD0E0) state = message.u8(14);
    if (message.code() != 0xD00A) continue;
    const auto cells = neighbors(message);
    EXPECT_EQ(std::ranges::count(cells, 0u, &Neighbor::set), state == cellDCH || state == cellFach ? 1 : 0);
    EXPECT_TRUE(state == cellDCH || std::ranges::count(cells, 2u, &Neighbor::set) == 0) << state;
    sets.merge(distinctValues(cells, &Neighbor::set));
  }
  EXPECT_THAT(sets, UnorderedElementsAre(0u, 1u, 2u));
}

TEST(UTRANModem, NeighborsEnterAndLeave) {
  std::set<unsigned> heard;
  int entered = 0, left = 0;
  for (const Message& message : messagesOf(0xD00A, 5min)) {
    const std::set<unsigned> codes = distinctValues(neighbors(message), &Neighbor::code);
    for (const unsigned code : codes) entered += !heard.contains(code);
    for (const unsigned code : heard) left += !codes.contains(code);
    heard = codes;
  }
  EXPECT_GE(entered, 20);
  EXPECT_GE(left, 20);
}

TEST(UTRANModem, ManyCellsAreNeighborsOverTime) {
  std::set<unsigned> codes;
  for (const Message& message : messagesOf(0xD00A, 5min))
    codes.merge(distinctValues(neighbors(message), &Neighbor::code));
  EXPECT_GE(codes.size(), 8u);
}

// A record of 0xD00E.
struct GSMNeighbor {
  unsigned identity, isValid, network, base, channel;
  int level_dbm;
};
std::vector<GSMNeighbor> gsmNeighbors(std::chrono::milliseconds duration) {
  std::vector<GSMNeighbor> cells;
  for (const Message& message : messagesOf(0xD00E, duration)) {
    EXPECT_EQ(message.packet.size(), 17 + 8 * message.u8(16));
    for (std::size_t record = 17; record < message.packet.size(); record += 8)
      cells.push_back({message.u16(record) & 0x7FFF, message.u8(record + 1) >> 7, message.u8(record + 2),
                       message.u8(record + 3), message.u16(record + 4),
                       static_cast<std::int16_t>(message.u16(record + 6))});
  }
  return cells;
}

TEST(UTRANModem, GSMNeighborsAreBelievable) {
  for (const GSMNeighbor& cell : gsmNeighbors(20min)) {
    EXPECT_THAT(cell.identity, AllOf(Ge(12000u), Le(12011u)));
    EXPECT_THAT(cell.channel, AllOf(Ge(10u), Le(50u)));
    EXPECT_THAT(cell.level_dbm, AllOf(Ge(-100), Le(-40)));
  }
}

TEST(UTRANModem, OnlyIdentifiedGSMNeighborsHaveAnIdentityCode) {
  const auto cells = gsmNeighbors(20min);
  for (const GSMNeighbor& cell : cells) {
    EXPECT_LE(cell.network, cell.isValid ? 7u : 0u);
    EXPECT_LE(cell.base, cell.isValid ? 7u : 0u);
  }
  EXPECT_THAT(distinctValues(cells, &GSMNeighbor::isValid), UnorderedElementsAre(0u, 1u));
}

TEST(UTRANModem, GSMNeighborsEnterAndLeave) {
  const auto all = messagesOf(0xD00E, 20min);
  EXPECT_GE(distinctValues(all, [](const Message& message) { return message.u8(16); }).size(), 3u);
  EXPECT_GE(distinctValues(gsmNeighbors(20min), &GSMNeighbor::channel).size(), 4u);
}

// How many channels and composites a message of 0xD00C tells.
unsigned channelCount(const Message& message) { return message.u16(14) >> 6 & 0x3F; }
unsigned compositeCount(const Message& message) { return message.u8(15) >> 4; }

TEST(UTRANModem, ChannelsAreThoseOfTheState) {
  unsigned state = disconnected;
  for (const Message& message : messages(1, 20min)) {
    if (message.code() == 0xD0E0) state = message.u8(14);
    if (message.code() != 0xD00C) continue;
    EXPECT_EQ(channelCount(message), state == cellDCH ? 4u : state == cellFach ? 1u : 0u);
    EXPECT_EQ(compositeCount(message), state == cellDCH ? 2u : state == cellFach ? 1u : 0u);
    EXPECT_EQ(message.packet.size(), 289 + 34 * channelCount(message) + 8 * compositeCount(message));
  }
}

TEST(UTRANModem, ChannelsAreTakenBackWhenTheyAreGone) {
  EXPECT_GE(std::ranges::count(messagesOf(0xD00C, 20min), 0u, channelCount), 10);
}

TEST(UTRANModem, ErrorRatesAreBelievableAndVary) {
  std::set<unsigned> errorRates;
  for (const Message& message : messagesOf(0xD00C, 20min)) {
    for (std::size_t i = 0; i < channelCount(message); ++i) {
      EXPECT_THAT(message.u8(17 + 2 * i), AllOf(Ge(1u), Le(32u)));
      errorRates.insert(message.u8(18 + 2 * i));
    }
  }
  EXPECT_THAT(errorRates, Each(Le(63u)));
  EXPECT_GE(errorRates.size(), 10u);
}

TEST(UTRANModem, RatiosOfCompositesAreBelievableAndVary) {
  std::set<unsigned> ratios;
  for (const Message& message : messagesOf(0xD00C, 20min)) {
    for (std::size_t record = 289 + 34 * channelCount(message); record < message.packet.size(); record += 8) {
      EXPECT_THAT(message.u8(record), AnyOf(1u, 2u));
      EXPECT_LE(message.u8(record + 1), 6u);
      for (std::size_t i = 2; i < 8; ++i) ratios.insert(message.u8(record + i));
    }
  }
  // From 0 to 14 dB, in halves above -11.
  EXPECT_THAT(ratios, Each(AllOf(Ge(22u), Le(50u))));
  EXPECT_GE(ratios.size(), 5u);
}

TEST(UTRANModem, TheSimCardRegistersInTheServingCellsArea) {
  std::int64_t area = 0;
  std::set<std::string> locations;
  for (const Message& message : messages(1, 30min)) {
    if (message.code() == 0xFF0001) area = numberOf(message.payload().array()->at(0), cellMonitor::lac);
    if (message.code() == 0xFF0000) locations.insert(textOf(message.payload(), "kSimFile_LOCI"));
  }
  EXPECT_GT(area, 0);
  EXPECT_GE(locations.size(), 3u);
}

}  // namespace
}  // namespace varnel
