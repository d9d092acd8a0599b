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
using testing::Each;
using testing::Ge;
using testing::Le;
using testing::UnorderedElementsAre;

using Message = SimulatedPacket;

constexpr unsigned disconnected = 0, connecting = 1, cellFach = 2, cellDCH = 3, cellPCH = 4, uraPCH = 5;
constexpr unsigned rrInactive = 0, rrIdle = 5, rrReselection = 6, rrPending = 7, rrTransfer = 9,
                   rrRelease = 11, rrFromUMTS = 14, rrToUMTS = 18;

std::vector<Message> messages(std::uint64_t seed, std::chrono::milliseconds duration) {
  return simulatedMessages("kalvi-gsm-umts", seed, duration);
}

std::vector<Message> messagesOf(unsigned code, std::chrono::milliseconds duration) {
  std::vector<Message> all = messages(1, duration);
  std::erase_if(all, [code](const Message& message) { return message.code() != code; });
  return all;
}

int s8(const Message& message, std::size_t offset) { return static_cast<std::int8_t>(message.u8(offset)); }
int s16(const Message& message, std::size_t offset) { return static_cast<std::int16_t>(message.u16(offset)); }
int s32(const Message& message, std::size_t offset) { return static_cast<std::int32_t>(message.u32(offset)); }

bool isOfUMTS(unsigned code) { return code >> 12 == 4; }
bool isOfGSM(unsigned code) { return code >> 12 == 5; }

TEST(GSMUMTSModem, TheMessagesAreTheSameOnEveryMachine) {
  const Message first = messagesOf(0x4127, 1s).at(0);
  EXPECT_EQ(first.packet,
            (Bytes{0x01, 0x1C, 0x00, 0x27, 0x41, 0x32, 0x00, 0x00, 0x00, 0x00, 0x00, 0x00, 0x00, 0xA6, 0x25,
                   0x00, 0x00, 0x5C, 0x29, 0x00, 0x00, 0x5C, 0x1F, 0x01, 0x00, 0x2D, 0x32, 0x00, 0x00}));
}

TEST(GSMUMTSModem, UMTSAndGSMAlternate) {
  for (const std::uint64_t seed : {1, 2, 3, 4, 5}) {
    int stays = 0;
    bool isOnGSM = false;
    auto since = 0ms;
    unsigned rrState = rrInactive, rrcState = disconnected;
    for (const Message& message : messages(seed, 10min)) {
      if (message.code() == 0x512C) rrState = message.u8(13);
      if (message.code() == 0x4125) rrcState = message.u8(13);
      if (!isOfGSM(message.code()) && !isOfUMTS(message.code())) continue;
      if (isOnGSM == isOfGSM(message.code())) continue;
      // Each technology is idle when the phone leaves it.
      EXPECT_EQ(isOnGSM ? rrState : rrcState, isOnGSM ? rrInactive : disconnected);
      EXPECT_THAT(message.at - since, AllOf(Ge(13s), Le(70s))) << seed << ", " << message.at.count();
      since = message.at;
      isOnGSM = !isOnGSM;
      ++stays;
    }
    EXPECT_GE(stays, 12) << seed;
  }
}

TEST(GSMUMTSModem, RRCStatesFollowOneAnotherAsInANetwork) {
  const std::map<unsigned, std::set<unsigned>> allowed = {
      {disconnected, {connecting}},
      {connecting, {cellDCH}},
      {cellDCH, {cellFach}},
      {cellFach, {disconnected, cellDCH, cellPCH, uraPCH}},
      {cellPCH, {cellFach, disconnected}},
      {uraPCH, {cellFach, disconnected}},
  };
  unsigned state = disconnected;
  std::set<unsigned> states;
  for (const Message& message : messagesOf(0x4125, 20min)) {
    ASSERT_EQ(message.packet.size(), 14u);
    const unsigned next = message.u8(13);
    EXPECT_TRUE(next == state || allowed.at(state).contains(next)) << state << " to " << next;
    states.insert(state = next);
  }
  EXPECT_THAT(states, UnorderedElementsAre(disconnected, connecting, cellFach, cellDCH, cellPCH, uraPCH));
}

