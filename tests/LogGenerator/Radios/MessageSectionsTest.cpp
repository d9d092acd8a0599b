#include <gtest/gtest.h>

#include <algorithm>
#include <cstdint>
#include <string>
#include <string_view>

#include "LogGenerator/Radios/LTE/Connection.h"
#include "LogGenerator/Radios/LastMessages.h"
#include "LogGenerator/Radios/MessageCounts.h"
#include "tests/LogGenerator/Radios/MessagePackets.h"
#include "tests/support/Describe.h"

namespace varnel {

namespace {

using Outcome = MessageFate::Outcome;

// 2020-05-08 17:25:31.250
constexpr Time someTime{1588958731, 250'000'000};

template <class Decoder>
void give(Decoder& decoder, const Bytes& packet, std::uint32_t logCode) {
  decoder.updateWithData_logCode(Packet(packet), logCode);
}

std::string shown(const Value& section, std::string_view entry) {
  return described(section.dictionary()->get(entry));
}

// A message on DL-DCCH; its length tells it from others.
Bytes reconfiguration(unsigned length) {
  Bytes message(length);
  message.at(0) = 0x20;
  return lteRRC(26).channel(9).cell(411).channelNumber(66536).message(message).packet();
}

Bytes lteUnknownVersion(std::uint8_t version) { return PacketBuilder(0xB0C0, 64).u8(13, version).bytes(); }

class LastMessagesSection : public testing::Test {
 protected:
  LastMessagesSection() {
    decoder.updateSectionRef(section);
    decoder.section().setTime(someTime);
  }

  std::string first() {
    decoder.prepareDisplay(someTime);
    const Array& list = *section.dictionary()->get("Messages").array();
    return list.empty() ? "none" : described(list.front());
  }
  std::string lengths() {
    decoder.prepareDisplay(someTime);
    std::string text;
    const Value messages = section.dictionary()->get("Messages");
    for (const Value& message : *messages.array()) {
      text += std::string(*message.dictionary()->get("Length").string()) + " ";
    }
    return text;
  }
  // What the first record holds under the label, or "left out".
  std::string field(std::string_view label) {
    decoder.prepareDisplay(someTime);
    const Value record = section.dictionary()->get("Messages").array()->front();
    return std::string(record.dictionary()->get(label).string() ? *record.dictionary()->get(label).string()
                                                                : "left out");
  }

