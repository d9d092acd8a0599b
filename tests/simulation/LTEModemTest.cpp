#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdio>
#include <map>
#include <set>
#include <string>
#include <vector>

#include "platform/Dictionary.h"
#include "platform/PropertyList.h"
#include "platform/TelephonyService.h"
#include "programs/varnel-telephonyd/simulation/SimulatedModem.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;
using testing::AllOf;
using testing::AnyOf;
using testing::Contains;
using testing::Ge;
using testing::Gt;
using testing::Le;
using testing::MatchesRegex;
using testing::UnorderedElementsAre;

// One message without the prefix that some have.
struct Message {
  std::chrono::milliseconds at;
  bool hasPrefix;
  Bytes packet;

  unsigned u8(std::size_t offset) const { return packet.at(offset); }
  unsigned u16(std::size_t offset) const { return u8(offset) | u8(offset + 1) << 8; }
  unsigned u32(std::size_t offset) const { return u16(offset) | u16(offset + 2) << 16; }
  unsigned code() const { return (u8(0) == 0xFF ? 0xFF0000 : 0) | u16(3); }
  Value payload() const { return readPropertyList(ByteView(packet).subspan(13)).value_or(Value()); }
};

std::vector<Message> messages(std::uint64_t seed, std::chrono::milliseconds duration) {
  const auto modem = simulatedModem("kalvi-lte", seed);
  std::vector<Message> messages;
  for (SimulatedMessage next = modem->next(); next.at <= duration; next = modem->next()) {
    const bool hasPrefix = next.bytes.at(0) == 0x81;
    if (hasPrefix) next.bytes.erase(next.bytes.begin(), next.bytes.begin() + 2);
    messages.push_back({next.at, hasPrefix, next.bytes});
  }
  return messages;
}

std::vector<Message> messagesOf(unsigned code, std::chrono::milliseconds duration, std::uint64_t seed = 1) {
  std::vector<Message> all = messages(seed, duration);
  std::erase_if(all, [code](const Message& message) { return message.code() != code; });
  return all;
}

std::string text(const Value& dictionary, std::string_view key) {
  const std::string* found = dictionary.dictionary()->get(key).string();
  return found ? *found : "(none)";
}

std::int64_t number(const Value& dictionary, std::string_view key) {
  return dictionary.dictionary()->get(key).integer().value_or(-999);
}

TEST(SimulatedModems, OnlyWhatIsSimulatedIsMade) {
  EXPECT_THAT(simulatedTechnologies(), testing::ElementsAre("kalvi-lte"));
  EXPECT_EQ(simulatedModem("kalvi-lte", 1)->technology(), "kalvi-lte");
  EXPECT_EQ(simulatedModem("kalvi-5g", 1), nullptr);
}

TEST(LTEModem, TheSameSeedGivesTheSameMessages) {
  const auto one = simulatedModem("kalvi-lte", 42), other = simulatedModem("kalvi-lte", 42);
  for (int i = 0; i < 2000; ++i) {
    const SimulatedMessage first = one->next(), second = other->next();
    ASSERT_EQ(first.at, second.at) << i;
    ASSERT_EQ(first.bytes, second.bytes) << i;
  }
}

TEST(LTEModem, AnotherSeedGivesOtherMessages) {
  const auto one = messagesOf(0xB0C2, 1s, 1), other = messagesOf(0xB0C2, 1s, 2);
  EXPECT_NE(one.at(0).u32(22), other.at(0).u32(22));
}

TEST(LTEModem, TheMessagesAreTheSameOnEveryMachine) {
  const Message first = messagesOf(0xB0C2, 1s, 1).at(0);
  EXPECT_EQ(first.packet, (Bytes{0x01, 0x25, 0x00, 0xC2, 0xB0, 0x14, 0x00, 0x00, 0x00, 0x00, 0x00, 0x00, 0x00,
                                 0x03, 0x6C, 0x01, 0x0C, 0x94, 0x0C, 0x94, 0x64, 0x64, 0x0C, 0x5C, 0x1F, 0x00,
                                 0x2D, 0x32, 0x26, 0x00, 0x00, 0x00, 0x01, 0x00, 0x02, 0x01, 0x00, 0x00}));
}

TEST(LTEModem, TimeNeverGoesBack) {
  const auto all = messages(3, 10min);
  EXPECT_TRUE(std::ranges::is_sorted(all, {}, &Message::at));
}