TEST(GSMUMTSModem, RRStatesFollowOneAnotherAsInANetwork) {
  const std::map<unsigned, std::set<unsigned>> allowed = {
      {rrInactive, {rrFromUMTS}}, {rrFromUMTS, {rrIdle}},    {rrIdle, {rrPending, rrReselection, rrToUMTS}},
      {rrReselection, {rrIdle}},  {rrPending, {rrTransfer}}, {rrTransfer, {rrRelease}},
      {rrRelease, {rrIdle}},      {rrToUMTS, {rrInactive}},
  };
  unsigned state = rrInactive;
  std::set<unsigned> states, modes;
  for (const Message& message : messagesOf(0x512C, 40min)) {
    ASSERT_EQ(message.packet.size(), 17u);
    const unsigned next = message.u8(13);
    EXPECT_TRUE(next == state || allowed.at(state).contains(next)) << state << " to " << next;
    EXPECT_EQ(message.u8(14), next == rrTransfer ? 1u : 0u);
    EXPECT_EQ(message.u8(15), 0u);
    states.insert(state = next);
    modes.insert(message.u8(16));
  }
  EXPECT_THAT(states, UnorderedElementsAre(rrInactive, rrFromUMTS, rrIdle, rrReselection, rrPending,
                                           rrTransfer, rrRelease, rrToUMTS));
  EXPECT_THAT(modes, UnorderedElementsAre(0u, 1u));
}

TEST(GSMUMTSModem, CipheringIsOnWithAConnection) {
  unsigned state = disconnected;
  std::set<unsigned> flags;
  for (const Message& message : messages(1, 20min)) {
    if (message.code() == 0x4125) state = message.u8(13);
    if (message.code() != 0x4157) continue;
    ASSERT_EQ(message.packet.size(), 19u);
    EXPECT_EQ(message.u8(13), state == disconnected || state == connecting ? 0u : 1u);
    flags.insert(message.u8(13));
  }
  EXPECT_EQ(flags.size(), 2u);
}

TEST(GSMUMTSModem, UMTSServingCellsAreBelievable) {
  std::set<unsigned> identities, areas;
  for (const Message& cell : messagesOf(0x4127, 40min)) {
    ASSERT_EQ(cell.packet.size(), 29u);
    EXPECT_EQ(cell.u32(13), 9638u);  // 1927.6 and 2117.6 MHz
    EXPECT_EQ(cell.u32(17), 10588u);
    EXPECT_LT(cell.u32(21), 1u << 28);
    identities.insert(cell.u32(21));
    areas.insert(cell.u16(25));
  }
  EXPECT_GE(identities.size(), 8u);
  EXPECT_EQ(areas.size(), 3u);
}

