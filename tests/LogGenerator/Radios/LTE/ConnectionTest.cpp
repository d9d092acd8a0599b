#include "LogGenerator/Radios/LTE/Connection.h"

#include <gtest/gtest.h>

#include "tests/support/AirMessages.h"
#include "tests/support/Describe.h"

namespace varnel::lte {

namespace {

class ConnectionTest : public testing::Test {
 protected:
  ConnectionTest() {
    section.dictionary()->set("RRC State", "");
    section.dictionary()->set("RRC Connections", "");
    decoder.updateSectionRef(section);
  }

  std::string shownAfter(unsigned channel, const Bytes& message) {
    const Bytes packet = lteRRCPacket(channel, message);
    decoder.updateWithData_logCode(Packet(packet), 0xB0C0);
    return described(section);
  }

  Connection decoder;
  Value section = Value::ofDictionary();
};

}  // namespace

TEST_F(ConnectionTest, SetupCompleteConnectsAndCounts) {
  EXPECT_EQ(shownAfter(11, {0x20}), R"({RRC State: "Connected", RRC Connections: "1"})");
  EXPECT_EQ(shownAfter(11, {0x20}), R"({RRC State: "Connected", RRC Connections: "2"})");
}

TEST_F(ConnectionTest, ResumeCompleteConnectsAndCounts) {
  EXPECT_EQ(shownAfter(11, {0x98}), R"({RRC State: "Connected", RRC Connections: "1"})");
}

TEST_F(ConnectionTest, MessagesOfADedicatedChannelMeanThatThePhoneIsConnected) {
  EXPECT_EQ(shownAfter(9, {0x20}), R"({RRC State: "Connected", RRC Connections: ""})");
  section.dictionary()->set("RRC State", "");
  EXPECT_EQ(shownAfter(11, {0x18}), R"({RRC State: "Connected", RRC Connections: ""})");
}

TEST_F(ConnectionTest, ReleaseAndRejectEndTheConnection) {
  shownAfter(11, {0x20});
  EXPECT_EQ(shownAfter(9, {0x28}), R"({RRC State: "Idle", RRC Connections: "1"})");
  section.dictionary()->set("RRC State", "");
  EXPECT_EQ(shownAfter(8, {0x40}), R"({RRC State: "Idle", RRC Connections: "1"})");
}

TEST_F(ConnectionTest, RejectedReestablishmentEndsTheConnection) {
  shownAfter(11, {0x20});
  EXPECT_EQ(shownAfter(8, {0x20}), R"({RRC State: "Idle", RRC Connections: "1"})");  // 0 01
  EXPECT_EQ(shownAfter(11, {0x18}), R"({RRC State: "Connected", RRC Connections: "1"})");
  EXPECT_EQ(shownAfter(48, {0x20}), R"({RRC State: "Idle", RRC Connections: "1"})");  // 0 01, narrow-band
}

TEST_F(ConnectionTest, ACommandToAnotherRadioEndsTheConnection) {
  shownAfter(11, {0x20});
  EXPECT_EQ(shownAfter(9, {0x18}), R"({RRC State: "Idle", RRC Connections: "1"})");        // 0 0011
  EXPECT_EQ(shownAfter(11, {0x18}), R"({RRC State: "Connected", RRC Connections: "1"})");  // re-established
}

TEST_F(ConnectionTest, MessagesOfCommonChannelsTellNothing) {
  for (const unsigned channel : {3U, 7U, 8U, 10U})
    EXPECT_EQ(shownAfter(channel, {0x00}), R"({RRC State: "", RRC Connections: ""})") << channel;
}

TEST_F(ConnectionTest, NarrowBandMessagesCountToo) {
  EXPECT_EQ(shownAfter(52, {0x10}), R"({RRC State: "Connected", RRC Connections: "1"})");  // 0 0010
  EXPECT_EQ(shownAfter(49, {0x20}), R"({RRC State: "Idle", RRC Connections: "1"})");       // 0 010
}

TEST_F(ConnectionTest, TheNumberThatTheSectionHoldsGoesOn) {
  section.dictionary()->set("RRC Connections", "7");
  EXPECT_EQ(shownAfter(11, {0x20}), R"({RRC State: "Connected", RRC Connections: "8"})");
}

}  // namespace varnel::lte
