#include "programs/varnel-telephonyd/simulation/radios/AllRadiosModem.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <map>
#include <set>

#include "tests/simulation/radios/Stream.h"

namespace varnel::simulation {
namespace {

using namespace std::chrono_literals;
using testing::AllOf;
using testing::AnyOf;
using testing::ElementsAre;
using testing::Ge;
using testing::IsSupersetOf;
using testing::Le;

// Three rounds of the journey.
class AllRadiosStream : public testing::Test {
 protected:
  static const std::vector<RadioMessage>& messages() {
    static const std::vector<RadioMessage> all = radioMessages(1, 6min);
    return all;
  }
  static std::vector<RadioMessage> messagesOf(unsigned code, unsigned subscription) {
    std::vector<RadioMessage> found;
    std::ranges::copy_if(messages(), std::back_inserter(found), [&](const RadioMessage& message) {
      return message.isOfModem() && message.code() == code && message.subscription == subscription;
    });
    return found;
  }
  static std::set<unsigned> versions(unsigned code, unsigned subscription) {
    std::set<unsigned> found;
    for (const RadioMessage& message : messagesOf(code, subscription))
      found.insert(code < 0xB800 ? message.u8(0) : message.u32(0));
    return found;
  }
};

TEST(AllRadiosModem, TheSameSeedGivesTheSameMessagesAndAnotherSeedOthers) {
  AllRadiosModem one(7), same(7), other(8);
  bool isOther = false;
  for (int i = 0; i < 1500; ++i) {
    const SimulatedMessage message = one.next();
    ASSERT_EQ(message.bytes, same.next().bytes) << i;
    isOther = isOther || message.bytes != other.next().bytes;
  }
  EXPECT_TRUE(isOther);
}

TEST_F(AllRadiosStream, TimeNeverGoesBack) {
  EXPECT_TRUE(std::ranges::is_sorted(messages(), {}, &RadioMessage::at));
}

TEST_F(AllRadiosStream, EveryMessageNamesOneOfTwoSubscriptions) {
  for (const RadioMessage& message : messages()) {
    ASSERT_EQ(message.mark, 0x81u);
    ASSERT_THAT(message.subscription, AnyOf(1u, 2u));
    ASSERT_EQ(message.packet.at(1) | message.packet.at(2) << 8, std::ssize(message.packet) - 1);
  }
}

TEST_F(AllRadiosStream, PacketsOfLTEHaveSeveralVersions) {
  EXPECT_THAT(versions(0xB0C1, 1), ElementsAre(2));
  EXPECT_THAT(versions(0xB0C1, 2), ElementsAre(1));
  EXPECT_THAT(versions(0xB0C2, 1), ElementsAre(3));
  EXPECT_THAT(versions(0xB0C2, 2), ElementsAre(2));
  EXPECT_THAT(versions(0xB17F, 1), ElementsAre(5));
  EXPECT_THAT(versions(0xB17F, 2), ElementsAre(4));
  EXPECT_THAT(versions(0xB180, 1), ElementsAre(5));
  EXPECT_THAT(versions(0xB180, 2), ElementsAre(4));
  EXPECT_THAT(versions(0xB179, 1), ElementsAre(3, 4));
  EXPECT_THAT(versions(0xB0C0, 1), ElementsAre(26));
  EXPECT_THAT(versions(0xB0C0, 2), ElementsAre(8, 15, 30));
  EXPECT_THAT(versions(0xB139, 1), ElementsAre(43, 102));
  EXPECT_THAT(versions(0xB16E, 1), ElementsAre(5, 25));
  EXPECT_THAT(versions(0xB16F, 1), ElementsAre(4, 24));
  EXPECT_THAT(versions(0xB0EE, 1), ElementsAre(2));
  EXPECT_THAT(versions(0xB0EE, 2), ElementsAre(2));
}

TEST_F(AllRadiosStream, PacketsOfNRHaveSeveralVersions) {
  EXPECT_THAT(versions(0xB821, 1), ElementsAre(8, 17));
  EXPECT_THAT(versions(0xB822, 1), ElementsAre(3, 0x20000));
  EXPECT_THAT(versions(0xB823, 1), ElementsAre(4, 0x30002));
  EXPECT_THAT(versions(0xB97F, 1), ElementsAre(0x20009, 0x30000));
  EXPECT_THAT(versions(0xB80C, 1), ElementsAre(1, 0x30000));
}

TEST_F(AllRadiosStream, SubpacketsOfMeasurementsHaveSeveralVersions) {
  std::set<unsigned> found;
  for (const RadioMessage& message : messagesOf(0xB193, 1)) found.insert(message.u8(5));
  EXPECT_THAT(found, ElementsAre(19, 36, 48));
  found.clear();
  for (const RadioMessage& message : messagesOf(0xB195, 1)) found.insert(message.u8(5));
  EXPECT_THAT(found, ElementsAre(3, 4, 24));
}

TEST_F(AllRadiosStream, TheFirstSubscriptionUsesEveryRadio) {
  std::set<unsigned> codes;
  for (const RadioMessage& message : messages()) {
    if (message.subscription == 1)
      codes.insert(message.isOfModem() ? message.code() : 0xFF0000 | message.code());
  }
  EXPECT_THAT(codes,
              IsSupersetOf({0xB061u, 0xB062u, 0xB0C0u, 0xB0C1u, 0xB0C2u, 0xB0E2u, 0xB0E3u, 0xB0E4u, 0xB0E5u,
                            0xB0EAu, 0xB0EBu, 0xB0ECu, 0xB0EDu, 0xB0EEu, 0xB139u, 0xB166u, 0xB167u, 0xB168u,
                            0xB16Au, 0xB16Eu, 0xB16Fu, 0xB179u, 0xB17Fu, 0xB180u, 0xB193u, 0xB195u}));
  EXPECT_THAT(
      codes, IsSupersetOf({0xB800u, 0xB801u, 0xB80Au, 0xB80Bu, 0xB80Cu, 0xB821u, 0xB822u, 0xB823u, 0xB97Fu}));
  EXPECT_THAT(
      codes, IsSupersetOf({0x4005u, 0x4031u, 0x4116u, 0x4125u, 0x4127u, 0x412Fu, 0x4157u, 0x417Au, 0x4221u}));
  EXPECT_THAT(codes, IsSupersetOf({0x5072u, 0x5076u, 0x512Cu, 0x512Fu, 0x5134u, 0x5137u, 0x51F4u, 0x51F5u,
                                   0x51F6u, 0x51F8u, 0x51FBu, 0x51FDu, 0x51FFu}));
  EXPECT_THAT(codes, IsSupersetOf({0x7130u, 0x7131u, 0x7132u, 0x7135u, 0x713Au, 0x7150u, 0x119Cu, 0x134Fu,
                                   0xFF0000u, 0xFF0001u, 0xFF0002u}));
}

TEST_F(AllRadiosStream, TheSecondSubscriptionListensToLTEAndGSM) {
  EXPECT_FALSE(messagesOf(0xB17F, 2).empty());
  EXPECT_FALSE(messagesOf(0x5134, 2).empty());
  for (const unsigned code : {0xB193u, 0xB0EDu, 0xB97Fu, 0x4127u})
    EXPECT_TRUE(messagesOf(code, 2).empty()) << code;
}

struct Band {
  unsigned firstDownlink, lastDownlink, uplinkOffset;
};
const std::map<unsigned, Band> bands = {
    {3, {1200, 1949, 18000}},  {7, {2750, 3449, 18000}}, {8, {3450, 3799, 18000}},
    {20, {6150, 6449, 18000}}, {38, {37750, 38249, 0}},
};

TEST_F(AllRadiosStream, BandsFitChannelsAndCodesFitTheNetwork) {
  for (const RadioMessage& message : messagesOf(0xB0C2, 1)) {
    ASSERT_EQ(message.size(), 29u);
    const Band& band = bands.at(message.u32(19));
    EXPECT_THAT(message.u32(3), AllOf(Ge(band.firstDownlink), Le(band.lastDownlink)));
    EXPECT_EQ(message.u32(7), message.u32(3) + band.uplinkOffset);
    EXPECT_THAT(message.u8(11), AnyOf(25u, 50u, 75u, 100u));
    EXPECT_EQ(message.u16(23), 1u);
    EXPECT_EQ(message.u8(25), 2u);
    EXPECT_EQ(message.u16(26), 1u);
  }
  for (const RadioMessage& message : messagesOf(0xB0C2, 2)) {
    ASSERT_EQ(message.size(), 25u);
    const Band& band = bands.at(message.u32(15));
    EXPECT_THAT(message.u16(3), AllOf(Ge(band.firstDownlink), Le(band.lastDownlink)));
    EXPECT_EQ(message.u16(5), message.u16(3) + band.uplinkOffset);
    EXPECT_EQ(message.u16(19), 1u);
    EXPECT_EQ(message.u8(21), 3u);
    EXPECT_EQ(message.u16(22), 100u);
  }
}

// TS 38.104: n78 has 3300 to 3800 MHz.
TEST_F(AllRadiosStream, TheNRChannelLiesInItsBand) {
  for (const RadioMessage& message : messagesOf(0xB823, 1)) {
    const std::size_t shift = message.u32(0) == 4 ? 0 : 11;
    EXPECT_EQ(message.size(), message.u32(0) == 4 ? 38u : 49u);
    EXPECT_THAT(message.u32(6 + shift), AllOf(Ge(620000u), Le(653333u)));
    EXPECT_EQ(message.u16(36 + shift), 78u);
    EXPECT_EQ(message.u16(26 + shift), 1u);
  }
}

// Where one version of 0xB193 has its values, from the start of a cell.
struct Place {
  std::size_t byte;
  unsigned bit;
};
struct Layout {
  std::size_t firstCell, cellSize;
  std::vector<Place> rsrp, rsrq, rssi;
  Place rsrpOfAll, rsrqOfAll, rssiOfAll;
  double lowestOfAll_dbm;
};
const std::map<unsigned, Layout> layouts = {
    {19,
     {12,
      88,
      {{16, 10}, {20, 12}},
      {{28, 12}, {32, 0}},
      {{36, 10}, {36, 21}},
      {24, 12},
      {32, 20},
      {40, 0},
      -180}},
    {36,
     {12,
      128,
      {{16, 10}, {20, 12}, {24, 12}, {28, 0}},
      {{36, 0}, {36, 20}, {40, 10}, {40, 20}},
      {{48, 0}, {48, 11}, {52, 0}, {52, 11}},
      {28, 12},
      {44, 0},
      {56, 0},
      -140}},
    {48,
     {16,
      140,
      {{16, 10}, {20, 12}, {24, 12}, {32, 0}},
      {{40, 0}, {40, 20}, {44, 10}, {44, 20}},
      {{52, 0}, {52, 11}, {56, 0}, {56, 11}},
      {32, 12},
      {48, 0},
      {60, 0},
      -140}},
};

// One cell of 0xB193, in decibels.
struct MeasuredCell {
  unsigned channel, code, servingIndex;
  bool isServing;
  std::vector<double> rsrp, rsrq, rssi;
  double rsrpOfAll, rsrqOfAll, rssiOfAll;
};

std::vector<MeasuredCell> measuredCells(const RadioMessage& message) {
  const Layout& layout = layouts.at(message.u8(5));
  EXPECT_EQ(message.u8(4), 25u);
  EXPECT_EQ(message.u16(6) + 4, message.size());
  std::vector<MeasuredCell> cells;
  for (std::size_t i = 0; i < message.u16(12); ++i) {
    const std::size_t start = 4 + layout.firstCell + i * layout.cellSize;
    const auto value = [&](Place place, unsigned width, double lowest) {
      return message.bits(start + place.byte, place.bit, width) / 16.0 + lowest;
    };
    const unsigned word = message.u16(start);
    MeasuredCell cell{message.u32(8),
                      word & 0x1FF,
                      word >> 9 & 7,
                      (word >> 12 & 1) != 0,
                      {},
                      {},
                      {},
                      value(layout.rsrpOfAll, 12, layout.lowestOfAll_dbm),
                      value(layout.rsrqOfAll, 10, -30),
                      value(layout.rssiOfAll, 11, -110)};
    for (std::size_t antenna = 0; antenna < layout.rsrp.size(); ++antenna) {
      cell.rsrp.push_back(value(layout.rsrp[antenna], 12, -180));
      cell.rsrq.push_back(value(layout.rsrq[antenna], 10, -30));
      cell.rssi.push_back(value(layout.rssi[antenna], 11, -110));
    }
    cells.push_back(cell);
  }
  return cells;
}

// The decibels of the resource blocks of the town's channels.
const std::map<unsigned, double> blocks_db = {
    {1300, 20.0}, {2850, 18.75}, {3625, 13.98}, {6300, 16.99}, {37900, 20.0}};

// TS 36.214 5.1.3. An antenna that rests has no value at all.
TEST_F(AllRadiosStream, OnEveryAntennaQualityIsBlocksAndLevelLessPower) {
  int compared = 0, resting = 0;
  for (const RadioMessage& message : messagesOf(0xB193, 1)) {
    for (const MeasuredCell& cell : measuredCells(message)) {
      for (std::size_t antenna = 0; antenna < cell.rsrp.size(); ++antenna) {
        if (cell.rsrp[antenna] == -180) {
          EXPECT_EQ(cell.rsrq[antenna], -30);
          EXPECT_EQ(cell.rssi[antenna], -110);
          ++resting;
          continue;
        }
        EXPECT_THAT(cell.rsrp[antenna], AllOf(Ge(-135), Le(-40)));
        if (cell.rsrq[antenna] == -30) continue;  // the floor
        EXPECT_NEAR(cell.rsrq[antenna], blocks_db.at(cell.channel) + cell.rsrp[antenna] - cell.rssi[antenna],
                    0.08);
        ++compared;
      }
    }
  }
  EXPECT_GE(compared, 500);
  EXPECT_GE(resting, 20);
}

TEST_F(AllRadiosStream, TheCombinedValuesAreTheLargest) {
  for (const RadioMessage& message : messagesOf(0xB193, 1)) {
    for (const MeasuredCell& cell : measuredCells(message)) {
      EXPECT_EQ(cell.rsrpOfAll, std::ranges::max(cell.rsrp));
      EXPECT_EQ(cell.rsrqOfAll, std::ranges::max(cell.rsrq));
      EXPECT_EQ(cell.rssiOfAll, std::ranges::max(cell.rssi));
    }
  }
}

TEST_F(AllRadiosStream, SeveralCarriersAreReceivedAtOnce) {
  std::map<std::chrono::milliseconds, std::map<unsigned, unsigned>> channels;  // by time and serving index
  for (const RadioMessage& message : messagesOf(0xB193, 1)) {
    const auto cells = measuredCells(message);
    EXPECT_TRUE(cells.front().isServing);
    EXPECT_EQ(std::ranges::count(cells, true, &MeasuredCell::isServing), 1);
    channels[message.at][cells.front().servingIndex] = cells.front().channel;
  }
  std::size_t most = 0;
  for (const auto& [time, carriers] : channels) {
    std::set<unsigned> different;
    for (const auto& [index, channel] : carriers) different.insert(channel);
    EXPECT_EQ(different.size(), carriers.size());
    EXPECT_EQ(carriers.begin()->first, 0u);
    most = std::max(most, carriers.size());
  }
  EXPECT_GE(most, 2u);
}

// The channel and the code of a cell, to the start of its frames in milliseconds.
using FrameStarts = std::map<std::pair<unsigned, unsigned>, unsigned>;
void expectTheClock(FrameStarts& starts, const RadioMessage& message, std::pair<unsigned, unsigned> cell,
                    unsigned frame, unsigned subframe) {
  ASSERT_LE(frame, 1023u);
  ASSERT_LE(subframe, 9u);
  const unsigned start =
      (10 * frame + subframe + 10'240 - static_cast<unsigned>(message.at.count() % 10'240)) % 10'240;
  const auto [known, isNew] = starts.emplace(cell, start);
  EXPECT_EQ(known->second, start) << std::hex << message.code();
}

TEST_F(AllRadiosStream, FrameNumbersFollowTheClock) {
  FrameStarts starts;
  for (const RadioMessage& message : messagesOf(0xB193, 1)) {
    const std::size_t cell = 4 + layouts.at(message.u8(5)).firstCell;
    expectTheClock(starts, message, {message.u32(8), message.u16(cell) & 0x1FF},
                   message.bits(cell + 4, 0, 10), message.bits(cell + 4, 10, 4));
  }
  for (const RadioMessage& message : messagesOf(0xB179, 1)) {
    const bool isOld = message.u8(0) == 3;
    const unsigned channel = isOld ? message.u16(8) : message.u32(8), subframe = message.u16(isOld ? 12 : 14);
    expectTheClock(starts, message, {channel, message.u16(isOld ? 10 : 12)}, subframe / 10, subframe % 10);
  }
  for (const RadioMessage& message : messagesOf(0xB0C0, 1)) {
    if (message.u16(12) != 0)
      expectTheClock(starts, message, {message.u32(8), message.u16(6)}, message.bits(12, 4, 10),
                     message.bits(12, 0, 4));
  }
  for (const RadioMessage& message : messagesOf(0xB0C1, 1)) {
    const auto known = starts.find({message.u32(3), message.u16(1)});
    if (known == starts.end()) continue;
    EXPECT_EQ(message.u16(7), (static_cast<unsigned>(message.at.count()) + known->second) % 10'240 / 10);
  }
  EXPECT_GE(starts.size(), 3u);
}

TEST_F(AllRadiosStream, IdleLevelsFitEachOther) {
  for (const RadioMessage& message : messagesOf(0xB17F, 1)) {
    ASSERT_EQ(message.size(), 36u);
    const double rsrp = message.bits(12, 0, 12) / 16.0 - 180, rsrq = message.bits(20, 0, 10) / 16.0 - 30,
                 rssi = message.bits(24, 10, 11) / 16.0 - 110;
    // The values come from the better antenna of each.
    EXPECT_NEAR(rsrq, blocks_db.at(message.u32(4)) + rsrp - rssi, 3);
    EXPECT_NEAR(message.bits(28, 19, 7) - 50.0, message.bits(16, 0, 12) / 16.0 - 180 + 124, 1.1);
  }
}

TEST_F(AllRadiosStream, NeighborsAreOtherCellsThanTheServingOne) {
  for (const RadioMessage& message : messagesOf(0xB179, 1)) {
    const std::size_t shift = message.u8(0) == 3 ? 2 : 0, first = message.u8(0) == 3 ? 24 : 28;
    const unsigned neighbors = message.u8(24 - shift);
    EXPECT_EQ(message.size(), first + 12 * neighbors + 16 * message.u8(25 - shift));
    for (unsigned i = 0; i < neighbors; ++i) EXPECT_NE(message.u16(first + 12 * i), message.u16(12 - shift));
  }
  for (const RadioMessage& message : messagesOf(0xB195, 1)) {
    const bool isOld = message.u8(5) == 3;
    EXPECT_EQ(message.size(), 4 + (isOld ? 8 : 12) + 52 * (message.u8(isOld ? 10 : 12) & 0x3F));
    EXPECT_EQ(message.u16(6), message.size() - 4);
  }
}

TEST_F(AllRadiosStream, MessagesEndWithTheirPacket) {
  for (const RadioMessage& message : messages()) {
    if (!message.isOfModem()) continue;
    switch (message.code()) {
      case 0xB0C0: {
        const bool isNew = message.u8(0) >= 26;
        const std::size_t head = message.u8(0) == 30 ? 24 : isNew ? 21 : 19;
        EXPECT_EQ(message.size(), head + message.u16(isNew ? 19 : 17));
        break;
      }
      case 0xB821:
        EXPECT_EQ(message.size(), message.u32(0) == 8 ? 24 + message.u16(22) : 31 + message.u16(29));
        break;
      case 0x412F:
        EXPECT_EQ(message.size(), (message.u8(0) & 0x80 ? 8 : 4) + message.u16(2));
        break;
      case 0x512F:
        EXPECT_EQ(message.size(), 3 + message.u8(2));
        break;
      case 0x713A:
        EXPECT_EQ(message.size(), 5 + message.u32(1));
        break;
    }
  }
}

// All of one procedure: preamble, loss and temporary identity.
TEST_F(AllRadiosStream, ThePacketsOfARandomAccessAgree) {
  const auto reasons = messagesOf(0xB061, 1), attempts = messagesOf(0xB062, 1),
             preambles = messagesOf(0xB167, 1), answers = messagesOf(0xB168, 1);
  ASSERT_EQ(reasons.size(), attempts.size());
  ASSERT_EQ(reasons.size(), preambles.size());
  ASSERT_EQ(reasons.size(), answers.size());
  EXPECT_GE(reasons.size(), 8u);
  for (std::size_t i = 0; i < reasons.size(); ++i) {
    EXPECT_EQ(reasons[i].u8(32 + 12), attempts[i].u8(4 + 8));
    EXPECT_EQ(preambles[i].bits(4, 0, 6), attempts[i].u8(4 + 8));
    EXPECT_EQ(answers[i].bits(6, 0, 11), attempts[i].u16(4 + 17));
    EXPECT_EQ(answers[i].bits(8, 8, 16), attempts[i].u16(4 + 15));
  }
}

// 0 inactive, 1 pending, 2 active.
TEST_F(AllRadiosStream, BearersAreSetUpInSteps) {
  std::map<unsigned, unsigned> states;
  for (const RadioMessage& message : messagesOf(0xB0E4, 1)) {
    const unsigned previous = states[message.u8(1)];
    EXPECT_TRUE(message.u8(2) == 0 || message.u8(2) == previous + 1) << message.at.count();
    states[message.u8(1)] = message.u8(2);
  }
  EXPECT_TRUE(states.contains(5));
  EXPECT_TRUE(states.contains(7));
}

// n cells, or else the serving index, tells the cells of a layer. They end with the packet.
TEST_F(AllRadiosStream, MeasurementsOfNREndWithTheirPacket) {
  for (const RadioMessage& message : messagesOf(0xB97F, 1)) {
    const bool isOld = message.u32(0) == 0x20009;
    const unsigned cells = message.u8(20 + (isOld ? 4 : 5));
    EXPECT_EQ(message.size(), 20 + (isOld ? 32 : 40) + cells * (16 + (isOld ? 44 : 84)));
    EXPECT_EQ(message.u8(8), 1u);
  }
}

TEST_F(AllRadiosStream, TheBestAntennaOfAnNRCellGivesItsLevel) {
  for (const RadioMessage& message : messagesOf(0xB97F, 1)) {
    const std::size_t layer = message.u32(0) == 0x20009 ? 32 : 40, beam = 20 + layer + 16;
    EXPECT_EQ(message.i32(20 + layer + 8), std::max(message.i32(beam + 20), message.i32(beam + 24)));
  }
}

// Both phones are in the same pocket: the GSM network is the same one, and so are its levels.
TEST_F(AllRadiosStream, BothPhonesGoSideBySide) {
  std::map<unsigned, std::pair<std::chrono::milliseconds, unsigned>> levels;  // by channel
  int compared = 0;
  for (const RadioMessage& message : messages()) {
    if (!message.isOfModem() || message.code() != 0x5137) continue;
    for (std::size_t i = 0; i < message.u8(15); ++i) {
      const unsigned channel = message.u16(16 + 14 * i), level = message.u8(18 + 14 * i);
      const auto found = levels.find(channel);
      if (found != levels.end() && message.at - found->second.first < 300ms &&
          message.at != found->second.first) {
        EXPECT_NEAR(level, found->second.second, 6);
        ++compared;
      }
      levels[channel] = {message.at, level};
    }
  }
  EXPECT_GE(compared, 1);
}

}  // namespace
}  // namespace varnel::simulation
