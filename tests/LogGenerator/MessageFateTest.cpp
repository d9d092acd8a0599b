#include "LogGenerator/MessageFate.h"

#include <gtest/gtest.h>

#include <ostream>

#include "LogGenerator/LogGenerator.h"
#include "platform/TelephonyService.h"
#include "tests/support/PacketBuilder.h"
#include "tests/support/TestServices.h"

namespace varnel {

// How a failing test shows it.
void PrintTo(const MessageFate& fate, std::ostream* out) {
  *out << "outcome " << static_cast<int>(fate.outcome);
  if (fate.logCode) *out << " of log code " << *fate.logCode;
}

namespace {

using enum MessageFate::Outcome;

class MessageFateTest : public testing::Test {
 protected:
  MessageFate fate(std::string_view technology, const Bytes& message) {
    return LogGenerator::generatorFromTechnology(technology, services.services)->fateOf(message);
  }
  MessageFate ofLTE(const Bytes& message) { return fate(technology::kalviLTE, message); }
  MessageFate ofCDMA(const Bytes& message) { return fate(technology::kalviCDMA, message); }

  static Bytes typed(std::uint8_t type, std::uint16_t code) {
    return PacketBuilder(code, 40).u8(0, type).bytes();
  }

  TestServices services;
};

MessageFate known(MessageFate::Outcome outcome, std::uint32_t logCode) { return {outcome, logCode}; }
MessageFate nameless(MessageFate::Outcome outcome) { return {outcome, std::nullopt}; }

TEST_F(MessageFateTest, WhatIsShorterThanAHeaderIsTooShortAndHasNoLogCode) {
  for (const std::size_t size : {std::size_t{0}, std::size_t{1}, std::size_t{12}}) {
    EXPECT_EQ(ofLTE(Bytes(size, 0x01)), nameless(TooShort)) << size;
    EXPECT_EQ(ofCDMA(Bytes(size, 0x01)), nameless(TooShort)) << size;
  }
}

TEST_F(MessageFateTest, AnotherLogTypeIsUnknownAndHasNoLogCode) {
  EXPECT_EQ(ofLTE(typed(2, 0xB0C1)), nameless(Unknown));
}

TEST_F(MessageFateTest, ALogCodeThatNobodyDecodesIsUnknown) {
  EXPECT_EQ(ofLTE(PacketBuilder(0xB0C0, 40).bytes()), known(Unknown, 0xB0C0));
  EXPECT_EQ(ofLTE(PacketBuilder(0xFF0003, 40).bytes()), known(Unknown, 0xFF0003));
  EXPECT_EQ(ofCDMA(PacketBuilder(0x108B, 40).bytes()), known(Unknown, 0x108B));
}

// The serving cell measurement is 33 bytes long.
TEST_F(MessageFateTest, APacketIsDecodedFromItsMinimumLengthOn) {
  EXPECT_EQ(ofLTE(PacketBuilder(0xB17F, 32).bytes()), known(TooShort, 0xB17F));
  EXPECT_EQ(ofLTE(PacketBuilder(0xB17F, 33).bytes()), known(Decoded, 0xB17F));
  EXPECT_EQ(ofLTE(PacketBuilder(0xB17F, 500).bytes()), known(Decoded, 0xB17F));
}

TEST_F(MessageFateTest, APrefixIsNoPartOfThePacket) {
  Bytes message = PacketBuilder(0xB17F, 33).bytes();
  message.insert(message.begin(), {0x81, 0x00});
  EXPECT_EQ(ofLTE(message), known(Decoded, 0xB17F));
  message.pop_back();
  EXPECT_EQ(ofLTE(message), known(TooShort, 0xB17F));
  Bytes fingers = PacketBuilder(0x108A, 23).bytes();
  fingers.insert(fingers.begin(), {0x81, 0x00});
  EXPECT_EQ(ofCDMA(fingers), known(Decoded, 0x108A));
}

TEST_F(MessageFateTest, OfSeveralDecodersOneThatTakesThePacketIsEnough) {
  for (const std::uint32_t code : {0xFF0000u, 0xFF0001u, 0xFF0002u})
    EXPECT_EQ(ofLTE(PacketBuilder(code, 13).bytes()), known(Decoded, code)) << code;
}

TEST_F(MessageFateTest, CDMAPacketsOfOneLengthAreTooShortBelowItAndTooLongAboveIt) {
  EXPECT_EQ(ofCDMA(PacketBuilder(0x1183, 49).bytes()), known(TooShort, 0x1183));
  EXPECT_EQ(ofCDMA(PacketBuilder(0x1183, 50).bytes()), known(Decoded, 0x1183));
  EXPECT_EQ(ofCDMA(PacketBuilder(0x1183, 51).bytes()), known(TooLong, 0x1183));
  EXPECT_EQ(ofCDMA(PacketBuilder(0x108A, 22).bytes()), known(TooShort, 0x108A));
  EXPECT_EQ(ofCDMA(PacketBuilder(0x108A, 51).bytes()), known(Decoded, 0x108A));
}

TEST_F(MessageFateTest, CDMAPacketsOfAnotherLogTypeAreDecodedAllTheSame) {
  EXPECT_EQ(ofCDMA(typed(2, 0x108A)), known(Decoded, 0x108A));
  EXPECT_EQ(ofCDMA(typed(0xFF, 0x108A)), known(Unknown, 0xFF108A));
}

TEST_F(MessageFateTest, GeneratorsCountTheMessagesOfAnotherFateThanToBeDecoded) {
  services.resources.add("LTE", Value::ofDictionary());
  const std::vector<Bytes> messages = {Bytes(12, 0x01),
                                       typed(2, 0xB0C1),
                                       PacketBuilder(0xB0C0, 40).bytes(),
                                       PacketBuilder(0xB17F, 32).bytes(),
                                       PacketBuilder(0xB17F, 33).bytes(),
                                       PacketBuilder(0xB179, 13).bytes(),
                                       PacketBuilder(0xFF0001, 13).bytes(),
                                       PacketBuilder(0x1183, 49).bytes(),
                                       PacketBuilder(0x1183, 50).bytes(),
                                       PacketBuilder(0x1183, 51).bytes()};
  for (const auto name : {technology::kalviLTE, technology::kalviCDMA}) {
    const auto generator = LogGenerator::generatorFromTechnology(name, services.services);
    Dictionary state;
    std::uint64_t expected = 0;
    for (const Bytes& message : messages) {
      if (generator->fateOf(message).outcome != Decoded) ++expected;
      generator->updateState_withData(state, message);
      EXPECT_EQ(generator->messagesNotDecoded(), expected) << name;
    }
    EXPECT_EQ(expected, name == technology::kalviLTE ? 8u : 9u);
  }
}

TEST_F(MessageFateTest, ObjectsAreDecodedAndHaveNoLogCode) {
  EXPECT_EQ(fate(technology::ifxGSM, {}), nameless(Decoded));
  EXPECT_EQ(fate(technology::ifxGSM, {'<'}), nameless(Decoded));
}

}  // namespace
}  // namespace varnel
