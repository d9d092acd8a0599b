#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <array>
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
constexpr unsigned rrInactive = 0, rrIdle = 5, rrReselection = 6, rrPending = 7, rrTransfer = 9,
                   rrRelease = 11, rrFromUMTS = 14, rrToUMTS = 18;

std::vector<Message> messages(std::uint64_t seed, std::chrono::milliseconds duration) {
  return simulatedMessages("kalvi-gsm-umts", seed, duration);
}

std::vector<Message> messagesOf(unsigned code, std::chrono::milliseconds duration) {
  return simulatedMessagesOf(code, "kalvi-gsm-umts", 1, duration);
}

int s8(const Message& message, std::size_t offset) { return static_cast<std::int8_t>(message.u8(offset)); }
int s16(const Message& message, std::size_t offset) { return static_cast<std::int16_t>(message.u16(offset)); }
int s32(const Message& message, std::size_t offset) { return static_cast<std::int32_t>(message.u32(offset)); }

bool isOfUMTS(unsigned code) { return code >> 12 == 4; }
bool isOfGSM(unsigned code) { return code >> 12 == 5; }

// A message, and the state of the UMTS connection that was told last.
struct InState {
  Message message;
  unsigned state;
};
std::vector<InState> messagesInState(unsigned code, std::chrono::milliseconds duration) {
  std::vector<InState> found;
  unsigned state = disconnected;
  for (const Message& message : messages(1, duration)) {
    if (message.code() == 0x4125) state = message.u8(13);
    if (message.code() == code) found.push_back({message, state});
  }
  return found;
}

TEST(GSMUMTSModem, TheMessagesAreTheSameOnEveryMachine) {
  const Message first = messagesOf(0x4127, 1s).at(0);
  EXPECT_EQ(first.packet,
            (Bytes{0x01, 0x1C, 0x00, 0x27, 0x41, 0x32, 0x00, 0x00, 0x00, 0x00, 0x00, 0x00, 0x00, 0xA6, 0x25,
                   0x00, 0x00, 0x5C, 0x29, 0x00, 0x00, 0x5C, 0x1F, 0x01, 0x00, 0x2D, 0x32, 0x00, 0x00}));
}

// When a technology was left for the other one, and the state of its connection then.
struct Departure {
  std::chrono::milliseconds at;
  bool isOfGSM;
  unsigned state;
};
std::vector<Departure> departures(std::uint64_t seed, std::chrono::milliseconds duration) {
  std::vector<Departure> departures;
  bool isOnGSM = false;
  unsigned rrState = rrInactive, rrcState = disconnected;
  for (const Message& message : messages(seed, duration)) {
    if (message.code() == 0x512C) rrState = message.u8(13);
    if (message.code() == 0x4125) rrcState = message.u8(13);
    if (!(isOnGSM ? isOfUMTS : isOfGSM)(message.code())) continue;
    departures.push_back({message.at, isOnGSM, isOnGSM ? rrState : rrcState});
    isOnGSM = !isOnGSM;
  }
  return departures;
}

TEST(GSMUMTSModem, UMTSAndGSMAlternate) {
  for (const std::uint64_t seed : {1, 2, 3, 4, 5}) {
    const auto all = departures(seed, 10min);
    EXPECT_GE(all.size(), 12u) << seed;
    auto since = 0ms;
    for (const Departure& departure : all) {
      EXPECT_THAT(departure.at - since, AllOf(Ge(13s), Le(70s))) << seed << ", " << departure.at.count();
      since = departure.at;
    }
  }
}