TEST(GSMUMTSModem, CellSetsAreBelievable) {
  unsigned state = disconnected;
  std::set<unsigned> sets, readings;
  std::size_t mostActive = 0;
  int missed = 0;
  for (const Message& message : messages(1, 20min)) {
    if (message.code() == 0x4125) state = message.u8(13);
    if (message.code() != 0x417A) continue;
    const unsigned count = message.u8(15);
    ASSERT_GE(count, 1u);
    ASSERT_EQ(message.packet.size(), 16 + 15 * count + 44 * count);
    // From -95 to -40 dBm, in tenths of a decibel.
    EXPECT_THAT(s16(message, 13), AllOf(Ge(-402), Le(148)));
    readings.insert(message.u16(13));
    std::size_t active = 0;
    for (std::size_t i = 0; i < count; ++i) {
      const std::size_t record = 16 + 15 * i, energies = 16 + 15 * count + 44 * i;
      EXPECT_LE(message.u16(record + 7) & 0x1FFF, 511u);
      const unsigned set = message.u8(record + 8) >> 5;
      EXPECT_LE(set, 2u);
      active += set == 0;
      sets.insert(set);
      // From -24 to -4 dB of 524,288, plus half a decibel.
      const unsigned last = message.u32(energies + 40);
      EXPECT_THAT(last, AllOf(Ge(2342u), Le(234'191u)));
      EXPECT_THAT(message.u32(energies + 32), AnyOf(0u, last));
      EXPECT_THAT(message.u32(energies + 36), AnyOf(0u, last));
      missed += message.u32(energies + 32) == 0;
    }
    EXPECT_GE(active, 1u);
    EXPECT_LE(active, state == cellDCH ? 3u : 1u);
    mostActive = std::max(mostActive, active);
  }
  EXPECT_THAT(sets, UnorderedElementsAre(0u, 1u, 2u));
  EXPECT_GE(readings.size(), 50u);
  EXPECT_GE(mostActive, 2u);
  EXPECT_GE(missed, 10);
}

TEST(GSMUMTSModem, RankingsAreOfOneKindOfCellsAtATime) {
  int umtsRankings = 0, gsmRankings = 0;
  unsigned state = disconnected;
  for (const Message& message : messages(1, 20min)) {
    if (message.code() == 0x4125) state = message.u8(13);
    if (message.code() != 0x4005) continue;
    EXPECT_NE(state, cellDCH);
    const unsigned umtsCount = message.u8(13), gsmCount = message.u8(14);
    EXPECT_TRUE(umtsCount == 0 || gsmCount == 0);
    ASSERT_EQ(message.packet.size(), 15 + 10 * umtsCount + 7 * gsmCount);
    umtsRankings += umtsCount != 0;
    gsmRankings += gsmCount != 0;
    for (std::size_t i = 0; i < umtsCount; ++i) {
      const std::size_t record = 15 + 10 * i;
      EXPECT_EQ(message.u16(record), 10588u);
      EXPECT_LE(message.u16(record + 2), 511u);
      const int rscp_dbm = s16(message, record + 5);
      EXPECT_THAT(rscp_dbm, AllOf(Ge(-115), Le(-40)));
      EXPECT_EQ(s8(message, record + 4) - 21, rscp_dbm);
      EXPECT_THAT(s8(message, record + 7), AllOf(Ge(-48), Le(-8)));
      EXPECT_THAT(s16(message, record + 8) - rscp_dbm, AnyOf(0, 4));
    }
    for (std::size_t i = 0; i < gsmCount; ++i) {
      const std::size_t record = 15 + 7 * i;
      EXPECT_THAT(message.u16(record), AllOf(Ge(10u), Le(50u)));
      EXPECT_LE(message.u16(record + 2), 63u);
      EXPECT_THAT(s8(message, record + 4), AllOf(Ge(-104), Le(-40)));
      EXPECT_EQ(s16(message, record + 5), s8(message, record + 4) - 6);
    }
  }
  EXPECT_GE(umtsRankings, 50);
  EXPECT_GE(gsmRankings, 50);
}

// Power and level together are always -75 dBm, except for noise and the limits.
TEST(GSMUMTSModem, TransmitPowerFollowsThePathLoss) {
  std::int64_t rscp_dbm = 0;
  unsigned state = disconnected;
  std::set<int> powers;
  int silent = 0;
  for (const Message& message : messages(1, 20min)) {
    if (message.code() == 0x4125) state = message.u8(13);
    if (message.code() == 0xFF0001) {
      const Value serving = message.payload().array()->at(0);
      rscp_dbm = textOf(serving, cellMonitor::radioAccessTechnology) == "UMTS"
                     ? numberOf(serving, cellMonitor::rscp)
                     : 0;
    }
    if (message.code() != 0x4031) continue;
    EXPECT_THAT(state, AnyOf(cellDCH, cellFach));
    const unsigned count = message.u8(14);
    EXPECT_EQ(count, 10u);
    ASSERT_EQ(message.packet.size(), 16 + 14 * count);
    EXPECT_NE(message.u16(20), 0u);
    for (std::size_t i = 0; i < count; ++i) {
      const int sample = s16(message, 16 + 14 * i + 4);
      silent += sample == 0;
      EXPECT_TRUE(sample != 0 || state == cellFach);
      if (sample == 0) continue;
      const int power_dbm = (sample + 512) / 10 - 70;
      EXPECT_THAT(power_dbm, AllOf(Ge(-49), Le(24)));
      if (rscp_dbm != 0) {
        EXPECT_NEAR(power_dbm, -75 - rscp_dbm, 12);
      }
      powers.insert(power_dbm);
    }
  }
  EXPECT_GE(powers.size(), 20u);
  EXPECT_GE(silent, 20);
}

TEST(GSMUMTSModem, BlockErrorsGrowAsLongAsTheChannelsStay) {
  unsigned state = disconnected;
  std::map<unsigned, std::pair<unsigned, unsigned>> counted;  // received and wrong, by channel
  unsigned received = 0, wrong = 0;
  for (const Message& message : messages(1, 20min)) {
    if (message.code() == 0x4125 && message.u8(13) != state) {
      state = message.u8(13);
      counted.clear();
    }
    if (message.code() != 0x4116) continue;
    const unsigned count = message.u8(13);
    EXPECT_EQ(count, state == cellDCH ? 5u : 2u);
    EXPECT_EQ(message.u16(14), 200u);
    ASSERT_EQ(message.packet.size(), 16 + 9 * count);
    for (std::size_t record = 16; record < message.packet.size(); record += 9) {
      const unsigned identity = message.u8(record);
      EXPECT_THAT(identity, AllOf(Ge(1u), Le(32u)));
      auto& [lastReceived, lastWrong] = counted[identity];
      EXPECT_GE(message.u32(record + 1), lastReceived);
      EXPECT_GE(message.u32(record + 5), lastWrong);
      EXPECT_LE(message.u32(record + 5), message.u32(record + 1));
      received += message.u32(record + 1) - lastReceived;
      wrong += message.u32(record + 5) - lastWrong;
      lastReceived = message.u32(record + 1);
      lastWrong = message.u32(record + 5);
    }
  }
  EXPECT_GE(received, 10'000u);
  EXPECT_THAT(wrong * 1000 / received, AllOf(Ge(5u), Le(60u)));
}

TEST(GSMUMTSModem, HighSpeedProcessesAreOfOneCarrierOrTwo) {
  unsigned state = disconnected;
  std::set<unsigned> configurations;
  for (const Message& message : messages(1, 20min)) {
    if (message.code() == 0x4125) state = message.u8(13);
    if (message.code() != 0x4221) continue;
    EXPECT_EQ(state, cellDCH);
    EXPECT_EQ(message.u8(13), 2u);
    const unsigned subframes = message.u16(14) & 0x3FF, configuration = message.u8(15) >> 2;
    EXPECT_LE(subframes, 980u);
    configurations.insert(configuration);
    const unsigned primary = message.u8(16), secondary = message.u8(17);
    EXPECT_EQ(primary, 6u);
    EXPECT_EQ(secondary, configuration == 2 ? 6u : 0u);
    // 18 + 9 * 6 = 72; 18 + 162 * 6 + 9 * 6 = 1044
    ASSERT_EQ(message.packet.size(), secondary == 0 ? 72u : 1044u);
    std::vector<std::size_t> records;
    for (std::size_t i = 0; i < 6; ++i) records.push_back(18 + 9 * i);
    for (std::size_t i = 0; i < secondary; ++i) records.push_back(990 + 9 * i);
    unsigned sent = 0;
    for (std::size_t i = 0; i < records.size(); ++i) {
      EXPECT_EQ(message.u8(records[i]), i % 6);
      EXPECT_LE(message.u16(records[i] + 7), message.u16(records[i] + 5));
      EXPECT_LE(message.u32(records[i] + 1), message.u16(records[i] + 7) * 14'411u);
      sent += message.u16(records[i] + 5);
    }
    EXPECT_LE(sent, subframes * (secondary == 0 ? 1 : 2));
  }
  EXPECT_THAT(configurations, UnorderedElementsAre(0u, 2u));
}

TEST(GSMUMTSModem, GSMServingCellsAreBelievable) {
  std::set<unsigned> identities;
  for (const Message& cell : messagesOf(0x5134, 40min)) {
    ASSERT_EQ(cell.packet.size(), 26u);
    EXPECT_THAT(cell.u16(13), AllOf(Ge(10u), Le(50u)));
    EXPECT_LE(cell.u16(15), 63u);
    EXPECT_THAT(cell.u16(17), AllOf(Ge(12000u), Le(12011u)));
    identities.insert(cell.u16(17));
  }
  EXPECT_GE(identities.size(), 4u);
}

TEST(GSMUMTSModem, GSMMeasurementsTellCriteriaOrInACallTheQuality) {
  unsigned channel = 0;
  bool isSpeaking = false, isTransferringData = false;
  std::map<unsigned, unsigned> identities;
  std::set<unsigned> levels, counts;
  std::size_t identified = 0, unidentified = 0;
  for (const Message& message : messages(1, 20min)) {
    if (message.code() == 0x512C) {
      isSpeaking = message.u8(13) == rrTransfer && message.u8(16) == 0;
      isTransferringData = message.u8(13) == rrTransfer && message.u8(16) == 1;
    }
    if (message.code() == 0x5134) channel = message.u16(13);
    if (message.code() == 0x51FF) {
      ASSERT_EQ(message.packet.size(), 15 + 4 * message.u8(14));
      identities.clear();
      for (std::size_t record = 15; record < message.packet.size(); record += 4) {
        EXPECT_LE(message.u8(record + 2), 63u);
        identities[message.u16(record)] = message.u8(record + 2);
      }
    }
    if (message.code() != 0x5137) continue;
    const unsigned count = message.u8(28);
    ASSERT_EQ(message.packet.size(), 29 + 14 * count);
    counts.insert(count);
    levels.insert(message.u8(15));
    EXPECT_THAT(message.u8(15), AllOf(Ge(8u), Le(63u)));
    if (isSpeaking) {
      EXPECT_LE(message.u32(16), 7u);
      EXPECT_LE(message.u32(20), 7u);
    } else {
      // The level is sent above -110 dBm, and the least is -102 dBm.
      EXPECT_EQ(s32(message, 16), static_cast<int>(message.u8(15)) - 8);
      EXPECT_EQ(s32(message, 20), s32(message, 16) + 4);
    }
    EXPECT_EQ(message.u8(26), isTransferringData ? 1u : 0u);
    std::set<unsigned> channels{channel};
    for (std::size_t record = 29; record < message.packet.size(); record += 14) {
      channels.insert(message.u16(record));
      EXPECT_LE(message.u8(record + 2), 63u);
      EXPECT_EQ(s32(message, record + 3), static_cast<int>(message.u8(record + 2)) - 8);
      (identities.contains(message.u16(record)) ? identified : unidentified)++;
    }
    EXPECT_EQ(channels.size(), count + 1);  // all apart
  }
  EXPECT_GE(levels.size(), 15u);
  EXPECT_GE(counts.size(), 2u);
  EXPECT_GE(identified, 100u);
  EXPECT_GE(unidentified, 20u);
}

TEST(GSMUMTSModem, CallsHopOverTheirAllocation) {
  bool isSpeaking = false;
  std::set<unsigned> allocation, dedicated, silences;
  for (const Message& message : messages(1, 20min)) {
    if (message.code() == 0x512C) isSpeaking = message.u8(13) == rrTransfer && message.u8(16) == 0;
    if (message.code() == 0x51F8) {
      ASSERT_EQ(message.packet.size(), 27u);
      EXPECT_LE(message.u8(13), 63u);
      EXPECT_EQ(message.u8(14), 6u);
      allocation.clear();
      for (std::size_t entry = 15; entry < 27; entry += 2) allocation.insert(message.u16(entry));
      EXPECT_EQ(allocation.size(), 6u);
      EXPECT_THAT(allocation, Each(AllOf(Ge(51u), Le(124u))));
    }
    if (message.code() == 0x5076) {
      EXPECT_TRUE(isSpeaking);
      ASSERT_EQ(message.packet.size(), 17u);
      EXPECT_TRUE(allocation.contains(message.u16(13)));
      dedicated.insert(message.u16(13));
    }
    if (message.code() == 0x5072) {
      EXPECT_TRUE(isSpeaking);
      ASSERT_EQ(message.packet.size(), 20u);
      silences.insert(message.u8(19));
    }
  }
  EXPECT_GE(dedicated.size(), 6u);
  EXPECT_THAT(silences, UnorderedElementsAre(0u, 1u));
}

TEST(GSMUMTSModem, BroadcastsDifferFromCellToCell) {
  const std::map<unsigned, std::size_t> sizes = {
      {0x51F4, 15}, {0x51F5, 18}, {0x51F6, 24}, {0x51FB, 34}, {0x51FD, 35}};
  std::map<std::pair<unsigned, std::size_t>, std::set<unsigned>> numbers;  // by code and offset
  for (const Message& message : messages(1, 40min)) {
    const auto found = sizes.find(message.code());
    if (found == sizes.end()) continue;
    ASSERT_EQ(message.packet.size(), found->second);
    for (std::size_t offset = 13; offset < message.packet.size(); ++offset)
      numbers[{message.code(), offset}].insert(message.u8(offset));
  }
  EXPECT_THAT((numbers[{0x51F4, 14}]), UnorderedElementsAre(0u, 1u));
  EXPECT_THAT((numbers[{0x51F5, 13}]), UnorderedElementsAre(0u, 1u));
  EXPECT_THAT((numbers[{0x51F5, 14}]), UnorderedElementsAre(6u, 7u));
  EXPECT_THAT((numbers[{0x51F5, 15}]), UnorderedElementsAre(0u, 1u));
  EXPECT_THAT((numbers[{0x51F6, 15}]), UnorderedElementsAre(0u, 1u, 2u));
  EXPECT_THAT((numbers[{0x51F6, 16}]), UnorderedElementsAre(1u, 2u, 4u, 8u));
  EXPECT_THAT((numbers[{0x51F6, 17}]), UnorderedElementsAre(0u, 1u));
  EXPECT_THAT((numbers[{0x51FB, 13}]), UnorderedElementsAre(0u));
  EXPECT_GE((numbers[{0x51FD, 14}]).size(), 5u);
  EXPECT_GE((numbers[{0x51FD, 15}]).size(), 5u);
  EXPECT_THAT((numbers[{0x51FD, 16}]), UnorderedElementsAre(0u, 1u));
  EXPECT_THAT((numbers[{0x51FD, 33}]), UnorderedElementsAre(1u));
}

TEST(GSMUMTSModem, MobilityStatesAreThoseOfProcedures) {
  std::set<unsigned> circuits, packets, registrations;
  for (const Message& message : messages(1, 20min)) {
    if (message.code() == 0x7131) {
      ASSERT_EQ(message.packet.size(), 16u);
      circuits.insert(message.u8(13));
      EXPECT_THAT(message.u8(14), AnyOf(0u, 2u, 7u, 8u));
      EXPECT_LE(message.u8(15), 1u);
    } else if (message.code() == 0x7130) {
      ASSERT_EQ(message.packet.size(), 16u);
      packets.insert(message.u8(13));
      EXPECT_THAT(message.u8(14), AnyOf(0u, 6u, 7u, 8u, 12u));
      EXPECT_LE(message.u8(15), 1u);
    } else if (message.code() == 0x7132) {
      ASSERT_EQ(message.packet.size(), 16u);
      registrations.insert(message.u8(13));
      EXPECT_EQ(message.u8(14), 0u);
    }
  }
  EXPECT_THAT(circuits, UnorderedElementsAre(0u, 3u, 5u, 6u, 9u, 13u, 14u, 19u));
  EXPECT_THAT(packets, UnorderedElementsAre(0u, 1u, 2u, 3u, 5u, 6u));
  EXPECT_THAT(registrations, UnorderedElementsAre(0u, 1u, 2u, 5u));
}

TEST(GSMUMTSModem, TheNetworkChangesWithTheTechnology) {
  std::set<unsigned> home, partner, services;
  int changes = 0;
  unsigned last = 0x01;
  for (const Message& message : messages(1, 20min)) {
    if (message.code() != 0x7135) continue;
    ASSERT_EQ(message.packet.size(), 32u);
    EXPECT_EQ(message.u8(15), 0x00u);
    const unsigned code = message.u16(16);
    ASSERT_THAT(code, AnyOf(0x10F1u, 0x0101u));  // 001/01 and 001/100
    EXPECT_EQ(message.u8(13), code == 0x0101 ? 1u : 0u);
    EXPECT_THAT(message.u8(14), AnyOf(0u, 3u, 4u));
    services.insert(message.u8(14));
    const unsigned area = message.u8(18) << 8 | message.u8(19);
    (code == 0x0101 ? partner : home).insert(area);
    EXPECT_EQ(message.u8(20), area % 100);
    changes += code != last;
    last = code;
  }
  EXPECT_GE(changes, 20);
  EXPECT_EQ(home.size(), 3u);
  EXPECT_GE(partner.size(), 2u);
  EXPECT_THAT(services, UnorderedElementsAre(0u, 3u, 4u));
}

TEST(GSMUMTSModem, EquivalentNetworksAreThoseOfTheServingOne) {
  unsigned code = 0, service = 0;
  std::set<unsigned> counts;
  for (const Message& message : messages(1, 10min)) {
    if (message.code() == 0x7135) {
      code = message.u16(16);
      service = message.u8(14);
    }
    if (message.code() != 0x7150) continue;
    const unsigned count = message.u8(16);
    EXPECT_EQ(count, service != 3 ? 0u : code == 0x0101 ? 1u : 2u);
    ASSERT_EQ(message.packet.size(), count == 0 ? 17u : 17 + 3 * count + 3);
    for (std::size_t record = 17, i = 0; i < count; ++i, record += 3) {
      EXPECT_EQ(message.u8(record) * 100 + message.u8(record + 2) * 10 + message.u8(record + 4), 1u);
      EXPECT_THAT(message.u8(record + 1) * 100 + message.u8(record + 3) * 10 + message.u8(record + 5),
                  AnyOf(1u, 100u, 101u));
    }
    counts.insert(count);
  }
  EXPECT_THAT(counts, UnorderedElementsAre(0u, 1u, 2u));
}

TEST(GSMUMTSModem, TheCellMonitorAgreesWithTheModem) {
  std::map<std::int64_t, std::int64_t> channels;
  std::set<std::string> serving, neighbours;
  for (const Message& message : messages(1, 10min)) {
    if (message.code() == 0x4127) channels[message.u32(21)] = message.u32(17);
    if (message.code() == 0x5134) channels[message.u16(17)] = message.u16(13);
    if (message.code() != 0xFF0001) continue;
    const Value records = message.payload();
    const Value& cell = records.array()->at(0);
    EXPECT_EQ(textOf(cell, cellMonitor::cellType), "Serving");
    const std::string technology = textOf(cell, cellMonitor::radioAccessTechnology);
    serving.insert(technology);
    const bool isGSM = technology == "GSM";
    EXPECT_EQ(numberOf(cell, cellMonitor::mcc), 1);
    EXPECT_EQ(numberOf(cell, cellMonitor::mnc), isGSM ? 100 : 1);
    EXPECT_THAT(numberOf(cell, cellMonitor::lac), AllOf(Ge(1), Le(0xFFFD)));
    ASSERT_TRUE(channels.contains(numberOf(cell, cellMonitor::cellIdentity)));
    EXPECT_EQ(numberOf(cell, isGSM ? cellMonitor::arfcn : cellMonitor::uarfcn),
              channels[numberOf(cell, cellMonitor::cellIdentity)]);
    for (const Value& record : *records.array()) {
      // In steps of 2 dB.
      if (textOf(record, cellMonitor::radioAccessTechnology) == "GSM") {
        EXPECT_THAT(numberOf(record, cellMonitor::rssi), AllOf(Ge(-60), Le(-20)));
      }
      if (textOf(record, cellMonitor::cellType) == "Neighbor")
        neighbours.insert(textOf(record, cellMonitor::radioAccessTechnology));
    }
  }
  EXPECT_THAT(serving, UnorderedElementsAre("GSM", "UMTS"));
  EXPECT_THAT(neighbours, UnorderedElementsAre("GSM", "LTE", "UMTS", "UTRAN"));
}

TEST(GSMUMTSModem, TheSimCardRegistersInTheServingCellsNetwork) {
  std::set<std::string> networks;
  for (const Message& message : messagesOf(0xFF0000, 10min)) {
    const std::string location = textOf(message.payload(), "kSimFile_LOCI");
    const auto start = location.find("LAI ");
    ASSERT_NE(start, std::string::npos) << location;
    networks.insert(location.substr(start + 4, location.rfind('-') - start - 4));
  }
  EXPECT_THAT(networks, UnorderedElementsAre("001-01", "001-100"));
}

}  // namespace
}  // namespace varnel