TEST(LTEModem, AFewMessagesASecond) {
  const auto count = messages(4, 5min).size();
  EXPECT_THAT(count, AllOf(Ge(300u), Le(1500u)));
}

TEST(LTEModem, EveryKindOfMessageComesWithinTwoSeconds) {
  std::set<unsigned> codes;
  for (const Message& message : messages(5, 2s)) codes.insert(message.code());
  EXPECT_THAT(codes, UnorderedElementsAre(0xB0C1u, 0xB0C2u, 0xFF0000u, 0xFF0001u, 0xFF0002u));
}

TEST(LTEModem, SomeMessagesHaveThePrefixAndMostHaveNone) {
  const auto all = messages(6, 5min);
  const auto count = std::ranges::count(all, true, &Message::hasPrefix);
  EXPECT_THAT(count, AllOf(Gt(0), Le(std::ssize(all) / 4)));
}

TEST(LTEModem, HeadersSayTypeLengthAndTime) {
  for (const Message& message : messages(7, 1min)) {
    EXPECT_EQ(message.u8(0), message.u16(3) >= 0xB000 ? 1u : 0xFFu);
    EXPECT_EQ(message.u16(1), message.packet.size() - 1);
    EXPECT_EQ(message.u32(5), message.at.count());
    EXPECT_EQ(message.u32(9), 0u);
  }
}

struct Carrier {
  unsigned band, firstDownlink, lastDownlink, uplinkOffset;
};
const std::map<unsigned, Carrier> carriers = {
    {3, {3, 1200, 1949, 18000}},   {7, {7, 2750, 3449, 18000}}, {8, {8, 3450, 3799, 18000}},
    {20, {20, 6150, 6449, 18000}}, {38, {38, 37750, 38249, 0}},
};

TEST(LTEModem, ServingCellsAreBelievable) {
  std::set<unsigned> identities, areas, bands;
  for (const Message& cell : messagesOf(0xB0C2, 40min)) {
    ASSERT_EQ(cell.packet.size(), 38u);
    EXPECT_LE(cell.u16(14), 503u);
    const Carrier& carrier = carriers.at(cell.u32(28));
    EXPECT_THAT(cell.u16(16), AllOf(Ge(carrier.firstDownlink), Le(carrier.lastDownlink)));
    EXPECT_EQ(cell.u16(18), cell.u16(16) + carrier.uplinkOffset);
    EXPECT_THAT(cell.u8(20), AnyOf(6, 15, 25, 50, 75, 100));
    EXPECT_EQ(cell.u8(21), cell.u8(20));
    EXPECT_LT(cell.u32(22), 1u << 28);
    EXPECT_THAT(cell.u16(26), AllOf(Ge(1u), Le(0xFFFDu)));
    identities.insert(cell.u32(22));
    areas.insert(cell.u16(26));
    bands.insert(cell.u32(28));
  }
  // Once round the town.
  EXPECT_GE(identities.size(), 20u);
  EXPECT_EQ(areas.size(), 3u);
  EXPECT_GE(bands.size(), 2u);
}

TEST(LTEModem, TheServingCellChangesWithinMinutes) {
  for (const std::uint64_t seed : {1, 2, 3, 4, 5}) {
    std::set<unsigned> identities;
    for (const Message& cell : messagesOf(0xB0C2, 5min, seed)) identities.insert(cell.u32(22));
    EXPECT_GE(identities.size(), 3u) << seed;
  }
}

TEST(LTEModem, ACellKeepsItsArea) {
  std::map<unsigned, unsigned> areas;
  for (const Message& cell : messagesOf(0xB0C2, 40min)) {
    const auto [known, isNew] = areas.emplace(cell.u32(22), cell.u16(26));
    EXPECT_EQ(known->second, cell.u16(26));
  }
}

TEST(LTEModem, AntennasAreOneTwoOrFour) {
  const auto all = messagesOf(0xB0C1, 10min);
  EXPECT_GE(all.size(), 60u);
  for (const Message& message : all) {
    ASSERT_EQ(message.packet.size(), 22u);
    EXPECT_THAT(message.u8(20), AnyOf(1, 2, 4));
  }
}