TEST(GSMUMTSModem, ATechnologyIsLeftAtRest) {
  for (const std::uint64_t seed : {1, 2, 3, 4, 5}) {
    for (const Departure& departure : departures(seed, 10min))
      EXPECT_EQ(departure.state, departure.isOfGSM ? rrInactive : disconnected) << departure.at.count();
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
  std::set<unsigned> states;
  for (const Message& message : messagesOf(0x512C, 40min)) {
    const unsigned next = message.u8(13);
    EXPECT_TRUE(next == state || allowed.at(state).contains(next)) << state << " to " << next;
    states.insert(state = next);
  }
  EXPECT_THAT(states, UnorderedElementsAre(rrInactive, rrFromUMTS, rrIdle, rrReselection, rrPending,
                                           rrTransfer, rrRelease, rrToUMTS));
}

TEST(GSMUMTSModem, RRSubstatesAreThoseOfTheState) {
  for (const Message& message : messagesOf(0x512C, 40min)) {
    ASSERT_EQ(message.packet.size(), 17u);
    EXPECT_EQ(message.u8(14), message.u8(13) == rrTransfer ? 1u : 0u);
    EXPECT_EQ(message.u8(15), 0u);
  }
}

TEST(GSMUMTSModem, GSMTransfersSpeechAndData) {
  const auto modes = distinctValues(messagesOf(0x512C, 40min), [](const Message& m) { return m.u8(16); });
  EXPECT_THAT(modes, UnorderedElementsAre(0u, 1u));
}

TEST(GSMUMTSModem, CipheringIsOnWithAConnection) {
  const auto all = messagesInState(0x4157, 20min);
  for (const auto& [message, state] : all) {
    ASSERT_EQ(message.packet.size(), 19u);
    EXPECT_EQ(message.u8(13), state == disconnected || state == connecting ? 0u : 1u);
  }
  EXPECT_EQ(distinctValues(all, [](const InState& each) { return each.message.u8(13); }).size(), 2u);
}

TEST(GSMUMTSModem, UMTSServingCellsAreBelievable) {
  for (const Message& cell : messagesOf(0x4127, 40min)) {
    ASSERT_EQ(cell.packet.size(), 29u);
    EXPECT_EQ(cell.u32(13), 9638u);  // 1927.6 and 2117.6 MHz
    EXPECT_EQ(cell.u32(17), 10588u);
    EXPECT_LT(cell.u32(21), 1u << 28);
  }
}

TEST(GSMUMTSModem, TheWalkLeadsThroughUMTSCellsOfEveryArea) {
  const auto cells = messagesOf(0x4127, 40min);
  EXPECT_GE(distinctValues(cells, [](const Message& cell) { return cell.u32(21); }).size(), 8u);
  EXPECT_EQ(distinctValues(cells, [](const Message& cell) { return cell.u16(25); }).size(), 3u);
}

// A cell of 0x417A, with the energies of its three searches.
struct HeardCell {
  unsigned code, set;
  std::array<unsigned, 3> energies;
};
std::vector<HeardCell> heardCells(const Message& message) {
  const unsigned count = message.u8(15);
  EXPECT_EQ(message.packet.size(), 16 + 15 * count + 44 * count);
  std::vector<HeardCell> cells;
  for (std::size_t i = 0; i < count; ++i) {
    const std::size_t record = 16 + 15 * i, energies = 16 + 15 * count + 44 * i;
    cells.push_back({message.u16(record + 7) & 0x1FFF,
                     message.u8(record + 8) >> 5,
                     {message.u32(energies + 32), message.u32(energies + 36), message.u32(energies + 40)}});
  }
  return cells;
}

TEST(GSMUMTSModem, HeardCellsAreBelievable) {
  for (const Message& message : messagesOf(0x417A, 20min)) {
    ASSERT_FALSE(heardCells(message).empty());
    for (const HeardCell& cell : heardCells(message)) {
      EXPECT_LE(cell.code, 511u);
      EXPECT_LE(cell.set, 2u);
      // From -24 to -4 dB of 524,288, plus half a decibel.
      EXPECT_THAT(cell.energies[2], AllOf(Ge(2342u), Le(234'191u)));
    }
  }
}

TEST(GSMUMTSModem, EarlierSearchesNowAndThenMissACell) {
  int missed = 0;
  for (const Message& message : messagesOf(0x417A, 20min)) {
    for (const auto& [code, set, energies] : heardCells(message)) {
      EXPECT_THAT(energies[0], AnyOf(0u, energies[2]));
      EXPECT_THAT(energies[1], AnyOf(0u, energies[2]));
      missed += energies[0] == 0;
    }
  }
  EXPECT_GE(missed, 10);
}

TEST(GSMUMTSModem, CellsAreOfEverySet) {
  std::set<unsigned> sets;
  for (const Message& message : messagesOf(0x417A, 20min))
    for (const HeardCell& cell : heardCells(message)) sets.insert(cell.set);
  EXPECT_THAT(sets, UnorderedElementsAre(0u, 1u, 2u));
}

TEST(GSMUMTSModem, SeveralCellsAreActiveOnADedicatedChannelOnly) {
  std::ptrdiff_t mostActive = 0;
  for (const auto& [message, state] : messagesInState(0x417A, 20min)) {
    const auto active = std::ranges::count(heardCells(message), 0u, &HeardCell::set);
    EXPECT_THAT(active, AllOf(Ge(1), Le(state == cellDCH ? 3 : 1)));
    mostActive = std::max(mostActive, active);
  }
  EXPECT_GE(mostActive, 2);
}

TEST(GSMUMTSModem, CarrierReadingsAreBelievableAndVary) {
  const auto readings =
      distinctValues(messagesOf(0x417A, 20min), [](const Message& message) { return s16(message, 13); });
  // From -95 to -40 dBm, in tenths of a decibel.
  EXPECT_THAT(readings, Each(AllOf(Ge(-402), Le(148))));
  EXPECT_GE(readings.size(), 50u);
}

// The rankings of cells, without those of the other kind. The offset is that of the number of cells.
std::vector<Message> rankings(std::size_t countOffset) {
  std::vector<Message> all = messagesOf(0x4005, 20min);
  std::erase_if(all, [=](const Message& message) { return message.u8(countOffset) == 0; });
  return all;
}

TEST(GSMUMTSModem, RankingsAreOfOneKindOfCellsAtATime) {
  for (const Message& message : messagesOf(0x4005, 20min)) {
    const unsigned umtsCount = message.u8(13), gsmCount = message.u8(14);
    EXPECT_TRUE(umtsCount == 0 || gsmCount == 0);
    EXPECT_EQ(message.packet.size(), 15 + 10 * umtsCount + 7 * gsmCount);
  }
}

TEST(GSMUMTSModem, NoCellsAreRankedOnADedicatedChannel) {
  for (const auto& [message, state] : messagesInState(0x4005, 20min)) EXPECT_NE(state, cellDCH);
}

TEST(GSMUMTSModem, RankedUMTSCellsAreBelievable) {
  const auto all = rankings(13);
  EXPECT_GE(all.size(), 50u);
  for (const Message& message : all) {
    for (std::size_t record = 15; record < message.packet.size(); record += 10) {
      EXPECT_EQ(message.u16(record), 10588u);
      EXPECT_LE(message.u16(record + 2), 511u);
      const int rscp_dbm = s16(message, record + 5);
      EXPECT_THAT(rscp_dbm, AllOf(Ge(-115), Le(-40)));
      EXPECT_EQ(s8(message, record + 4) - 21, rscp_dbm);
      EXPECT_THAT(s8(message, record + 7), AllOf(Ge(-48), Le(-8)));
      EXPECT_THAT(s16(message, record + 8) - rscp_dbm, AnyOf(0, 4));
    }
  }
}

TEST(GSMUMTSModem, RankedGSMCellsAreBelievable) {
  const auto all = rankings(14);
  EXPECT_GE(all.size(), 50u);
  for (const Message& message : all) {
    for (std::size_t record = 15; record < message.packet.size(); record += 7) {
      EXPECT_THAT(message.u16(record), AllOf(Ge(10u), Le(50u)));
      EXPECT_LE(message.u16(record + 2), 63u);
      EXPECT_THAT(s8(message, record + 4), AllOf(Ge(-104), Le(-40)));
      EXPECT_EQ(s16(message, record + 5), s8(message, record + 4) - 6);
    }
  }
}

std::vector<int> powerSamples(const Message& message) {
  std::vector<int> samples;
  for (std::size_t record = 16; record < message.packet.size(); record += 14)
    samples.push_back(s16(message, record + 4));
  return samples;
}

int power_dbm(int sample) { return (sample + 512) / 10 - 70; }

TEST(GSMUMTSModem, TransmitPowerIsToldWhileThereAreChannels) {
  std::set<int> powers;
  for (const auto& [message, state] : messagesInState(0x4031, 20min)) {
    EXPECT_THAT(state, AnyOf(cellDCH, cellFach));
    EXPECT_EQ(message.u8(14), 10u);
    ASSERT_EQ(message.packet.size(), 16u + 14 * 10);
    for (const int sample : powerSamples(message))
      if (sample != 0) powers.insert(power_dbm(sample));
  }
  EXPECT_THAT(powers, Each(AllOf(Ge(-49), Le(24))));
  EXPECT_GE(powers.size(), 20u);
}

TEST(GSMUMTSModem, OnlyASharedChannelIsSilentBetweenBursts) {
  std::ptrdiff_t silent = 0;
  for (const auto& [message, state] : messagesInState(0x4031, 20min)) {
    const auto samples = powerSamples(message);
    EXPECT_NE(samples.at(0), 0);
    const auto silentHere = std::ranges::count(samples, 0);
    EXPECT_TRUE(silentHere == 0 || state == cellFach);
    silent += silentHere;
  }
  EXPECT_GE(silent, 20);
}

// Power and level together are always -75 dBm, except for noise and the limits.
TEST(GSMUMTSModem, TransmitPowerFollowsThePathLoss) {
  std::int64_t rscp_dbm = 0;
  int compared = 0;
  for (const Message& message : messages(1, 20min)) {
    if (message.code() == 0xFF0001) {
      const Value serving = message.payload().array()->at(0);
      rscp_dbm = textOf(serving, cellMonitor::radioAccessTechnology) == "UMTS"
                     ? numberOf(serving, cellMonitor::rscp)
                     : 0;
    }
    if (message.code() != 0x4031 || rscp_dbm == 0) continue;
    for (const int sample : powerSamples(message)) {
      if (sample == 0) continue;
      EXPECT_NEAR(power_dbm(sample), -75 - rscp_dbm, 12);
      ++compared;
    }
  }
  EXPECT_GE(compared, 1000);
}

// What a transport channel of 0x4116 has received since it was set up.
struct Blocks {
  unsigned received = 0, wrong = 0;
};
std::map<unsigned, Blocks> blocksOf(const Message& message) {
  std::map<unsigned, Blocks> blocks;
  for (std::size_t record = 16; record < message.packet.size(); record += 9)
    blocks[message.u8(record)] = {message.u32(record + 1), message.u32(record + 5)};
  return blocks;
}

TEST(GSMUMTSModem, BlockErrorsAreOfTheChannelsOfTheState) {
  for (const auto& [message, state] : messagesInState(0x4116, 20min)) {
    const unsigned count = message.u8(13);
    EXPECT_EQ(count, state == cellDCH ? 5u : 2u);
    EXPECT_EQ(message.u16(14), 200u);
    ASSERT_EQ(message.packet.size(), 16 + 9 * count);
    for (const auto& [identity, blocks] : blocksOf(message)) {
      EXPECT_THAT(identity, AllOf(Ge(1u), Le(32u)));
      EXPECT_LE(blocks.wrong, blocks.received);
    }
  }
}

// How the blocks of a channel have grown from one report to the next; from nothing when it was set up.
struct Growth {
  Blocks before, now;
};
std::vector<Growth> growths() {
  std::vector<Growth> growths;
  unsigned state = disconnected;
  std::map<unsigned, Blocks> before;
  for (const Message& message : messages(1, 20min)) {
    if (message.code() == 0x4125 && message.u8(13) != state) {
      state = message.u8(13);
      before.clear();
    }
    if (message.code() != 0x4116) continue;
    const auto now = blocksOf(message);
    for (const auto& [identity, blocks] : now) growths.push_back({before[identity], blocks});
    before = now;
  }
  return growths;
}

TEST(GSMUMTSModem, BlockErrorsGrowAsLongAsTheChannelsStay) {
  for (const auto& [before, now] : growths()) {
    EXPECT_GE(now.received, before.received);
    EXPECT_GE(now.wrong, before.wrong);
  }
}

TEST(GSMUMTSModem, AFewBlocksOfAThousandAreWrong) {
  unsigned received = 0, wrong = 0;
  for (const auto& [before, now] : growths()) {
    received += now.received - before.received;
    wrong += now.wrong - before.wrong;
  }
  EXPECT_GE(received, 10'000u);
  EXPECT_THAT(wrong * 1000 / received, AllOf(Ge(5u), Le(60u)));
}

// Where the processes of 0x4221 begin.
std::vector<std::size_t> processRecords(const Message& message) {
  std::vector<std::size_t> records;
  for (std::size_t i = 0; i < message.u8(16); ++i) records.push_back(18 + 9 * i);
  for (std::size_t i = 0; i < message.u8(17); ++i) records.push_back(990 + 9 * i);
  return records;
}

TEST(GSMUMTSModem, HighSpeedProcessesAreOfOneCarrierOrTwo) {
  std::set<unsigned> configurations;
  for (const auto& [message, state] : messagesInState(0x4221, 20min)) {
    EXPECT_EQ(state, cellDCH);
    EXPECT_EQ(message.u8(13), 2u);
    const unsigned configuration = message.u8(15) >> 2, primary = message.u8(16), secondary = message.u8(17);
    configurations.insert(configuration);
    EXPECT_EQ(primary, 6u);
    EXPECT_EQ(secondary, configuration == 2 ? 6u : 0u);
    // 18 + 9 * 6 = 72; 18 + 162 * 6 + 9 * 6 = 1044
    EXPECT_EQ(message.packet.size(), secondary == 0 ? 72u : 1044u);
  }
  EXPECT_THAT(configurations, UnorderedElementsAre(0u, 2u));
}

TEST(GSMUMTSModem, HighSpeedProcessesHaveNoMoreBlocksThanThereAreSubframes) {
  for (const Message& message : messagesOf(0x4221, 20min)) {
    const unsigned subframes = message.u16(14) & 0x3FF;
    EXPECT_LE(subframes, 980u);
    unsigned sent = 0, process = 0;
    for (const std::size_t record : processRecords(message)) {
      EXPECT_EQ(message.u8(record), process++ % 6);
      EXPECT_LE(message.u16(record + 7), message.u16(record + 5));
      EXPECT_LE(message.u32(record + 1), message.u16(record + 7) * 14'411u);
      sent += message.u16(record + 5);
    }
    EXPECT_LE(sent, subframes * (message.u8(17) == 0 ? 1 : 2));
  }
}

TEST(GSMUMTSModem, GSMServingCellsAreBelievable) {
  for (const Message& cell : messagesOf(0x5134, 40min)) {
    ASSERT_EQ(cell.packet.size(), 26u);
    EXPECT_THAT(cell.u16(13), AllOf(Ge(10u), Le(50u)));
    EXPECT_LE(cell.u16(15), 63u);
    EXPECT_THAT(cell.u16(17), AllOf(Ge(12000u), Le(12011u)));
  }
}

TEST(GSMUMTSModem, TheWalkLeadsThroughGSMCells) {
  const auto cells = messagesOf(0x5134, 40min);
  EXPECT_GE(distinctValues(cells, [](const Message& cell) { return cell.u16(17); }).size(), 4u);
}

TEST(GSMUMTSModem, GSMMeasurementsTellCriteriaOrInACallTheQuality) {
  bool isSpeaking = false, isTransferringData = false;
  for (const Message& message : messages(1, 20min)) {
    if (message.code() == 0x512C) {
      isSpeaking = message.u8(13) == rrTransfer && message.u8(16) == 0;
      isTransferringData = message.u8(13) == rrTransfer && message.u8(16) == 1;
    }
    if (message.code() != 0x5137) continue;
    if (isSpeaking) {
      EXPECT_LE(message.u32(16), 7u);
      EXPECT_LE(message.u32(20), 7u);
    } else {
      // The level is sent above -110 dBm, and the least is -102 dBm.
      EXPECT_EQ(s32(message, 16), static_cast<int>(message.u8(15)) - 8);
      EXPECT_EQ(s32(message, 20), s32(message, 16) + 4);
    }
    EXPECT_EQ(message.u8(26), isTransferringData ? 1u : 0u);
  }
}

TEST(GSMUMTSModem, GSMLevelsAreBelievableAndVary) {
  const auto levels = distinctValues(messagesOf(0x5137, 20min), [](const Message& m) { return m.u8(15); });
  EXPECT_THAT(levels, Each(AllOf(Ge(8u), Le(63u))));
  EXPECT_GE(levels.size(), 15u);
}

TEST(GSMUMTSModem, GSMNeighborsAreOnChannelsApart) {
  unsigned serving = 0;
  for (const Message& message : messages(1, 20min)) {
    if (message.code() == 0x5134) serving = message.u16(13);
    if (message.code() != 0x5137) continue;
    std::set<unsigned> channels{serving};
    for (std::size_t record = 29; record < message.packet.size(); record += 14)
      channels.insert(message.u16(record));
    EXPECT_EQ(channels.size(), message.u8(28) + 1);
  }
}

TEST(GSMUMTSModem, GSMNeighborsAreBelievable) {
  const auto all = messagesOf(0x5137, 20min);
  EXPECT_GE(distinctValues(all, [](const Message& message) { return message.u8(28); }).size(), 2u);
  for (const Message& message : all) {
    ASSERT_EQ(message.packet.size(), 29 + 14 * message.u8(28));
    for (std::size_t record = 29; record < message.packet.size(); record += 14) {
      EXPECT_LE(message.u8(record + 2), 63u);
      EXPECT_EQ(s32(message, record + 3), static_cast<int>(message.u8(record + 2)) - 8);
    }
  }
}

TEST(GSMUMTSModem, IdentityCodesAreThoseOfStrongNeighbors) {
  std::set<unsigned> identified;  // channels
  int known = 0, unknown = 0;
  for (const Message& message : messages(1, 20min)) {
    if (message.code() == 0x51FF) {
      ASSERT_EQ(message.packet.size(), 15 + 4 * message.u8(14));
      identified.clear();
      for (std::size_t record = 15; record < message.packet.size(); record += 4) {
        EXPECT_LE(message.u8(record + 2), 63u);
        identified.insert(message.u16(record));
      }
    }
    if (message.code() != 0x5137) continue;
    for (std::size_t record = 29; record < message.packet.size(); record += 14)
      (identified.contains(message.u16(record)) ? known : unknown)++;
  }
  EXPECT_GE(known, 100);
  EXPECT_GE(unknown, 20);
}

TEST(GSMUMTSModem, CallsHopOverTheirAllocation) {
  std::set<unsigned> allocation, dedicated;
  for (const Message& message : messages(1, 20min)) {
    if (message.code() == 0x51F8) {
      allocation.clear();
      for (std::size_t entry = 15; entry < message.packet.size(); entry += 2)
        allocation.insert(message.u16(entry));
    }
    if (message.code() != 0x5076) continue;
    ASSERT_EQ(message.packet.size(), 17u);
    EXPECT_TRUE(allocation.contains(message.u16(13)));
    dedicated.insert(message.u16(13));
  }
  EXPECT_GE(dedicated.size(), 6u);
}

TEST(GSMUMTSModem, AnAllocationHasSixChannels) {
  for (const Message& message : messagesOf(0x51F8, 20min)) {
    ASSERT_EQ(message.packet.size(), 27u);
    EXPECT_LE(message.u8(13), 63u);
    EXPECT_EQ(message.u8(14), 6u);
    std::set<unsigned> channels;
    for (std::size_t entry = 15; entry < 27; entry += 2) channels.insert(message.u16(entry));
    EXPECT_EQ(channels.size(), 6u);
    EXPECT_THAT(channels, Each(AllOf(Ge(51u), Le(124u))));
  }
}

TEST(GSMUMTSModem, DedicatedChannelsAreToldInACallOnly) {
  bool isSpeaking = false;
  for (const Message& message : messages(1, 20min)) {
    if (message.code() == 0x512C) isSpeaking = message.u8(13) == rrTransfer && message.u8(16) == 0;
    if (message.code() == 0x5076 || message.code() == 0x5072) {
      EXPECT_TRUE(isSpeaking) << message.at.count();
    }
  }
}

TEST(GSMUMTSModem, CallsFallSilentBetweenWords) {
  const auto all = messagesOf(0x5072, 20min);
  for (const Message& message : all) ASSERT_EQ(message.packet.size(), 20u);
  const auto silences = distinctValues(all, [](const Message& message) { return message.u8(19); });
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

TEST(GSMUMTSModem, CircuitStatesAreThoseOfProcedures) {
  const auto all = messagesOf(0x7131, 20min);
  for (const Message& message : all) {
    ASSERT_EQ(message.packet.size(), 16u);
    EXPECT_THAT(message.u8(14), AnyOf(0u, 2u, 7u, 8u));
    EXPECT_LE(message.u8(15), 1u);
  }
  EXPECT_THAT(distinctValues(all, [](const Message& message) { return message.u8(13); }),
              UnorderedElementsAre(0u, 3u, 5u, 6u, 9u, 13u, 14u, 19u));
}

TEST(GSMUMTSModem, PacketStatesAreThoseOfProcedures) {
  const auto all = messagesOf(0x7130, 20min);
  for (const Message& message : all) {
    ASSERT_EQ(message.packet.size(), 16u);
    EXPECT_THAT(message.u8(14), AnyOf(0u, 6u, 7u, 8u, 12u));
    EXPECT_LE(message.u8(15), 1u);
  }
  EXPECT_THAT(distinctValues(all, [](const Message& message) { return message.u8(13); }),
              UnorderedElementsAre(0u, 1u, 2u, 3u, 5u, 6u));
}

TEST(GSMUMTSModem, RegistrationStatesAreThoseOfProcedures) {
  const auto all = messagesOf(0x7132, 20min);
  for (const Message& message : all) {
    ASSERT_EQ(message.packet.size(), 16u);
    EXPECT_EQ(message.u8(14), 0u);
  }
  EXPECT_THAT(distinctValues(all, [](const Message& message) { return message.u8(13); }),
              UnorderedElementsAre(0u, 1u, 2u, 5u));
}

constexpr unsigned homeCode = 0x10F1, partnerCode = 0x0101;  // 001/01 and 001/100

unsigned areaOf(const Message& network) { return network.u8(18) << 8 | network.u8(19); }

// The serving networks of that code.
std::vector<Message> networksOf(unsigned code) {
  std::vector<Message> all = messagesOf(0x7135, 20min);
  std::erase_if(all, [code](const Message& network) { return network.u16(16) != code; });
  return all;
}

TEST(GSMUMTSModem, ServingNetworksAreBelievable) {
  for (const Message& network : messagesOf(0x7135, 20min)) {
    ASSERT_EQ(network.packet.size(), 32u);
    EXPECT_EQ(network.u8(15), 0x00u);
    EXPECT_THAT(network.u16(16), AnyOf(homeCode, partnerCode));
    EXPECT_EQ(network.u8(13), network.u16(16) == partnerCode ? 1u : 0u);
    EXPECT_EQ(network.u8(20), areaOf(network) % 100);
  }
}

TEST(GSMUMTSModem, TheNetworkChangesWithTheTechnology) {
  int changes = 0;
  unsigned last = 0x01;
  for (const Message& network : messagesOf(0x7135, 20min)) {
    changes += network.u16(16) != last;
    last = network.u16(16);
  }
  EXPECT_GE(changes, 20);
}

TEST(GSMUMTSModem, NetworksHaveSeveralAreas) {
  EXPECT_EQ(distinctValues(networksOf(homeCode), areaOf).size(), 3u);
  EXPECT_GE(distinctValues(networksOf(partnerCode), areaOf).size(), 2u);
}

TEST(GSMUMTSModem, ServiceIsNoneOrLimitedOrWhole) {
  const auto services = distinctValues(messagesOf(0x7135, 20min), [](const Message& m) { return m.u8(14); });
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
  std::set<std::string> serving, neighbors;
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
        neighbors.insert(textOf(record, cellMonitor::radioAccessTechnology));
    }
  }
  EXPECT_THAT(serving, UnorderedElementsAre("GSM", "UMTS"));
  EXPECT_THAT(neighbors, UnorderedElementsAre("GSM", "LTE", "UMTS", "UTRAN"));
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
