#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <map>
#include <set>
#include <vector>

#include "platform/TelephonyService.h"
#include "tests/support/SimulatedMessages.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;
using testing::AllOf;
using testing::AnyOf;
using testing::Ge;
using testing::Le;
using testing::UnorderedElementsAre;

using Message = SimulatedPacket;

constexpr unsigned disconnected = 0, connecting = 1, cellFach = 2, cellDCH = 3, cellPCH = 4, uraPCH = 5;

std::vector<Message> messages(std::uint64_t seed, std::chrono::milliseconds duration) {
  return simulatedMessages("kalvi-utran-2", seed, duration);
}

std::vector<Message> messagesOf(unsigned code, std::chrono::milliseconds duration) {
  std::vector<Message> all = messages(1, duration);
  std::erase_if(all, [code](const Message& message) { return message.code() != code; });
  return all;
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
  std::set<unsigned> identities, channels, areas;
  for (const Message& cell : messagesOf(0xD0E2, 40min)) {
    ASSERT_EQ(cell.packet.size(), 26u);
    EXPECT_EQ(cell.u8(14), 0u);
    // The band around 2017 MHz; both directions share a carrier.
    EXPECT_THAT(cell.u16(19), AnyOf(10054u, 10062u, 10070u));
    EXPECT_EQ(cell.u16(17), cell.u16(19));
    EXPECT_LT(cell.u32(21), 1u << 28);
    EXPECT_EQ(cell.u8(25), 0u);
    identities.insert(cell.u32(21));
    channels.insert(cell.u16(19));
    areas.insert(cell.u8(15));
  }
  // One round through the town.
  EXPECT_GE(identities.size(), 20u);
  EXPECT_EQ(channels.size(), 3u);
  EXPECT_EQ(areas.size(), 3u);
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

TEST(UTRANModem, NeighborsAreBelievable) {
  unsigned state = disconnected, servingChannel = 0;
  std::set<unsigned> sets;
  for (const Message& message : messages(1, 20min)) {
    if (message.code() == 0xD0E0) state = message.u8(14);
    if (message.code() == 0xD0E2) servingChannel = message.u16(19);
    if (message.code() != 0xD00A) continue;
    const unsigned count = message.u8(16) >> 1;
    ASSERT_EQ(message.packet.size(), 168 + 16 * count);
    std::set<unsigned> codes;
    unsigned active = 0;
    for (std::size_t i = 0; i < count; ++i) {
      const Neighbor cell(message, 168 + 16 * i);
      EXPECT_THAT(cell.channel, AnyOf(10054u, 10062u, 10070u));
      // From -105 to -40 dBm, in halves above -140.
      EXPECT_THAT(cell.level, AllOf(Ge(70u), Le(200u)));
      EXPECT_EQ(cell.isDetectedJointly, cell.channel == servingChannel ? 1u : 0u);
      EXPECT_LE(cell.set, 2u);
      EXPECT_TRUE(cell.set != 2 || state == cellDCH) << state;
      active += cell.set == 0;
      codes.insert(cell.code);
      sets.insert(cell.set);
    }
    EXPECT_EQ(active, state == cellDCH || state == cellFach ? 1u : 0u);
    EXPECT_EQ(codes.size(), count);
  }
  EXPECT_THAT(sets, UnorderedElementsAre(0u, 1u, 2u));
}

TEST(UTRANModem, NeighborsEnterAndLeave) {
  std::set<unsigned> heard, all;
  int entered = 0, left = 0;
  for (const Message& message : messagesOf(0xD00A, 5min)) {
    std::set<unsigned> codes;
    for (std::size_t record = 168; record < message.packet.size(); record += 16)
      codes.insert(Neighbor(message, record).code);
    for (const unsigned code : codes) entered += !heard.contains(code);
    for (const unsigned code : heard) left += !codes.contains(code);
    heard = codes;
    all.insert(codes.begin(), codes.end());
  }
  EXPECT_GE(entered, 20);
  EXPECT_GE(left, 20);
  EXPECT_GE(all.size(), 8u);
}

TEST(UTRANModem, GSMNeighborsAreBelievableAndEnterAndLeave) {
  std::set<unsigned> channels, counts, validities;
  for (const Message& message : messagesOf(0xD00E, 20min)) {
    const unsigned count = message.u8(16);
    counts.insert(count);
    ASSERT_EQ(message.packet.size(), 17 + 8 * count);
    for (std::size_t record = 17; record < message.packet.size(); record += 8) {
      EXPECT_THAT(message.u16(record) & 0x3FFF, AllOf(Ge(12000u), Le(12011u)));
      EXPECT_EQ(message.u8(record + 1) >> 6 & 1, 0u);
      const unsigned isValid = message.u8(record + 1) >> 7;
      validities.insert(isValid);
      EXPECT_LE(message.u8(record + 2), isValid ? 7u : 0u);
      EXPECT_LE(message.u8(record + 3), isValid ? 7u : 0u);
      EXPECT_THAT(message.u16(record + 4), AllOf(Ge(10u), Le(50u)));
      const auto level_dbm = static_cast<std::int16_t>(message.u16(record + 6));
      EXPECT_THAT(level_dbm, AllOf(Ge(-100), Le(-40)));
      channels.insert(message.u16(record + 4));
    }
  }
  EXPECT_GE(counts.size(), 3u);
  EXPECT_GE(channels.size(), 4u);
  EXPECT_THAT(validities, UnorderedElementsAre(0u, 1u));
}

TEST(UTRANModem, ChannelsAreMeasuredWhileThereAreAny) {
  unsigned state = disconnected;
  std::set<unsigned> errorRates, ratios;
  int released = 0;
  for (const Message& message : messages(1, 20min)) {
    if (message.code() == 0xD0E0) state = message.u8(14);
    if (message.code() != 0xD00C) continue;
    const unsigned channels = message.u16(14) >> 6 & 0x3F, composites = message.u8(15) >> 4;
    EXPECT_EQ(channels, state == cellDCH ? 4u : state == cellFach ? 1u : 0u);
    EXPECT_EQ(composites, state == cellDCH ? 2u : state == cellFach ? 1u : 0u);
    released += channels == 0;
    ASSERT_EQ(message.packet.size(), 289 + 34 * channels + 8 * composites);
    for (std::size_t record = 17; record < 17 + 2 * channels; record += 2) {
      EXPECT_THAT(message.u8(record), AllOf(Ge(1u), Le(32u)));
      EXPECT_LE(message.u8(record + 1), 63u);
      errorRates.insert(message.u8(record + 1));
    }
    for (std::size_t record = 289 + 34 * channels; record < message.packet.size(); record += 8) {
      EXPECT_THAT(message.u8(record), AnyOf(1u, 2u));
      EXPECT_LE(message.u8(record + 1), 6u);
      for (std::size_t i = 2; i < 8; ++i) {
        // From 0 to 14 dB, in halves above -11.
        EXPECT_THAT(message.u8(record + i), AllOf(Ge(22u), Le(50u)));
        ratios.insert(message.u8(record + i));
      }
    }
  }
  EXPECT_GE(released, 10);
  EXPECT_GE(errorRates.size(), 10u);
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
