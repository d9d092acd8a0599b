#include <gtest/gtest.h>

#include "LogGenerator/Radios/LTE/Registration.h"
#include "tests/support/VersionedHarness.h"

namespace varnel::lte {
namespace {

constexpr std::uint32_t code = 0xB0EE;

DecoderAlone<Registration> newDecoder() { return DecoderAlone<Registration>(); }
DecoderAlone<Registration> newShowingDecoder() { return DecoderAlone<Registration>("", Identities::Shown); }
const LayoutRules rules(newDecoder);
const LayoutRules showingRules(newShowingDecoder);

// 3GPP TS 24.301, 5.1.3.2.
const std::vector<std::string> states = {"Null",
                                         "Deregistered",
                                         "Registered Initiated",
                                         "Registered",
                                         "Tracking Area Updating Initiated",
                                         "Service Request Initiated",
                                         "Deregistered Initiated"};
const std::vector<std::string> ofRegistered = {"Normal Service",    "Update Needed", "Attempting to Update",
                                               "No Cell Available", "PLMN Search",   "Limited Service"};

std::string substateText(unsigned state, unsigned substate) {
  static const std::vector<std::string> ofDeregistered = {
      "No IMSI",           "PLMN Search",          "Attach Needed",
      "No Cell Available", "Attempting to Attach", "Normal Service",
      "Limited Service",   "Attach About to Begin"};
  switch (state) {
    case 0:
    case 6:
      return std::to_string(substate);
    case 1:
      return choiceOf(ofDeregistered)(substate);
    case 2:
      return choiceOf({"Waiting for Network", "Waiting for Session Management"})(substate);
    case 3:
    case 4:
    case 5:
      return choiceOf(ofRegistered)(substate);
    default:
      return anyText;
  }
}

constexpr BitRun state = byteAt(1), substate = wordAt(2), isValid = byteAt(7);

DescribedLayout layoutOf(Identities identities = Identities::Hidden) {
  return {.logCode = code,
          .version = {2},
          .size = 19,
          .minimum = 19,
          .fields =
              {
                  {"EMM State", state, 3, choiceOf(states)},
                  {"PLMN", {4, 0, 24}, 0x012143, plmnText},
                  {"MME PLMN", {9, 0, 24}, 0x10F262, plmnText},
                  {"MME Group", wordAt(12), 0x8001, plainNumber()},
                  {"MME Code", byteAt(14), 77, plainNumber()},
                  {"M-TMSI", longAt(15), 0xC0A1B2D3,
                   [=](std::uint64_t number) {
                     return identities == Identities::Shown ? printed("0x%08x", static_cast<unsigned>(number))
                                                            : std::string("present");
                   }},
              },
          .derived = {{"EMM Substate",
                       [](ByteView payload) {
                         return substateText(static_cast<unsigned>(numberIn(payload, state)),
                                             static_cast<unsigned>(numberIn(payload, substate)));
                       }}},
          .fixed = {{isValid, 1}, {byteAt(8), 6}}};
}
TEST(LTERegistrationLayouts, EachFieldMovesItsRowsOnly) {
  rules.expectEachFieldByItself(layoutOf());
  showingRules.expectEachFieldByItself(layoutOf(Identities::Shown));
}

TEST(LTERegistrationLayouts, EverySubstateOfEveryState) {
  for (unsigned stateNumber = 0; stateNumber < 256; ++stateNumber) {
    for (const unsigned number :
         {0u, 1u, 2u, 3u, 4u, 5u, 6u, 7u, 8u, 9u, 255u, 256u, 257u, 0x8000u, 65535u}) {
      Bytes payload = layoutOf().payload();
      put(payload, state, stateNumber);
      put(payload, substate, number);
      auto decoder = newDecoder();
      decoder.decode(code, payload);
      EXPECT_EQ(decoder.text("EMM State"), choiceOf(states)(stateNumber));
      if (stateNumber > 6) continue;
      EXPECT_EQ(decoder.text("EMM Substate"), substateText(stateNumber, number)) << stateNumber;
    }
  }
}

TEST(LTERegistrationLayouts, VersionIsShown) { rules.expectVersionKnown(layoutOf()); }

TEST(LTERegistrationLayouts, NothingPastTheEndIsShown) {
  rules.expectNothingPastTheEnd(layoutOf());
  showingRules.expectNothingPastTheEnd(layoutOf(Identities::Shown));
  rules.expectUnchangedBelowMinimum(layoutOf(), layoutOf(Identities::Shown));
}

TEST(LTERegistrationLayouts, OtherVersionsAreNotKnown) { rules.expectOtherVersionsUnknown(layoutOf(), {2}); }

TEST(LTERegistrationLayouts, WithoutAGUTIItsFourRowsAreEmpty) {
  auto decoder = newShowingDecoder();
  Bytes payload = layoutOf().payload();
  decoder.decode(code, payload);
  EXPECT_EQ(decoder.text("M-TMSI"), "0xc0a1b2d3");
  put(payload, isValid, 0);
  put(payload, byteAt(8), 255);
  decoder.decode(code, payload);
  for (const char* row : {"MME PLMN", "MME Group", "MME Code", "M-TMSI"})
    EXPECT_EQ(described(decoder.section().dictionary()->get(row)), R"("")") << row;
  EXPECT_EQ(decoder.text("PLMN"), "341-102");
}

TEST(LTERegistrationLayouts, APLMNOfNoDigitsIsEmpty) {
  for (const std::uint64_t octets : {0xFFFFFFull, 0x0121A3ull, 0x0A2143ull, 0xB12143ull, 0x01214Cull,
                                     0x01C143ull, 0x01214Full, 0x012D43ull}) {
    auto decoder = newDecoder();
    Bytes payload = layoutOf().payload();
    decoder.decode(code, payload);
    put(payload, {4, 0, 24}, octets);
    put(payload, {9, 0, 24}, octets);
    decoder.decode(code, payload);
    EXPECT_EQ(decoder.text("PLMN"), "") << octets;
    EXPECT_EQ(decoder.text("MME PLMN"), "") << octets;
  }
}

TEST(LTERegistrationLayouts, InLiterals) {
  const Bytes payload = {2,    1,    7,    0,    0x13, 0x00, 0x62, 1,    6,   0x62,
                         0xF2, 0x20, 0x04, 0x03, 0x02, 0x0D, 0x0C, 0x0B, 0x0A};
  const Rows common = {{"EMM State", "Deregistered"}, {"EMM Substate", "Attach About to Begin"},
                       {"PLMN", "310-260"},           {"MME PLMN", "262-02"},
                       {"MME Group", "772"},          {"MME Code", "2"}};
  Rows hidden = common, shown = common;
  hidden["M-TMSI"] = "present";
  shown["M-TMSI"] = "0x0a0b0c0d";
  auto hiding = newDecoder();
  hiding.decode(code, payload);
  EXPECT_EQ(differences(hidden, hiding.rows()), "");
  auto showing = newShowingDecoder();
  showing.decode(code, payload);
  EXPECT_EQ(differences(shown, showing.rows()), "");
}

}  // namespace
}  // namespace varnel::lte