  LastMessages decoder;
  Value section = Value::ofDictionary();
};

}  // namespace

// Last Messages

TEST_F(LastMessagesSection, ItsNameAndLogCodes) {
  EXPECT_EQ(decoder.getSectionName(), "Last Messages");
  for (const std::uint32_t logCode : airMessageLogCodes()) {
    const auto codes = decoder.getLogCodeArray();
    EXPECT_NE(std::find(codes.begin(), codes.end(), logCode), codes.end()) << logCode;
  }
}

TEST_F(LastMessagesSection, AMessageOfLTE) {
  give(
      decoder,
      lteRRC(15).channel(9).cell(301).channelNumber(5230).frameWord(0x0B57).message({0x08, 1, 2, 3}).packet(),
      0xB0C0);
  EXPECT_EQ(first(),
            R"({Time: "2020-05-08 17:25:31.250 +0000", Radio: "LTE", Protocol: "RRC", Direction: "Uplink", )"
            R"(Channel: "UL-DCCH", Name: "MeasurementReport", EARFCN: "5230", Physical Cell ID: "301", )"
            R"(System Frame Number: "181", Length: "4"})");
  EXPECT_EQ(shown(section, "Version"), quoted("15"));
}

TEST_F(LastMessagesSection, AMessageOfNR) {
  give(decoder,
       nrRRC(8)
           .channel(1)
           .cell(801)
           .channelNumber(504990)
           .number(13, 0x02AB0038, 4)
           .message({0x00, 0, 0})
           .packet(),
       0xB821);
  EXPECT_EQ(first(),
            R"({Time: "2020-05-08 17:25:31.250 +0000", Radio: "NR", Protocol: "RRC", Direction: "Downlink", )"
            R"(Channel: "BCCH-BCH", Name: "MIB", NR-ARFCN: "504990", Physical Cell ID: "801", )"
            R"(System Frame Number: "683", Length: "3"})");
  EXPECT_EQ(shown(section, "Version"), quoted("8"));
}

TEST_F(LastMessagesSection, AMessageOfUMTS) {
  give(decoder, umtsRRCWithCell(0x83, 10638, 291, {0x3C, 0}), 0x412F);
  EXPECT_EQ(
      first(),
      R"({Time: "2020-05-08 17:25:31.250 +0000", Radio: "UMTS", Protocol: "RRC", Direction: "Downlink", )"
      R"(Channel: "DL-DCCH", Name: "RRCConnectionRelease", UARFCN: "10638", Scrambling Code: "291", )"
      R"(Length: "2"})");
}

TEST_F(LastMessagesSection, AMessageOfGSM) {
  give(decoder, gsmRR(0x85, 0x0D, {0x06, 0x0D, 0x00}), 0x512F);
  EXPECT_EQ(first(),
            R"({Time: "2020-05-08 17:25:31.250 +0000", Radio: "GSM", Protocol: "RR", Direction: "Downlink", )"
            R"(Channel: "SDCCH", Name: "Channel Release", Length: "3"})");
}

TEST_F(LastMessagesSection, NASMessagesHaveNoChannel) {
  give(decoder, nrNAS(0xB80B, {0x7E, 0x00, 0x41, 0x79}), 0xB80B);
  EXPECT_EQ(first(),
            R"({Time: "2020-05-08 17:25:31.250 +0000", Radio: "NR", Protocol: "NAS", Direction: "Uplink", )"
            R"(Name: "Registration request", Length: "4"})");
  give(decoder, circuitNAS(1, {0x05, 0x08}), 0x713A);
  EXPECT_EQ(first(),
            R"({Time: "2020-05-08 17:25:31.250 +0000", Radio: "GSM", Protocol: "NAS", Direction: "Uplink", )"
            R"(Name: "Location Updating Request", Length: "2"})");
}

TEST_F(LastMessagesSection, AFrameThatIsNotKnownIsLeftOut) {
  give(decoder, reconfiguration(3), 0xB0C0);
  EXPECT_EQ(field("System Frame Number"), "left out");
  EXPECT_EQ(field("EARFCN"), "66536");
}

TEST_F(LastMessagesSection, ACellOfNRThatIsNotKnownIsLeftOut) {
  give(decoder, nrRRC(8).channel(9).message({0x08, 0}).packet(), 0xB821);
  EXPECT_EQ(field("NR-ARFCN"), "left out");
  EXPECT_EQ(field("Physical Cell ID"), "left out");
  EXPECT_EQ(field("Channel"), "left out");
  EXPECT_EQ(field("Name"), "RRCReconfiguration");
}

TEST_F(LastMessagesSection, MillisecondsHaveThreeDigits) {
  decoder.section().setTime({1588958731, 4'999'999});
  give(decoder, reconfiguration(3), 0xB0C0);
  EXPECT_EQ(field("Time"), "2020-05-08 17:25:31.004 +0000");
  decoder.section().setTime({1588958731, 999'999'999});
  give(decoder, reconfiguration(3), 0xB0C0);
  EXPECT_EQ(field("Time"), "2020-05-08 17:25:31.999 +0000");
}

TEST_F(LastMessagesSection, TheNewestComesFirstAndAtMost50Stay) {
  for (unsigned length = 1; length <= 3; ++length) give(decoder, reconfiguration(length), 0xB0C0);
  EXPECT_EQ(lengths(), "3 2 1 ");
  for (unsigned length = 4; length <= 50; ++length) give(decoder, reconfiguration(length), 0xB0C0);
  EXPECT_EQ(section.dictionary()->get("Messages").array()->size(), 3U);  // until the display is prepared
  EXPECT_TRUE(lengths().starts_with("50 49 48 ") && lengths().ends_with(" 3 2 1 ")) << lengths();
  give(decoder, reconfiguration(51), 0xB0C0);
  EXPECT_TRUE(lengths().starts_with("51 50 49 ") && lengths().ends_with(" 4 3 2 ")) << lengths();
  EXPECT_EQ(section.dictionary()->get("Messages").array()->size(), 50U);
  for (unsigned length = 1; length <= 1000; ++length) give(decoder, reconfiguration(length), 0xB0C0);
  EXPECT_TRUE(lengths().starts_with("1000 999 ") && lengths().ends_with(" 952 951 ")) << lengths();
  EXPECT_EQ(section.dictionary()->get("Messages").array()->size(), 50U);
}

TEST_F(LastMessagesSection, ADisplayWithoutNewMessagesStaysAsItIs) {
  give(decoder, reconfiguration(5), 0xB0C0);
  EXPECT_EQ(lengths(), "5 ");
  EXPECT_EQ(lengths(), "5 ");
}

TEST_F(LastMessagesSection, APartOfAMessageIsNoMessage) {
  give(decoder, reconfiguration(2), 0xB0C0);
  give(decoder, lteRRC(30).channel(9).segment(1).message({0x28, 0}).packet(), 0xB0C0);
  EXPECT_EQ(lengths(), "2 ");
  give(decoder, lteRRC(30).channel(9).segment(7).message({0}).packet(), 0xB0C0);
  EXPECT_EQ(lengths(), "3 2 ");
  EXPECT_EQ(field("Name"), "RRCConnectionRelease");
}

TEST_F(LastMessagesSection, AnUnknownVersionChangesTheVersionOnly) {
  give(decoder, reconfiguration(5), 0xB0C0);
  EXPECT_EQ(lengths(), "5 ");
  give(decoder, lteUnknownVersion(37), 0xB0C0);
  EXPECT_EQ(lengths(), "5 ");
  EXPECT_EQ(shown(section, "Version"), quoted("37 (not known)"));
  give(decoder, PacketBuilder(0xB821, 64).u32(13, 0x30002).bytes(), 0xB821);
  EXPECT_EQ(lengths(), "5 ");
  EXPECT_EQ(shown(section, "Version"), quoted("3.2 (not known)"));
  give(decoder, reconfiguration(6), 0xB0C0);
  EXPECT_EQ(lengths(), "6 5 ");
  EXPECT_EQ(shown(section, "Version"), quoted("26"));
}

TEST_F(LastMessagesSection, APacketWithoutAVersionLeavesTheVersion) {
  give(decoder, reconfiguration(5), 0xB0C0);
  give(decoder, gsmRR(0x85, 0x0D, {0x06, 0x0D, 0x00}), 0x512F);
  EXPECT_EQ(lengths(), "3 5 ");
  EXPECT_EQ(shown(section, "Version"), quoted("26"));
}

TEST_F(LastMessagesSection, ABrokenPacketAddsNothing) {
  give(decoder, reconfiguration(5), 0xB0C0);
  Bytes packet = reconfiguration(9);
  for (std::size_t size = packet.size(); size-- > 0;) {
    packet.resize(size);
    give(decoder, packet, 0xB0C0);
    EXPECT_EQ(decoder.fateOf(Packet(packet), 0xB0C0).outcome, Outcome::TooShort) << size;
  }
  EXPECT_EQ(lengths(), "5 ");
}

TEST_F(LastMessagesSection, FatesOfPackets) {
  const Bytes known = reconfiguration(5), unknown = lteUnknownVersion(37);
  EXPECT_EQ(decoder.fateOf(Packet(known), 0xB0C0), (MessageFate{Outcome::Decoded, 0xB0C0}));
  EXPECT_EQ(decoder.fateOf(Packet(unknown), 0xB0C0),
            (MessageFate{Outcome::UnknownVersion, 0xB0C0, PacketVersion{37}}));
}

TEST_F(LastMessagesSection, ANewDecoderGoesOnWithAFullList) {
  for (unsigned length = 1; length <= 50; ++length) give(decoder, reconfiguration(length), 0xB0C0);
  decoder.prepareDisplay(someTime);
  LastMessages next;
  next.updateSectionRef(section);
  next.section().setTime(someTime);
  give(next, reconfiguration(100), 0xB0C0);
  next.prepareDisplay(someTime);
  const Array& list = *section.dictionary()->get("Messages").array();
  ASSERT_EQ(list.size(), 50U);
  EXPECT_EQ(described(list.front().dictionary()->get("Length")), quoted("100"));
  EXPECT_EQ(described(list[1].dictionary()->get("Length")), quoted("50"));
  EXPECT_EQ(described(list.back().dictionary()->get("Length")), quoted("2"));
}

TEST_F(LastMessagesSection, AnotherSectionStartsWithItsOwnMessages) {
  give(decoder, reconfiguration(5), 0xB0C0);
  EXPECT_EQ(lengths(), "5 ");
  const Value first = section;
  section = Value::ofDictionary();
  decoder.updateSectionRef(section);
  give(decoder, reconfiguration(6), 0xB0C0);
  EXPECT_EQ(lengths(), "6 ");
  EXPECT_EQ(shown(section, "Version"), quoted("26"));
  EXPECT_EQ(first.dictionary()->get("Messages").array()->size(), 1U);
}

// Counts

namespace {

class CountsSection : public testing::Test {
 protected:
  CountsSection() {
    decoder.updateSectionRef(section);
    decoder.section().setTime(someTime);
  }

