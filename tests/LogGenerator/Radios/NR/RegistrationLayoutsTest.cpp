#include <gtest/gtest.h>

#include "LogGenerator/Radios/NR/Registration.h"
#include "tests/support/VersionedHarness.h"

namespace varnel::nr {
namespace {

constexpr std::uint32_t code = 0xB80C;
constexpr std::uint32_t versions[] = {1, 0x30000};

DecoderAlone<Registration> newDecoder() { return DecoderAlone<Registration>(); }
DecoderAlone<Registration> newShowingDecoder() { return DecoderAlone<Registration>("", Identities::Shown); }
const LayoutRules rules(newDecoder);
const LayoutRules showingRules(newShowingDecoder);

const std::vector<std::string> states = {"Unknown (0)", "Deregistered", "Registered Initiated", "Registered",
                                         "Service Request Initiated"};
const std::vector<std::string> substates = {"Normal Service", "PLMN Search", "No Cell Available",
                                            "Unknown (3)",    "Unknown (4)", "Limited Service"};

std::string trackingArea(std::uint64_t number) {
  // The first byte is the highest.
  const std::uint64_t turned = (number & 0xFF) << 16 | (number & 0xFF00) | number >> 16;
  return std::to_string(turned);
}

std::string updateStatus(std::uint64_t number) {
  if (number < 2) return number == 0 ? "Updated" : "Not Updated";
  return printed("Unknown (%lld)", static_cast<long long>(signedNumber(number, 8)));
}

DescribedLayout layoutOf(std::uint32_t version, Identities identities = Identities::Hidden) {
  const std::size_t size = version == 1 ? 26 : 27;
  return {.logCode = code,
          .version = {version},
          .size = size,
          .minimum = 26,
          .fields =
              {
                  {"5GMM State", byteAt(4), 3, choiceOf(states)},
                  {"5GMM Substate", wordAt(5), 1, choiceOf(substates)},
                  {"PLMN", {7, 0, 24}, 0x012143, plmnText},
                  // Behind a byte for the kind of identity: 2, a 5G-GUTI.
                  {"AMF PLMN", {11, 0, 24}, 0x10F262, plmnText},
                  {"AMF Region", byteAt(14), 131, plainNumber()},
                  {"AMF Set", wordAt(15), 577, plainNumber()},
                  {"AMF Pointer", byteAt(17), 29, plainNumber()},
                  {"5G-TMSI", longAt(18), 0xC0A1B2D3,
                   [=](std::uint64_t number) {
                     return identities == Identities::Shown ? printed("0x%08x", static_cast<unsigned>(number))
                                                            : std::string("present");
                   }},
                  {"Update Status", byteAt(22), 0, updateStatus},
                  {"Tracking Area Code", {23, 0, 24}, 0x563412, trackingArea},
              },
          .fixed = {{byteAt(10), 2}}};
}

TEST(NRRegistrationLayouts, EachFieldMovesItsRowsOnly) {
  for (const std::uint32_t version : versions) {
    rules.expectEachFieldByItself(layoutOf(version));
    showingRules.expectEachFieldByItself(layoutOf(version, Identities::Shown));
  }
}

TEST(NRRegistrationLayouts, KnownVersionsShowTheirNumber) {
  for (const std::uint32_t version : versions) rules.expectVersionKnown(layoutOf(version));
}

TEST(NRRegistrationLayouts, NothingPastTheEndIsShown) {
  for (const std::uint32_t version : versions) {
    rules.expectNothingPastTheEnd(layoutOf(version));
    showingRules.expectNothingPastTheEnd(layoutOf(version, Identities::Shown));
    rules.expectUnchangedBelowMinimum(layoutOf(version), layoutOf(version == 1 ? 0x30000 : 1));
  }
}

TEST(NRRegistrationLayouts, OtherVersionsAreNotKnown) {
  for (const std::uint32_t version : versions)
    rules.expectOtherVersionsUnknown(layoutOf(version), {1, 0x30000});
}

TEST(NRRegistrationLayouts, EveryStateAndSubstate) {
  for (unsigned number = 0; number < 256; ++number) {
    Bytes payload = layoutOf(1).payload();
    payload[4] = static_cast<std::uint8_t>(number);
    put(payload, wordAt(5), number);
    auto decoder = newDecoder();
    decoder.decode(code, payload);
    EXPECT_EQ(decoder.text("5GMM State"), choiceOf(states)(number));
    EXPECT_EQ(decoder.text("5GMM Substate"), choiceOf(substates)(number));
  }
}

TEST(NRRegistrationLayouts, APLMNOfNoDigitsIsEmpty) {
  for (const std::uint64_t octets : {0xFFFFFFull, 0x0121A3ull, 0x0A2143ull, 0xB12143ull}) {
    Bytes payload = layoutOf(1).payload();
    auto decoder = newDecoder();
    decoder.decode(code, payload);
    EXPECT_EQ(decoder.text("PLMN"), "341-102");
    put(payload, {7, 0, 24}, octets);
    decoder.decode(code, payload);
    EXPECT_EQ(decoder.text("PLMN"), "") << octets;
  }
}

// The kind is the lowest three bits, 3GPP TS 24.501, 9.11.3.4.
TEST(NRRegistrationLayouts, AnotherKindOfIdentityIsNoGUTI) {
  for (unsigned kind = 0; kind < 256; ++kind) {
    if (kind % 8 == 2) continue;
    Bytes payload = layoutOf(1).payload();
    auto decoder = newShowingDecoder();
    decoder.decode(code, payload);
    payload[10] = static_cast<std::uint8_t>(kind);
    decoder.decode(code, payload);
    for (const char* row : {"AMF PLMN", "AMF Region", "AMF Set", "AMF Pointer", "5G-TMSI"})
      EXPECT_EQ(decoder.text(row), "") << row << " of kind " << kind;
  }
}

TEST(NRRegistrationLayouts, InLiterals) {
  const Bytes payload = {1,    0,    0,    0,    2,    5,    0,    0x13, 0x00, 0x14, 2,    0x62, 0xF2,
                         0x20, 0x80, 0x03, 0x02, 0x07, 0x0D, 0x0C, 0x0B, 0x0A, 1,    0x00, 0x9C, 0x41};
  const Rows common = {{"5GMM State", "Registered Initiated"},
                       {"5GMM Substate", "Limited Service"},
                       {"PLMN", "310-410"},
                       {"AMF PLMN", "262-02"},
                       {"AMF Region", "128"},
                       {"AMF Set", "515"},
                       {"AMF Pointer", "7"},
                       {"Update Status", "Not Updated"},
                       {"Tracking Area Code", "40001"}};
  Rows hidden = common, shown = common;
  hidden["5G-TMSI"] = "present";
  shown["5G-TMSI"] = "0x0a0b0c0d";
  auto hiding = newDecoder();
  hiding.decode(code, payload);
  EXPECT_EQ(differences(hidden, hiding.rows()), "");
  auto showing = newShowingDecoder();
  showing.decode(code, payload);
  EXPECT_EQ(differences(shown, showing.rows()), "");
}

}  // namespace
}  // namespace varnel::nr
