#include "LogGenerator/Radios/LastMessages.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "tests/support/AirMessages.h"
#include "tests/support/Describe.h"

namespace varnel {

namespace {

class LastMessagesTest : public testing::Test {
 protected:
  LastMessagesTest() { bind(decoder, emptySection()); }

  static Value emptySection() {
    Value section = Value::ofDictionary();
    section.dictionary()->set("Version", "");
    section.dictionary()->set("Messages", Value::ofArray());
    return section;
  }
  void bind(LastMessages& to, const Value& newSection) {
    section = newSection;
    to.updateSectionRef(section);
    to.section().setTime({1588958709, 250'000'000});
  }
  void decode(const Bytes& packet, std::uint32_t logCode) {
    decoder.updateWithData_logCode(Packet(packet), logCode);
  }
  const Array& list() {
    decoder.prepareDisplay({});
    return *section.dictionary()->get("Messages").array();
  }

  MessageFeed feed;
  LastMessages decoder{feed};
  Value section;
};

}  // namespace

TEST_F(LastMessagesTest, AMessageOfLTEShowsItsCellAndFrame) {
  decode(lteRRCPacket(9, {0x20, 0x01, 0x02}, 683U << 4 | 5U), 0xB0C0);
  ASSERT_EQ(list().size(), 1U);
  EXPECT_EQ(
      described(list().front()),
      R"({Time: "2020-05-08 17:25:09.250 +0000", Radio: "LTE", Protocol: "RRC", Direction: "Downlink", )"
      R"(Channel: "DL-DCCH", Name: "RRCConnectionReconfiguration", EARFCN: "66536", )"
      R"(Physical Cell ID: "411", System Frame Number: "683", Length: "3"})");
  EXPECT_EQ(described(section.dictionary()->get("Version")), R"("26")");
}

TEST_F(LastMessagesTest, WhatAMessageDoesNotTellIsLeftOut) {
  decode(lteNASPacket(0xB0ED, {0x07, 0x41}), 0xB0ED);
  EXPECT_EQ(described(list().front()),
            R"({Time: "2020-05-08 17:25:09.250 +0000", Radio: "LTE", Protocol: "NAS", Direction: "Uplink", )"
            R"(Name: "Attach request", Length: "2"})");
}

TEST_F(LastMessagesTest, EachMessageShowsItsOwnMillisecond) {
  for (const Time time : {Time{1588958709, 250'000'000}, Time{1588958709, 7'999'999}, Time{1588958710, 0}}) {
    decoder.section().setTime(time);
    decode(lteNASPacket(0xB0ED, {0x07, 0x41}), 0xB0ED);
  }
  std::vector<std::string> times;
  for (const Value& record : list()) times.push_back(described(record.dictionary()->get("Time")));
  EXPECT_EQ(times, (std::vector<std::string>{quoted("2020-05-08 17:25:10.000 +0000"),
                                             quoted("2020-05-08 17:25:09.007 +0000"),
                                             quoted("2020-05-08 17:25:09.250 +0000")}));
}

TEST_F(LastMessagesTest, AMessageOfUMTSShowsItsScramblingCode) {
  decode(packetOfMessage(0x412F, {0x80, 1, 1, 0, 0x8E, 0x29, 0x23, 0x01}, Bytes{0x20}), 0x412F);
  EXPECT_EQ(described(list().front()),
            R"({Time: "2020-05-08 17:25:09.250 +0000", Radio: "UMTS", Protocol: "RRC", Direction: "Uplink", )"
            R"(Channel: "UL-CCCH", Name: "RRCConnectionRequest", UARFCN: "10638", Scrambling Code: "291", )"
            R"(Length: "1"})");
}

TEST_F(LastMessagesTest, TheNewestMessageComesFirstAndOnly50AreKept) {
  for (unsigned i = 0; i < 60; ++i) decode(lteRRCPacket(9, Bytes(1 + i, 0x20)), 0xB0C0);
  ASSERT_EQ(list().size(), 50U);
  EXPECT_EQ(described(list().front().dictionary()->get("Length")), R"("60")");
  EXPECT_EQ(described(list().back().dictionary()->get("Length")), R"("11")");
  decode(lteRRCPacket(9, Bytes(100, 0x20)), 0xB0C0);
  ASSERT_EQ(list().size(), 50U);
  EXPECT_EQ(described(list().front().dictionary()->get("Length")), R"("100")");
  EXPECT_EQ(described(list().back().dictionary()->get("Length")), R"("12")");
}

TEST_F(LastMessagesTest, AnUnknownVersionIsShownAndAddsNoMessage) {
  Bytes packet = lteRRCPacket(9, {0x20});
  packet.at(13) = 37;
  decode(packet, 0xB0C0);
  EXPECT_TRUE(list().empty());
  EXPECT_EQ(described(section.dictionary()->get("Version")), quoted("37 (not known)"));
  EXPECT_EQ(decoder.fateOf(Packet(packet), 0xB0C0),
            (MessageFate{MessageFate::Outcome::UnknownVersion, 0xB0C0, PacketVersion{37}}));
}

TEST_F(LastMessagesTest, ABrokenPacketChangesNothing) {
  Bytes packet = lteRRCPacket(9, {0x20});
  packet.pop_back();
  decode(packet, 0xB0C0);
  EXPECT_EQ(described(section), R"({Version: "", Messages: []})");
}

TEST_F(LastMessagesTest, AListThatTheSectionHoldsGoesOn) {
  decode(lteRRCPacket(9, Bytes(1, 0x20)), 0xB0C0);
  ASSERT_EQ(list().size(), 1U);
  LastMessages next;
  bind(next, section);
  const Bytes packet = lteRRCPacket(11, Bytes(2, 0x20));
  next.updateWithData_logCode(Packet(packet), 0xB0C0);
  next.prepareDisplay({});
  ASSERT_EQ(list().size(), 2U);
  EXPECT_EQ(described(list().front().dictionary()->get("Length")), R"("2")");
  EXPECT_EQ(described(list().back().dictionary()->get("Length")), R"("1")");
}

TEST_F(LastMessagesTest, ASectionWithoutAListGetsOne) {
  bind(decoder, Value::ofDictionary());
  decode(lteRRCPacket(9, Bytes(1, 0x20)), 0xB0C0);
  EXPECT_EQ(list().size(), 1U);
}

TEST_F(LastMessagesTest, SectionsOfOneFeedShareAReading) {
  LastMessages other(feed);
  const Value otherSection = emptySection();
  other.updateSectionRef(otherSection);
  const Bytes first = lteRRCPart(1, {0x20}), last = lteRRCPart(7, {0x00});
  for (const Bytes& packet : {first, last}) {
    other.updateWithData_logCode(Packet(packet), 0xB0C0);
    decode(packet, 0xB0C0);
  }
  other.prepareDisplay({});
  EXPECT_EQ(list().size(), 1U);
  EXPECT_EQ(otherSection.dictionary()->get("Messages").array()->size(), 1U);
}

TEST_F(LastMessagesTest, ThePacketThatComesTwiceIsTwoPackets) {
  LastMessages other(feed);
  for (int i = 0; i < 2; ++i) {
    const Bytes packet = lteRRCPacket(9, {0x20});
    decode(packet, 0xB0C0);
    other.updateWithData_logCode(Packet(packet), 0xB0C0);
  }
  EXPECT_EQ(list().size(), 2U);
}

}  // namespace varnel
