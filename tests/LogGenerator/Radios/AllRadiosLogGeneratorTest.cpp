#include "LogGenerator/Radios/AllRadiosLogGenerator.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <fstream>
#include <iterator>
#include <map>
#include <set>

#include "base/PropertyList.h"
#include "model/VarnelModelNode.h"
#include "platform/TelephonyService.h"
#include "tests/support/PacketBuilder.h"
#include "tests/support/RecordingLog.h"
#include "tests/support/TestServices.h"

namespace varnel {
namespace {

using testing::Contains;
using testing::ElementsAre;
using testing::IsEmpty;
using Outcome = MessageFate::Outcome;

Value shipped(const std::string& resource) {
  std::ifstream file(VARNEL_SOURCE_DIR "/resources/" + resource + ".plist", std::ios::binary);
  const Bytes bytes{std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
  return readPropertyList(bytes, fileLimits).value_or(Value());
}

// A serving cell, 3GPP TS 36.331: band 13, EARFCN 5230.
Bytes servingCell(std::uint16_t physicalCell, std::uint8_t version = 3) {
  return PacketBuilder(0xB0C2, 42)
      .u8(13, version)
      .u16(14, physicalCell)
      .u32(16, 5230)
      .u32(20, 23230)
      .u8(24, 50)
      .u8(25, 50)
      .u32(26, 0x1234506)
      .u16(30, 4711)
      .u32(32, 13)
      .u16(36, 311)
      .u8(38, 3)
      .u16(39, 480)
      .bytes();
}

Bytes ofSubscription(std::uint8_t number, const Bytes& packet) {
  Bytes message{0x81, number};
  message.insert(message.end(), packet.begin(), packet.end());
  return message;
}

// Both links' circuit-switched state of GSM and UMTS.
Bytes mobilityManagement() { return PacketBuilder(0x7130, 20).u8(13, 1).bytes(); }

class AllRadiosLogGeneratorTest : public testing::Test {
 protected:
  AllRadiosLogGeneratorTest() {
    for (const char* name : {"AllRadios", "C2KTemplate", "KLV_GSM"})
      services.resources.add(name, shipped(name));
    reconnect();
  }

  void reconnect() {
    generator = LogGenerator::generatorFromTechnology(std::string(technology::allRadios), services.services);
  }

  void take(const Bytes& message) { generator->updateState_withData(state, message); }

  // The names of the display's groups, or of those under a SIM card, in the tree's order.
  std::vector<std::string> groups(const std::string& path = "/") {
    PathDictionary paths;
    VarnelModelNode::makeTreeFromObject_withPathDictionary(generator->generateLogUsingState(state), paths);
    std::vector<std::string> names;
    if (const auto found = paths.find(path); found != paths.end() && found->second->childNodes()) {
      for (const auto& child : *found->second->childNodes()) names.push_back(child->displayName());
    }
    return names;
  }

  std::string shown(std::string_view path) {
    return std::string(leafValueUnderPath(state.get(stateKey::display), path).value_or("(nothing)"));
  }

  RecordingLog log;
  TestServices services;
  std::unique_ptr<LogGenerator> generator;
  Dictionary state;
};

TEST_F(AllRadiosLogGeneratorTest, AGroupIsShownFromTheMessageOnThatSaysSomething) {
  EXPECT_THAT(groups(), IsEmpty());
  take(servingCell(17));
  EXPECT_EQ(shown("/LTE/Serving Cell/Physical Cell ID"), "17");
  EXPECT_THAT(groups(), ElementsAre("LTE"));
  take(mobilityManagement());
  EXPECT_THAT(groups(), ElementsAre("LTE", "Mobility Management"));
}

TEST_F(AllRadiosLogGeneratorTest, APacketThatIsTooShortShowsNoGroup) {
  const Bytes packet = servingCell(17);
  take(Bytes(packet.begin(), packet.end() - 1));
  EXPECT_THAT(groups(), IsEmpty());
  EXPECT_EQ(generator->messagesNotDecoded(), 1u);
}

TEST_F(AllRadiosLogGeneratorTest, APacketOfAnUnknownVersionIsNotDecoded) {
  take(servingCell(17, 3));
  EXPECT_EQ(generator->messagesNotDecoded(), 0u);
  take(servingCell(17, 37));
  EXPECT_EQ(generator->messagesNotDecoded(), 1u);
}

TEST_F(AllRadiosLogGeneratorTest, AnUnknownVersionIsShownAsSuch) {
  take(servingCell(17, 37));
  EXPECT_EQ(shown("/LTE/Serving Cell/Version"), "37 (not known)");
  EXPECT_EQ(shown("/LTE/Serving Cell/Physical Cell ID"), "");
}

TEST_F(AllRadiosLogGeneratorTest, SubscriptionsStandSideBySideAndNeverMix) {
  take(ofSubscription(1, servingCell(17)));
  take(ofSubscription(2, servingCell(18)));
  take(ofSubscription(2, mobilityManagement()));
  EXPECT_THAT(groups(), ElementsAre("SIM 1", "SIM 2"));
  EXPECT_THAT(groups("/SIM 1"), ElementsAre("LTE"));
  EXPECT_THAT(groups("/SIM 2"), ElementsAre("LTE", "Mobility Management"));
  EXPECT_EQ(shown("/SIM 1/LTE/Serving Cell/Physical Cell ID"), "17");
  EXPECT_EQ(shown("/SIM 2/LTE/Serving Cell/Physical Cell ID"), "18");
}

TEST_F(AllRadiosLogGeneratorTest, APrefixOf0NamesNoSubscription) {
  take(ofSubscription(0, servingCell(17)));
  EXPECT_THAT(groups(), ElementsAre("LTE"));
}

TEST_F(AllRadiosLogGeneratorTest, ASubscriptionThatSaysNothingIsNotShown) {
  take(ofSubscription(3, PacketBuilder(0x1234, 20).bytes()));
  EXPECT_THAT(groups(), IsEmpty());
}

TEST_F(AllRadiosLogGeneratorTest, MoreThanEightSubscriptionsAreNotDecoded) {
  for (std::uint8_t number = 1; number <= 8; ++number) take(ofSubscription(number, servingCell(number)));
  EXPECT_EQ(groups().size(), 8u);
  take(servingCell(9));
  EXPECT_EQ(generator->messagesNotDecoded(), 0u) << "messages without one have room";
  take(ofSubscription(9, servingCell(9)));
  EXPECT_EQ(generator->messagesNotDecoded(), 1u);
  EXPECT_EQ(groups().size(), 9u);
}

TEST_F(AllRadiosLogGeneratorTest, ANewGeneratorGoesOnWithTheDisplay) {
  take(servingCell(17));
  take(ofSubscription(2, servingCell(18)));
  const std::size_t before = groups().size();
  reconnect();
  EXPECT_TRUE(generator->changesDisplayOf(state));
  take(servingCell(19));
  take(ofSubscription(2, servingCell(20)));
  take(mobilityManagement());
  EXPECT_EQ(groups().size(), before + 1);
  EXPECT_EQ(shown("/LTE/Serving Cell/Physical Cell ID"), "19");
  EXPECT_EQ(shown("/SIM 2/LTE/Serving Cell/Physical Cell ID"), "20");
}

TEST_F(AllRadiosLogGeneratorTest, ANewGeneratorGoesOnWithWhatCameSinceTheLastDisplay) {
  const Bytes attachRequest = PacketBuilder(0xB0ED, 19).u8(13, 1).u8(17, 0x07).u8(18, 0x41).bytes();
  take(attachRequest);
  EXPECT_THAT(groups(), ElementsAre("Messages"));
  take(attachRequest);
  reconnect();
  take(attachRequest);
  EXPECT_THAT(groups(), ElementsAre("Messages"));
  EXPECT_EQ(shown("/Messages/Counts/LTE NAS Attach request"), "3");
  EXPECT_EQ(shown("/Messages/Last Messages/Messages/2/Name"), "Attach request");
}

TEST_F(AllRadiosLogGeneratorTest, AGeneratorThatEndsLaterLeavesTheCellsOfItsLastMessage) {
  services.clock.set({1'600'000'000, 0});
  take(PacketBuilder(0xB179, 53).u8(13, 4).u32(21, 6200).u8(37, 1).u16(41, 8).u16(43, 1600).bytes());
  EXPECT_THAT(groups(), ElementsAre("LTE"));
  services.clock.set({1'600'003'600, 0});
  generator.reset();
  EXPECT_EQ(shown("/LTE/Neighbors/Cells/0/Physical Cell ID"), "8");
}

TEST_F(AllRadiosLogGeneratorTest, TheDisplayOfAnotherTechnologyStands) {
  auto other =
      LogGenerator::generatorFromTechnology(std::string(technology::kalviGSMUMTS), services.services);
  other->updateState_withData(state, mobilityManagement());
  EXPECT_FALSE(generator->changesDisplayOf(state));
  take(servingCell(17));
  EXPECT_EQ(shown("/LTE/Serving Cell/Physical Cell ID"), "(nothing)");
  EXPECT_EQ(generator->messagesNotDecoded(), 1u);
}

TEST_F(AllRadiosLogGeneratorTest, CDMA2000IsAGroupThatOutlivesAReconnection) {
  const Bytes status = PacketBuilder(0x1183, 50).bytes();
  ASSERT_EQ(generator->fateOf(status).outcome, Outcome::Decoded);
  take(status);
  EXPECT_THAT(groups(), ElementsAre("CDMA2000"));
  const auto inner = groups("/CDMA2000");
  EXPECT_THAT(inner, Contains("EV-DO"));
  reconnect();
  take(status);
  EXPECT_EQ(groups("/CDMA2000"), inner);
}

TEST_F(AllRadiosLogGeneratorTest, TheStartCommandAsksForEachCodeOnce) {
  const Value command = generator->getStartCommand();
  EXPECT_EQ(*command.dictionary()->get("SetState").string(), "Streaming");
  std::map<std::int32_t, int> codes, extras;
  for (const Value& code : *command.dictionary()->get("SetKalviLogCodes").array()) ++codes[*code.int32()];
  for (const Value& code : *command.dictionary()->get("SetTkExtraCodes").array()) ++extras[*code.int32()];
  for (const auto& [code, count] : codes) EXPECT_EQ(count, 1) << code;
  for (const std::int32_t code : {0xB0C2, 0xB186, 0x7150, 0xD00A, 0x1183})
    EXPECT_TRUE(codes.contains(code)) << code;
  EXPECT_EQ(extras, (std::map<std::int32_t, int>{{0, 1}, {1, 1}, {2, 1}, {3, 1}}));
}

TEST_F(AllRadiosLogGeneratorTest, WhatBecomesOfAMessageNeedsNoDisplay) {
  EXPECT_EQ(generator->fateOf(servingCell(1)), (MessageFate{Outcome::Decoded, 0xB0C2}));
  EXPECT_EQ(generator->fateOf(servingCell(1, 37)),
            (MessageFate{Outcome::UnknownVersion, 0xB0C2, PacketVersion{37}}));
  EXPECT_EQ(generator->fateOf(PacketBuilder(0xB0C2, 20).u8(13, 3).bytes()),
            (MessageFate{Outcome::TooShort, 0xB0C2}));
  EXPECT_EQ(generator->fateOf(PacketBuilder(0x1234, 20).bytes()), (MessageFate{Outcome::Unknown, 0x1234}));
  EXPECT_EQ(generator->fateOf(Bytes(5)).outcome, Outcome::TooShort);
  EXPECT_EQ(generator->fateOf(Bytes(20)).outcome, Outcome::Unknown);
}

TEST_F(AllRadiosLogGeneratorTest, UnreadableSimFilesDoNoHarm) {
  take(serverMessageOfText(0xFF0000, "no property list"));
  EXPECT_THAT(groups(), IsEmpty());
}

TEST_F(AllRadiosLogGeneratorTest, SectionsTellWhenTheyWereWritten) {
  services.clock.set({1'000'000, 0});
  take(ofSubscription(2, servingCell(17)));
  const Value& groups = state.get(stateKey::display).dictionary()->get("SIM 2");
  const Value& section = groups.dictionary()->get("1;LTE").dictionary()->get("Serving Cell");
  EXPECT_EQ(generator->writtenAt(*section.dictionary(), "Band"), (Time{1'000'000, 0}));
  EXPECT_EQ(generator->writtenAt(*section.dictionary(), "Antennas"), std::nullopt);
}

TEST_F(AllRadiosLogGeneratorTest, WithoutItsTemplateNothingIsDecoded) {
  services.resources.remove("AllRadios");
  reconnect();
  EXPECT_EQ(generator->missingTemplate(), std::nullopt) << "nothing was asked for yet";
  take(servingCell(17));
  EXPECT_EQ(generator->missingTemplate(), "AllRadios.plist");
  EXPECT_TRUE(generator->generateLogUsingState(state).isAbsent());
}

// Each section of the template but those of the CDMA2000 group, which has a template of its own, gets
// packets.
TEST_F(AllRadiosLogGeneratorTest, EverySectionOfTheTemplateHasADecoder) {
  std::set<std::string> fed;
  for (const CodeSections& code : generator->codeSections())
    fed.insert(code.sections.begin(), code.sections.end());
  // The decoders of these have no log codes.
  const std::set<std::string> unfed = {"Cell Change Counters", "Coding Scheme", "UMTS RR Measurement",
                                       "Non-Ranked UMTS Set", "Non-Ranked GSM Set"};
  const Value all = shipped("AllRadios");
  for (const auto& [key, group] : *all.dictionary()) {
    if (!group.dictionary()) continue;
    for (const auto& [section, value] : *group.dictionary())
      EXPECT_EQ(fed.contains(section), !unfed.contains(section)) << key << ": " << section;
  }
}

}  // namespace
}  // namespace varnel