  std::string counts() {
    decoder.prepareDisplay(someTime);
    return described(section);
  }
  std::string count(std::string_view name) {
    decoder.prepareDisplay(someTime);
    return shown(section, name);
  }

  MessageCounts decoder;
  Value section = Value::ofDictionary();
};

}  // namespace

TEST_F(CountsSection, EachRadioProtocolAndNameCountsByItself) {
  EXPECT_EQ(decoder.getSectionName(), "Counts");
  give(decoder, reconfiguration(5), 0xB0C0);
  give(decoder, reconfiguration(9), 0xB0C0);
  give(decoder, nrRRC(26).channel(6).message({0, 0}).packet(), 0xB821);
  give(decoder, lteRRC(26).channel(7).message({0, 0}).packet(), 0xB0C0);
  give(decoder, lteNAS(0xB0ED, {0x07, 0x55}), 0xB0ED);
  give(decoder, nrNAS(0xB80A, {0x7E, 0x00, 0x5B}), 0xB80A);
  give(decoder, gsmRR(0x83, 0x3F, {0x2D, 0x06, 0x3F}), 0x512F);
  give(decoder, circuitNAS(0, {0x05, 0x18}), 0x713A);
  give(decoder, umtsRRC(6, {0x00, 0}), 0x412F);
  give(decoder, circuitNAS(0, {0x05, 0x18}), 0x713A);
  EXPECT_EQ(count("LTE RRC RRCConnectionReconfiguration"), quoted("2"));
  EXPECT_EQ(count("NR RRC Paging"), quoted("1"));
  EXPECT_EQ(count("LTE RRC Paging"), quoted("1"));
  EXPECT_EQ(count("LTE NAS Identity request"), quoted("1"));
  EXPECT_EQ(count("NR NAS Identity request"), quoted("1"));
  EXPECT_EQ(count("GSM RR Immediate Assignment"), quoted("1"));
  EXPECT_EQ(count("GSM NAS Identity Request"), quoted("1"));
  EXPECT_EQ(count("UMTS RRC PagingType1"), quoted("1"));
  EXPECT_EQ(count("UMTS NAS Identity Request"), quoted("1"));
}

TEST_F(CountsSection, BothDirectionsOfANameAreOneCount) {
  give(decoder, lteNAS(0xB0EC, {0x07, 0x45}), 0xB0EC);
  give(decoder, lteNAS(0xB0ED, {0x07, 0x45}), 0xB0ED);
  EXPECT_EQ(counts(), R"({LTE NAS Detach request: "2"})");
}

TEST_F(CountsSection, WhatIsNoMessageDoesNotCount) {
  give(decoder, lteUnknownVersion(37), 0xB0C0);
  give(decoder, lteRRC(30).channel(9).segment(1).message({0x28, 0}).packet(), 0xB0C0);
  Bytes broken = reconfiguration(5);
  broken.pop_back();
  give(decoder, broken, 0xB0C0);
  EXPECT_EQ(counts(), "{}");
  give(decoder, lteRRC(30).channel(9).segment(7).message({0}).packet(), 0xB0C0);
  EXPECT_EQ(counts(), R"({LTE RRC RRCConnectionRelease: "1"})");
}

TEST_F(CountsSection, TheNames201AndFollowingCountAsOther) {
  for (unsigned i = 0; i < 200; ++i) section.dictionary()->set("GSM RR Name " + std::to_string(i), "7");
  give(decoder, reconfiguration(5), 0xB0C0);
  give(decoder, lteNAS(0xB0ED, {0x07, 0x55}), 0xB0ED);
  EXPECT_EQ(count("Other"), quoted("2"));
  EXPECT_EQ(section.dictionary()->size(), 201U);
  EXPECT_EQ(count("LTE RRC RRCConnectionReconfiguration"), "absent");
  EXPECT_EQ(count("GSM RR Name 0"), quoted("7"));
}

TEST_F(CountsSection, TheName200IsCounted) {
  for (unsigned i = 0; i < 199; ++i) section.dictionary()->set("GSM RR Name " + std::to_string(i), "7");
  give(decoder, reconfiguration(5), 0xB0C0);
  EXPECT_EQ(count("LTE RRC RRCConnectionReconfiguration"), quoted("1"));
  EXPECT_EQ(count("Other"), "absent");
}

TEST_F(CountsSection, ANewDecoderGoesOnWithOthersToo) {
  for (unsigned i = 0; i < 200; ++i) section.dictionary()->set("GSM RR Name " + std::to_string(i), "7");
  give(decoder, reconfiguration(5), 0xB0C0);
  MessageCounts next;
  next.updateSectionRef(section);
  next.section().setTime(someTime);
  give(next, reconfiguration(5), 0xB0C0);
  next.prepareDisplay(someTime);
  EXPECT_EQ(count("Other"), quoted("2"));
  EXPECT_EQ(section.dictionary()->size(), 201U);
}

TEST_F(CountsSection, ManyMessagesAreCounted) {
  for (unsigned i = 0; i < 70000; ++i) give(decoder, gsmRR(0x85, 0x0D, {0x06, 0x0D}), 0x512F);
  EXPECT_EQ(counts(), R"({GSM RR Channel Release: "70000"})");
}

TEST_F(CountsSection, AnotherSectionStartsAnew) {
  give(decoder, reconfiguration(5), 0xB0C0);
  give(decoder, reconfiguration(5), 0xB0C0);
  EXPECT_EQ(count("LTE RRC RRCConnectionReconfiguration"), quoted("2"));
  const Value first = section;
  section = Value::ofDictionary();
  decoder.updateSectionRef(section);
  give(decoder, reconfiguration(5), 0xB0C0);
  EXPECT_EQ(count("LTE RRC RRCConnectionReconfiguration"), quoted("1"));
  EXPECT_EQ(shown(first, "LTE RRC RRCConnectionReconfiguration"), quoted("2"));
}

// Connection

namespace {

class ConnectionSection : public testing::Test {
 protected:
  ConnectionSection() {
    decoder.updateSectionRef(section);
    decoder.section().setTime(someTime);
  }

