#include "LogGenerator/Radios/MessageCounts.h"

#include <gtest/gtest.h>

#include <string>

#include "tests/support/AirMessages.h"
#include "tests/support/Describe.h"

namespace varnel {

namespace {

class MessageCountsTest : public testing::Test {
 protected:
  MessageCountsTest() { decoder.updateSectionRef(section); }

  void decode(const Bytes& packet, std::uint32_t logCode) {
    decoder.updateWithData_logCode(Packet(packet), logCode);
  }
  // Prepares the display.
  std::string shown() {
    decoder.prepareDisplay({});
    return described(section);
  }
  std::string shown(std::string_view entry) {
    decoder.prepareDisplay({});
    return described(section.dictionary()->get(entry));
  }

  MessageFeed feed;
  MessageCounts decoder{feed};
  Value section = Value::ofDictionary();
};

}  // namespace

TEST_F(MessageCountsTest, EachNameOfEachRadioIsCounted) {
  decode(lteRRCPacket(7, {0x40}), 0xB0C0);
  decode(lteRRCPacket(7, {0x40, 0x00}), 0xB0C0);
  decode(lteNASPacket(0xB0ED, {0x07, 0x41}), 0xB0ED);
  decode(gsmRRPacket(0x0D), 0x512F);
  EXPECT_EQ(shown(), R"({LTE RRC Paging: "2", LTE NAS Attach request: "1", GSM RR Channel Release: "1"})");
}

TEST_F(MessageCountsTest, CountsThatTheSectionHoldsGoOn) {
  section.dictionary()->set("LTE RRC Paging", "41");
  decode(lteRRCPacket(7, {0x40}), 0xB0C0);
  EXPECT_EQ(shown("LTE RRC Paging"), R"("42")");
  MessageCounts next;
  next.updateSectionRef(section);
  const Bytes packet = lteRRCPacket(7, {0x40});
  next.updateWithData_logCode(Packet(packet), 0xB0C0);
  next.prepareDisplay({});
  EXPECT_EQ(shown("LTE RRC Paging"), R"("43")");
}

TEST_F(MessageCountsTest, OneNameFromTwoChannelsIsOneEntry) {
  decode(lteRRCPacket(9, {0x30}), 0xB0C0);   // DL-DCCH, 0 0110
  decode(lteRRCPacket(49, {0x30}), 0xB0C0);  // DL-DCCH-NB, 0 011
  EXPECT_EQ(shown(), R"({LTE RRC SecurityModeCommand: "2"})");
}

TEST_F(MessageCountsTest, FurtherNamesThan200CountAsOther) {
  for (unsigned i = 0; i < 199; ++i) section.dictionary()->set("Name " + std::to_string(i), "1");
  decode(lteRRCPacket(7, {0x40}), 0xB0C0);
  decode(gsmRRPacket(0x0D), 0x512F);
  decode(gsmRRPacket(0x3F), 0x512F);
  decode(lteRRCPacket(7, {0x40}), 0xB0C0);
  EXPECT_EQ(shown("LTE RRC Paging"), R"("2")");
  EXPECT_EQ(shown("Other"), R"("2")");
  EXPECT_EQ(section.dictionary()->size(), 201U);
}

TEST_F(MessageCountsTest, AnUnknownVersionCountsNothing) {
  Bytes packet = lteRRCPacket(7, {0x40});
  packet.at(13) = 37;
  decode(packet, 0xB0C0);
  EXPECT_EQ(shown(), "{}");
}

TEST_F(MessageCountsTest, TheDisplayTellsWhenAnEntryWasWritten) {
  decoder.section().setTime({1000, 0});
  decode(lteRRCPacket(7, {0x40}), 0xB0C0);
  decoder.prepareDisplay({2000, 0});
  EXPECT_EQ(decoder.section().writtenAt("LTE RRC Paging"), (Time{1000, 0}));
  EXPECT_EQ(shown("LTE RRC Paging"), R"("1")");
}

}  // namespace varnel
