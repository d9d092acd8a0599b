#include "programs/varnel-decode/MessagePackets.h"

#include <gtest/gtest.h>

#include <memory>
#include <string_view>

namespace varnel {
namespace {

using Radio = AirMessage::Radio;
using Protocol = AirMessage::Protocol;
using Direction = AirMessage::Direction;

// Keeps its bytes.
struct Message : AirMessage {
  Message(Radio ofRadio, Protocol ofProtocol, Direction inDirection, std::string_view onChannel,
          Bytes theBytes)
      : _kept(std::make_shared<const Bytes>(std::move(theBytes))) {
    radio = ofRadio;
    protocol = ofProtocol;
    direction = inDirection;
    channel = onChannel;
    bytes = *_kept;
  }

 private:
  std::shared_ptr<const Bytes> _kept;
};

Message release() { return {Radio::LTE, Protocol::RRC, Direction::Downlink, "DL-DCCH", {0x28, 0x02}}; }

Message bareNR(std::string_view name, Bytes bytes) {
  Message made(Radio::NR, Protocol::RRC, Direction::Unknown, "", std::move(bytes));
  made.name = name;
  return made;
}

Message ofGSM(std::string_view channel, std::uint8_t layer2Octets, Bytes bytes) {
  Message made(Radio::GSM, Protocol::RR, Direction::Downlink, channel, std::move(bytes));
  made.layer2Octets = layer2Octets;
  return made;
}

Bytes joined(std::initializer_list<Bytes> parts) {
  Bytes all;
  for (const Bytes& part : parts) all.insert(all.end(), part.begin(), part.end());
  return all;
}

Bytes textOf(std::string_view text) { return {text.begin(), text.end()}; }

std::optional<Bytes> upperPdu(const AirMessage& of) { return messagePacket(of, MessageForm::UpperPdu); }
std::optional<Bytes> gsmtap(const AirMessage& of) { return messagePacket(of, MessageForm::Gsmtap); }

// The name in an upper PDU; empty when there is no such packet.
std::string dissectorName(const AirMessage& of) {
  const auto packet = upperPdu(of);
  if (!packet) return {};
  std::string name(packet->begin() + 4, packet->begin() + 4 + packet->at(3));
  name.erase(name.find_last_not_of('\0') + 1);
  return name;
}

// Type, subtype, and what follows of a GSMTAP packet.
struct Tapped {
  int type, subtype;
  Bytes bytes;