  // On a channel of version 26: 8 DL-CCCH, 9 DL-DCCH, 10 UL-CCCH, 11 UL-DCCH.
  void message(std::uint8_t channel, std::string_view bits) {
    Bytes bytes = bytesOfBits(bits);
    bytes.insert(bytes.end(), {0, 0});
    give(decoder, lteRRC(26).channel(channel).cell(1).channelNumber(100).message(bytes).packet(), 0xB0C0);
    decoder.prepareDisplay(someTime);
  }
  std::string state() const { return shown(section, "RRC State"); }
  std::string count() const { return shown(section, "RRC Connections"); }

  lte::Connection decoder;
  Value section = Value::ofDictionary();
};

}  // namespace

TEST_F(ConnectionSection, ASetupIsConnectedWhenItIsComplete) {
  EXPECT_EQ(decoder.getSectionName(), "Connection");
  message(10, "0 1");  // RRCConnectionRequest
  message(8, "0 11");  // RRCConnectionSetup
  EXPECT_NE(state(), quoted("Connected"));
  message(11, "0 0100");  // RRCConnectionSetupComplete
  EXPECT_EQ(state(), quoted("Connected"));
  EXPECT_EQ(count(), quoted("1"));
  message(9, "0 0100");  // RRCConnectionReconfiguration
  EXPECT_EQ(state(), quoted("Connected"));
  EXPECT_EQ(count(), quoted("1"));
  message(9, "0 0101");  // RRCConnectionRelease
  EXPECT_EQ(state(), quoted("Idle"));
  EXPECT_EQ(count(), quoted("1"));
}

TEST_F(ConnectionSection, AReestablishmentIsConnectedButNoNewConnection) {
  message(11, "0 0011");  // RRCConnectionReestablishmentComplete
  EXPECT_EQ(state(), quoted("Connected"));
  EXPECT_TRUE(count() == quoted("0") || count() == "absent" || count() == quoted("")) << count();
}

TEST_F(ConnectionSection, AResumptionIsAConnection) {
  message(11, "1 0 0110");  // RRCConnectionResumeComplete
  EXPECT_EQ(state(), quoted("Connected"));
  EXPECT_EQ(count(), quoted("1"));
  message(11, "0 0100");
  EXPECT_EQ(count(), quoted("2"));
}

TEST_F(ConnectionSection, ARejectionIsIdle) {
  message(9, "0 0111");  // UECapabilityEnquiry
  EXPECT_EQ(state(), quoted("Connected"));
  message(8, "0 10");  // RRCConnectionReject
  EXPECT_EQ(state(), quoted("Idle"));
}

TEST_F(ConnectionSection, AnyMessageOfTheDedicatedChannelsIsConnected) {
  message(11, "0 0001");  // MeasurementReport
  EXPECT_EQ(state(), quoted("Connected"));
  message(9, "0 0101");
  EXPECT_EQ(state(), quoted("Idle"));
  message(9, "0 0110");  // SecurityModeCommand
  EXPECT_EQ(state(), quoted("Connected"));
}

TEST_F(ConnectionSection, MessagesOfCommonChannelsLeaveTheState) {
  message(9, "0 0101");
  message(7, "0");     // Paging
  message(3, "0 1");   // SystemInformationBlockType1
  message(10, "0 0");  // RRCConnectionReestablishmentRequest
  EXPECT_EQ(state(), quoted("Idle"));
  message(11, "0 0001");
  message(7, "0");
  EXPECT_EQ(state(), quoted("Connected"));
}

TEST_F(ConnectionSection, ANewDecoderGoesOnWithTheCount) {
  message(11, "0 0100");
  message(11, "0 0100");
  lte::Connection next;
  next.updateSectionRef(section);
  next.section().setTime(someTime);
  give(next, lteRRC(26).channel(11).message({0x20, 0}).packet(), 0xB0C0);
  next.prepareDisplay(someTime);
  EXPECT_EQ(count(), quoted("3"));
}

TEST_F(ConnectionSection, ABrokenPacketAndAnUnknownVersionLeaveTheState) {
  message(9, "0 0101");
  give(decoder, lteUnknownVersion(37), 0xB0C0);
  Bytes broken = reconfiguration(5);
  broken.pop_back();
  give(decoder, broken, 0xB0C0);
  EXPECT_EQ(state(), quoted("Idle"));
}

TEST_F(ConnectionSection, NarrowBandMessagesCountToo) {
  message(52, "0 0010");  // RRCConnectionSetupComplete-NB
  EXPECT_EQ(state(), quoted("Connected"));
  EXPECT_EQ(count(), quoted("1"));
  message(49, "0 010");  // RRCConnectionRelease-NB
  EXPECT_EQ(state(), quoted("Idle"));
}

}  // namespace varnel