TEST(LTEModem, SimFilesAreTexts) {
  const auto all = messagesOf(0xFF0000, 10min);
  EXPECT_GE(all.size(), 9u);
  const Value files = all.at(0).payload();
  ASSERT_NE(files.dictionary(), nullptr);
  EXPECT_EQ(files.dictionary()->size(), 14u);
  for (const auto& file : *files.dictionary()) {
    EXPECT_TRUE(file.key.starts_with("kSimFile_")) << file.key;
    ASSERT_NE(file.value.string(), nullptr) << file.key;
    EXPECT_FALSE(file.value.string()->empty()) << file.key;
  }
  EXPECT_THAT(text(files, "kSimFile_ICCID"), MatchesRegex("8900101[0-9]{12}"));
}

TEST(LTEModem, TheSimCardRegistersInTheServingCellsArea) {
  unsigned area = 0;
  std::set<std::string> locations;
  for (const Message& message : messages(1, 30min)) {
    if (message.code() == 0xB0C2) area = message.u16(26);
    if (message.code() != 0xFF0000 || area == 0) continue;
    const std::string location = text(message.payload(), "kSimFile_LOCI");
    char areaText[24];
    std::snprintf(areaText, sizeof areaText, "LAI 001-01-%04X", area);
    EXPECT_NE(location.find(areaText), std::string::npos) << location << ", not " << areaText;
    locations.insert(location);
  }
  EXPECT_GE(locations.size(), 3u);
}

TEST(LTEModem, TheCellMonitorTellsTheServingCellAndNeighboursOfEveryTechnology) {
  std::set<std::string> technologies;
  std::set<std::int64_t> levels;
  for (const Message& message : messagesOf(0xFF0001, 2min)) {
    const Value records = message.payload();
    ASSERT_NE(records.array(), nullptr);
    int serving = 0;
    for (const Value& record : *records.array()) {
      technologies.insert(text(record, cellMonitor::radioAccessTechnology));
      if (text(record, cellMonitor::cellType) != cellMonitor::serving) continue;
      ++serving;
      EXPECT_EQ(text(record, cellMonitor::radioAccessTechnology), "LTE");
      EXPECT_EQ(number(record, cellMonitor::mcc), 1);
      EXPECT_EQ(number(record, cellMonitor::mnc), 1);
      EXPECT_THAT(number(record, cellMonitor::physicalCellIdentity), AllOf(Ge(0), Le(503)));
      const Carrier& carrier = carriers.at(static_cast<unsigned>(number(record, cellMonitor::bandInfo)));
      EXPECT_THAT(number(record, cellMonitor::uarfcn),
                  AllOf(Ge(carrier.firstDownlink), Le(carrier.lastDownlink)));
      EXPECT_THAT(number(record, cellMonitor::rssi), AllOf(Ge(-130), Le(-40)));
      levels.insert(number(record, cellMonitor::rssi));
    }
    EXPECT_EQ(serving, 1);
  }
  EXPECT_THAT(technologies, UnorderedElementsAre("GSM", "LTE", "UMTS"));
  EXPECT_GE(levels.size(), 5u);
}

TEST(LTEModem, TheCellMonitorAgreesWithTheModem) {
  std::map<std::int64_t, std::int64_t> areas;
  for (const Message& message : messages(1, 5min)) {
    if (message.code() == 0xB0C2) areas[message.u32(22)] = message.u16(26);
    if (message.code() != 0xFF0001) continue;
    const Value serving = message.payload().array()->at(0);
    ASSERT_TRUE(areas.contains(number(serving, cellMonitor::cellIdentity)));
    EXPECT_EQ(number(serving, cellMonitor::trackingAreaCode),
              areas[number(serving, cellMonitor::cellIdentity)]);
  }
}

TEST(LTEModem, PacketDataContextsComeAndGo) {
  std::set<std::size_t> counts;
  std::set<std::string> accessPoints, states, received;
  for (const Message& message : messagesOf(0xFF0002, 10min)) {
    const Value contexts = message.payload();
    ASSERT_NE(contexts.array(), nullptr);
    counts.insert(contexts.array()->size());
    for (const Value& context : *contexts.array()) {
      for (const auto& row : *context.dictionary()) EXPECT_NE(row.value.string(), nullptr) << row.key;
      accessPoints.insert(text(context, "APN"));
      states.insert(text(context, "State"));
      if (text(context, "APN") == "internet") received.insert(text(context, "Bytes Received"));
    }
  }
  EXPECT_GE(counts.size(), 2u);
  EXPECT_THAT(accessPoints, UnorderedElementsAre("ims", "internet", "mms"));
  EXPECT_THAT(states, Contains("Active"));
  EXPECT_GE(states.size(), 2u);
  EXPECT_GE(received.size(), 50u);
}

}  // namespace
}  // namespace varnel