  bool operator==(const Tapped&) const = default;
};
std::optional<Tapped> tapped(const AirMessage& of) {
  const auto packet = gsmtap(of);
  if (!packet) return std::nullopt;
  return Tapped{packet->at(30), packet->at(40), {packet->begin() + 44, packet->end()}};
}

TEST(UpperPdu, BeginsWithTheDissectorAndTheDirection) {
  EXPECT_EQ(upperPdu(release()), joined({{0, 12, 0, 16},
                                         textOf("lte-rrc.dl.dcch"),
                                         {0},
                                         {0, 35, 0, 4, 0, 0, 0, 1},  // received
                                         {0, 0, 0, 0},
                                         {0x28, 0x02}}));
}

TEST(UpperPdu, AnUplinkMessageIsSent) {
  const Message attach(Radio::LTE, Protocol::NAS, Direction::Uplink, "", {0x07, 0x43});
  EXPECT_EQ(
      upperPdu(attach),
      joined({{0, 12, 0, 8}, textOf("nas-eps"), {0}, {0, 35, 0, 4, 0, 0, 0, 0}, {0, 0, 0, 0}, {0x07, 0x43}}));
}

TEST(UpperPdu, AnUnknownDirectionIsLeftOut) {
  const Message some(Radio::UMTS, Protocol::RRC, Direction::Unknown, "PCCH", {0x40});
  EXPECT_EQ(upperPdu(some), joined({{0, 12, 0, 8}, textOf("rrc.pcch"), {0, 0, 0, 0}, {0x40}}));
}

TEST(UpperPdu, ABareReconfigurationCompleteBecomesAMessageOfULDCCH) {
  // 0 0001, 1010 0101, 0100 0000, and three bits to the end of the byte.
  EXPECT_EQ(upperPdu(bareNR("RRCReconfigurationComplete", {0xA5, 0x40})),
            joined({{0, 12, 0, 16}, textOf("nr-rrc.ul.dcch"), {0, 0}, {0, 0, 0, 0}, {0x0D, 0x2A, 0x00}}));
  EXPECT_EQ(upperPdu(bareNR("RRCReconfigurationComplete", {0xFF}))->back(), 0xF8);
}

TEST(UpperPdu, OtherBareMessagesOfNRHaveDissectors) {
  EXPECT_EQ(dissectorName(bareNR("RRCReconfiguration", {0})), "nr-rrc.rrc_reconf");
  EXPECT_EQ(dissectorName(bareNR("RadioBearerConfig", {0})), "nr-rrc.radiobearerconfig");
  EXPECT_EQ(dissectorName(bareNR("UE-MRDC-Capability", {0})), "nr-rrc.ue_mrdc_cap");
  EXPECT_EQ(dissectorName(bareNR("UE-NR-Capability", {0})), "nr-rrc.ue_nr_cap");
  EXPECT_EQ(dissectorName(bareNR("Unknown", {0})), "");
}

TEST(UpperPdu, ASystemInformationBlockOfUMTSHasItsDissector) {
  Message block(Radio::UMTS, Protocol::RRC, Direction::Downlink, "", {0});
  block.name = "SysInfoType13-4";
  EXPECT_EQ(dissectorName(block), "rrc.si.sib13-4");
  EXPECT_EQ(tapped(block), (Tapped{0x0C, 35, {0}}));
  block.name = "MasterInformationBlock";
  EXPECT_EQ(dissectorName(block), "rrc.si.mib");
  EXPECT_EQ(tapped(block), (Tapped{0x0C, 16, {0}}));
}

TEST(UpperPdu, ASessionMessageOfLTEHasNoSecurityHeader) {
  const auto nas = [](Bytes bytes) {
    return Message(Radio::LTE, Protocol::NAS, Direction::Downlink, "", std::move(bytes));
  };
  EXPECT_EQ(dissectorName(nas({0x52, 0x01, 0xC1})), "nas-eps_plain") << "5 is the bearer identity";
  EXPECT_EQ(dissectorName(nas({0x27, 0x11, 0x12})), "nas-eps");
}

TEST(UpperPdu, ANasMessageOfNRBeginsWithItsDiscriminator) {
  const auto nas = [](Bytes bytes) {
    return Message(Radio::NR, Protocol::NAS, Direction::Uplink, "", std::move(bytes));
  };
  EXPECT_EQ(dissectorName(nas({0x7E, 0, 0x43})), "nas-5gs");
  EXPECT_EQ(dissectorName(nas({0x2E, 1, 1, 0xC1})), "nas-5gs");
  EXPECT_EQ(dissectorName(nas({0x31, 1, 1, 0xC1})), "") << "ciphered from the first octet on";
}

TEST(UpperPdu, AMessageOfGSMKeepsItsPseudoLength) {
  EXPECT_EQ(dissectorName(ofGSM("CCCH", 1, {0x2D, 0x06, 0x3F, 0x00})), "gsm_a_ccch");
  EXPECT_EQ(upperPdu(ofGSM("CCCH", 1, {0x2D, 0x06, 0x3F, 0x00}))->size(), 32u);
  EXPECT_EQ(dissectorName(ofGSM("SDCCH", 0, {0x06, 0x0D, 0})), "gsm_a_dtap");
  EXPECT_EQ(dissectorName(Message(Radio::UMTS, Protocol::NAS, Direction::Downlink, "", {0x05, 0x18})),
            "gsm_a_dtap");
}

TEST(UpperPdu, WhatNoDissectorReadsHasNone) {
  EXPECT_EQ(upperPdu(Message(Radio::LTE, Protocol::RRC, Direction::Uplink, "UL-XCCH", {1})), std::nullopt);
  EXPECT_EQ(upperPdu(Message(Radio::GSM, Protocol::RR, Direction::Uplink, "RACH", {1})), std::nullopt);
  EXPECT_EQ(upperPdu(Message(Radio::GSM, Protocol::RRC, Direction::Uplink, "DCCH", {1})), std::nullopt);
  EXPECT_EQ(upperPdu(Message(Radio::LTE, Protocol::RRC, Direction::Downlink, "DL-DCCH", {})), std::nullopt);
}

TEST(Gsmtap, IsInUdpAndIPv4) {
  Message complete(Radio::LTE, Protocol::RRC, Direction::Uplink, "UL-DCCH", {0x2A, 0x00});
  complete.channelNumber = 1300;  // 0x514
  complete.frame = 392;           // 0x188
  // The 16-bit words of the IPv4 header sum up to 0x18341, folded 0x8342, inverted 0x7CBD.
  EXPECT_EQ(gsmtap(complete),
            (Bytes{0x45, 0,    0,    46,   0,    0,    0, 0, 0x40, 0x11, 0x7C, 0xBD, 0x7F, 0, 0, 1,
                   0x7F, 0,    0,    1,                                                              //
                   0x12, 0x79, 0x12, 0x79, 0,    26,   0, 0,                                         //
                   2,    4,    0x0D, 0,    0x45, 0x14, 0, 0, 0,    0,    0x01, 0x88, 3,    0, 0, 0,  //
                   0x2A, 0x00}));
}

TEST(Gsmtap, AChannelNumberAbove16383Is0) {
  Message paging(Radio::LTE, Protocol::RRC, Direction::Downlink, "PCCH", {0x20});
  paging.channelNumber = 16383;
  EXPECT_EQ(gsmtap(paging)->at(32), 0x3F);
  EXPECT_EQ(gsmtap(paging)->at(33), 0xFF);
  paging.channelNumber = 16384;
  EXPECT_EQ(gsmtap(paging)->at(32), 0);
  EXPECT_EQ(gsmtap(paging)->at(33), 0);
  paging.channelNumber = 66486;
  paging.direction = Direction::Uplink;
  EXPECT_EQ(gsmtap(paging)->at(32), 0x40);
  EXPECT_EQ(gsmtap(paging)->at(33), 0);
}

TEST(Gsmtap, HasNoTypeForNR) {
  EXPECT_EQ(gsmtap(Message(Radio::NR, Protocol::RRC, Direction::Uplink, "UL-DCCH", {0x2A, 0})), std::nullopt);
  EXPECT_EQ(gsmtap(Message(Radio::NR, Protocol::NAS, Direction::Uplink, "", {0x7E, 0, 0x43})), std::nullopt);
}

TEST(Gsmtap, ANasMessageOfLTETellsItsSecurityHeader) {
  const auto nas = [](Bytes bytes) {
    return Message(Radio::LTE, Protocol::NAS, Direction::Downlink, "", std::move(bytes));
  };
  EXPECT_EQ(tapped(nas({0x07, 0x61})), (Tapped{0x12, 0, {0x07, 0x61}}));
  EXPECT_EQ(tapped(nas({0x52, 0x01, 0xC1})), (Tapped{0x12, 0, {0x52, 0x01, 0xC1}}));
  EXPECT_EQ(tapped(nas({0x27, 1, 2, 3, 4, 5, 6})), (Tapped{0x12, 1, {0x27, 1, 2, 3, 4, 5, 6}}));
}

TEST(Gsmtap, AMessageOfGSMLosesItsPseudoLength) {
  EXPECT_EQ(tapped(ofGSM("BCCH", 1, {0x49, 0x06, 0x1B, 0x12})), (Tapped{0x02, 0, {0x06, 0x1B, 0x12}}));
  EXPECT_EQ(tapped(ofGSM("SDCCH", 0, {0x06, 0x0D, 0x00})), (Tapped{0x02, 0, {0x06, 0x0D, 0x00}}));
  EXPECT_EQ(tapped(ofGSM("BCCH", 1, {0x49})), std::nullopt) << "there is nothing else";
}

TEST(Gsmtap, AMessageThatIPv4CannotHoldHasNoPacket) {
  Message longest(Radio::LTE, Protocol::RRC, Direction::Uplink, "UL-DCCH", Bytes(65492));
  EXPECT_EQ(gsmtap(longest), std::nullopt);
  EXPECT_TRUE(upperPdu(longest));
  longest.bytes = longest.bytes.first(65491);
  EXPECT_EQ(gsmtap(longest)->size(), 65535u);
}

TEST(MessageComment, TellsChannelAndCell) {
  Message some = release();
  EXPECT_EQ(messageComment(some), "LTE RRC DL-DCCH");
  some.channelNumber = 5230;
  some.physicalCell = 289;
  some.frame = 392;
  EXPECT_EQ(messageComment(some), "LTE RRC DL-DCCH, EARFCN 5230, cell 289, SFN 392");
  some.subframe = 4;
  EXPECT_EQ(messageComment(some), "LTE RRC DL-DCCH, EARFCN 5230, cell 289, SFN 392.4");
}

TEST(MessageComment, NamesTheNumbersOfEachRadio) {
  Message some(Radio::UMTS, Protocol::RRC, Direction::Downlink, "PCCH", {0x40});
  some.channelNumber = 10588;
  some.physicalCell = 77;
  EXPECT_EQ(messageComment(some), "UMTS RRC PCCH, UARFCN 10588, scrambling code 77");
  some.radio = Radio::NR;
  EXPECT_EQ(messageComment(some), "NR RRC PCCH, NR-ARFCN 10588, cell 77");
  EXPECT_EQ(messageComment(Message(Radio::GSM, Protocol::NAS, Direction::Uplink, "", {0x05, 0x24})),
            "GSM NAS");
}

TEST(MessageForm, HasItsLinkType) {
  EXPECT_EQ(linkTypeOf(MessageForm::UpperPdu), 252);
  EXPECT_EQ(linkTypeOf(MessageForm::Gsmtap), 228);
}

}  // namespace
}  // namespace varnel
