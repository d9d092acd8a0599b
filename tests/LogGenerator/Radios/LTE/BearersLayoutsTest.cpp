#include <gtest/gtest.h>

#include "LogGenerator/Radios/LTE/Bearers.h"
#include "tests/support/VersionedHarness.h"

namespace varnel::lte {
namespace {

constexpr std::uint32_t informationCode = 0xB0E5, stateCode = 0xB0E4;

DecoderAlone<Bearers> newDecoder() { return DecoderAlone<Bearers>("Contexts"); }
const LayoutRules rules(newDecoder);

const std::string first = "Contexts/0/";

// 3GPP TS 24.301, 9.9.4.3: the value alone, and the extension, which replaces it unless it is 0.
unsigned rate_kbits(unsigned value, unsigned extension) {
  if (extension >= 1 && extension <= 74) return 8600 + 100 * extension;
  if (extension >= 75 && extension <= 186) return 1000 * (16 + extension - 74);
  if (extension >= 187 && extension <= 250) return 1000 * (128 + 2 * (extension - 186));
  if (value < 64) return value;
  if (value < 128) return 64 + 8 * (value - 64);
  if (value < 255) return 576 + 64 * (value - 128);
  return 0;
}

std::string rateText(std::uint64_t value) {
  return printed("%u kbit/s", rate_kbits(static_cast<unsigned>(value), 0));
}

constexpr const char* rateLabels[] = {"Maximum Rate Uplink", "Maximum Rate Downlink",
                                      "Guaranteed Rate Uplink", "Guaranteed Rate Downlink"};

DescribedLayout informationLayout() {
  DescribedLayout layout{.logCode = informationCode,
                         .version = {1},
                         .size = 20,
                         .minimum = 4,
                         .fields =
                             {
                                 {first + "Bearer ID", byteAt(2), 6, plainNumber()},
                                 {first + "QCI", byteAt(11), 9, plainNumber()},
                             },
                         // The kind, the state and the length have tests of their own.
                         .fixed = {{byteAt(1), 1}, {byteAt(3), 2}, {byteAt(10), 9}}};
  layout.derived = {{first + "Type", [](ByteView) { return std::string("Dedicated"); }},
                    {first + "State", [](ByteView) { return std::string("Active"); }}};
  for (std::size_t rate = 0; rate < 4; ++rate) {
    // Numbers of all three ranges.
    constexpr std::uint64_t values[] = {41, 77, 141, 201};
    const BitRun value = byteAt(12 + rate), extension = byteAt(16 + rate);
    layout.fields.push_back({first + rateLabels[rate], value, values[rate], rateText});
    layout.fixed.push_back({extension, 0});
  }
  return layout;
}

DescribedLayout stateLayout() {
  return {.logCode = stateCode,
          .version = {1},
          .size = 4,
          .minimum = 4,
          .fields = {{first + "Bearer ID", byteAt(1), 6, plainNumber()},
                     {first + "Connection ID", byteAt(3), 5, plainNumber()}},
          .derived = {{first + "State", [](ByteView) { return std::string("Active"); }}},
          .fixed = {{byteAt(2), 2}}};
}

TEST(LTEBearersLayouts, EachFieldMovesItsRowsOnly) {
  rules.expectEachFieldByItself(informationLayout());
  rules.expectEachFieldByItself(stateLayout());
}

TEST(LTEBearersLayouts, VersionIsShown) {
  rules.expectVersionKnown(informationLayout());
  rules.expectVersionKnown(stateLayout());
}

TEST(LTEBearersLayouts, NothingPastTheEndIsShown) {
  rules.expectNothingPastTheEnd(informationLayout());
  rules.expectNothingPastTheEnd(stateLayout());
  rules.expectUnchangedBelowMinimum(stateLayout(), informationLayout());
  rules.expectUnchangedBelowMinimum(informationLayout(), stateLayout());
}

TEST(LTEBearersLayouts, OtherVersionsAreNotKnown) {
  rules.expectOtherVersionsUnknown(informationLayout(), {1});
  rules.expectOtherVersionsUnknown(stateLayout(), {1});
}

TEST(LTEBearersLayouts, EveryRateOfEveryKind) {
  for (std::size_t rate = 0; rate < 4; ++rate) {
    for (unsigned value = 0; value < 256; ++value) {
      for (unsigned extension = 0; extension < 251; extension += value % 50 == 5 ? 1 : 37) {
        Bytes payload = informationLayout().payload();
        put(payload, byteAt(12 + rate), value);
        put(payload, byteAt(16 + rate), extension);
        auto decoder = newDecoder();
        decoder.decode(informationCode, payload);
        const unsigned kbits = rate_kbits(value, extension);
        EXPECT_EQ(decoder.text(first + rateLabels[rate]), kbits == 0 ? "" : printed("%u kbit/s", kbits))
            << rateLabels[rate] << " of " << value << " and " << extension;
      }
    }
  }
}

// Worked out by hand, at the ends of the ranges.
TEST(LTEBearersLayouts, RatesInLiterals) {
  const auto shown = [](unsigned value, unsigned extension) {
    Bytes payload = informationLayout().payload();
    put(payload, byteAt(13), value);
    put(payload, byteAt(17), extension);
    auto decoder = newDecoder();
    decoder.decode(informationCode, payload);
    return decoder.text("Contexts/0/Maximum Rate Downlink");
  };
  EXPECT_EQ(shown(1, 0), "1 kbit/s");
  EXPECT_EQ(shown(63, 0), "63 kbit/s");
  EXPECT_EQ(shown(64, 0), "64 kbit/s");
  EXPECT_EQ(shown(127, 0), "568 kbit/s");
  EXPECT_EQ(shown(128, 0), "576 kbit/s");
  EXPECT_EQ(shown(254, 0), "8640 kbit/s");
  EXPECT_EQ(shown(254, 1), "8700 kbit/s");
  EXPECT_EQ(shown(254, 74), "16000 kbit/s");
  EXPECT_EQ(shown(254, 75), "17000 kbit/s");
  EXPECT_EQ(shown(254, 186), "128000 kbit/s");
  EXPECT_EQ(shown(254, 187), "130000 kbit/s");
  EXPECT_EQ(shown(254, 250), "256000 kbit/s");
  EXPECT_EQ(shown(255, 0), "");
  EXPECT_EQ(shown(0, 0), "");
}

TEST(LTEBearersLayouts, TheLengthSaysWhichBytesThereAre) {
  for (unsigned length = 0; length < 256; ++length) {
    Bytes payload = informationLayout().payload();
    payload[10] = static_cast<std::uint8_t>(length);
    for (std::size_t rate = 0; rate < 4; ++rate) payload[16 + rate] = static_cast<std::uint8_t>(1 + rate);
    auto decoder = newDecoder();
    decoder.decode(informationCode, payload);
    SCOPED_TRACE(length);
    EXPECT_EQ(decoder.text(first + "QCI"), length >= 1 ? "9" : "");
    constexpr const char* plain[] = {"41 kbit/s", "168 kbit/s", "1408 kbit/s", "5248 kbit/s"};
    constexpr const char* extended[] = {"8700 kbit/s", "8800 kbit/s", "8900 kbit/s", "9000 kbit/s"};
    for (unsigned rate = 0; rate < 4; ++rate) {
      const char* expected = length >= 6 + rate ? extended[rate] : length >= 2 + rate ? plain[rate] : "";
      EXPECT_EQ(decoder.text(first + rateLabels[rate]), expected) << rateLabels[rate];
    }
  }
}

TEST(LTEBearersLayouts, TypesAndStates) {
  for (unsigned number = 0; number < 256; ++number) {
    Bytes payload = informationLayout().payload();
    payload[3] = static_cast<std::uint8_t>(number);
    Bytes state = stateLayout().payload();
    state[2] = static_cast<std::uint8_t>(number);
    const std::string expected = choiceOf({"", "Active Pending", "Active", "Modify Pending"})(number);
    for (const auto& [code, packet] : {std::pair{informationCode, payload}, std::pair{stateCode, state}}) {
      auto decoder = newDecoder();
      decoder.decode(code, packet);
      EXPECT_EQ(decoder.text(first + "State"), expected) << number;
      if (number != 0) continue;
      EXPECT_EQ(differences({}, decoder.rows()), "");
    }
  }
  const auto typeOf = [](unsigned number) {
    Bytes payload = informationLayout().payload();
    payload[1] = static_cast<std::uint8_t>(number);
    auto decoder = newDecoder();
    decoder.decode(informationCode, payload);
    return decoder.text(first + "Type");
  };
  EXPECT_EQ(typeOf(0), "Default");
  EXPECT_EQ(typeOf(1), "Dedicated");
  EXPECT_EQ(typeOf(255), "");
}

Bytes informationOf(unsigned bearer, unsigned state) {
  Bytes payload = informationLayout().payload();
  payload[2] = static_cast<std::uint8_t>(bearer);
  payload[3] = static_cast<std::uint8_t>(state);
  return payload;
}
Bytes stateOf(unsigned bearer, unsigned state, unsigned connection = 255) {
  return {1, static_cast<std::uint8_t>(bearer), static_cast<std::uint8_t>(state),
          static_cast<std::uint8_t>(connection)};
}
std::vector<std::string> bearersOf(const DecoderAlone<Bearers>& decoder) {
  std::vector<std::string> bearers;
  for (const Value& bearer : *decoder.section().dictionary()->get("Contexts").array())
    bearers.push_back(*bearer.dictionary()->get("Bearer ID").string());
  return bearers;
}

TEST(LTEBearersLayouts, Connection255IsLeftOut) {
  auto decoder = newDecoder();
  decoder.decode(stateCode, stateOf(5, 2));
  EXPECT_EQ(differences({{first + "Bearer ID", "5"}, {first + "State", "Active"}}, decoder.rows()), "");
}

TEST(LTEBearersLayouts, BearersAreSortedByTheirNumbers) {
  auto decoder = newDecoder();
  for (const unsigned bearer : {15u, 5u, 7u}) decoder.decode(informationCode, informationOf(bearer, 2));
  decoder.decode(stateCode, stateOf(6, 1));
  EXPECT_EQ(bearersOf(decoder), (std::vector<std::string>{"5", "6", "7", "15"}));
  decoder.decode(stateCode, stateOf(7, 0));
  decoder.decode(informationCode, informationOf(15, 0));
  EXPECT_EQ(bearersOf(decoder), (std::vector<std::string>{"5", "6"}));
}

TEST(LTEBearersLayouts, BothPacketsOfABearerMakeOneRecord) {
  auto decoder = newDecoder();
  decoder.decode(informationCode, informationOf(6, 1));
  decoder.decode(stateCode, stateOf(6, 2, 3));
  EXPECT_EQ(bearersOf(decoder), std::vector<std::string>{"6"});
  EXPECT_EQ(decoder.text(first + "QCI"), "9");
  EXPECT_EQ(decoder.text(first + "State"), "Active");
  EXPECT_EQ(decoder.text(first + "Connection ID"), "3");
}

TEST(LTEBearersLayouts, ABearerThatComesBackHasNothingOfItsFormerSelf) {
  auto decoder = newDecoder();
  decoder.decode(informationCode, informationOf(6, 2));
  decoder.decode(stateCode, stateOf(6, 0));
  EXPECT_EQ(bearersOf(decoder), std::vector<std::string>{});
  decoder.decode(stateCode, stateOf(6, 1));
  EXPECT_EQ(differences({{first + "Bearer ID", "6"}, {first + "State", "Active Pending"}}, decoder.rows()),
            "");
}

TEST(LTEBearersLayouts, BearersOfASectionThatIsBoundAgainStay) {
  auto decoder = newDecoder();
  decoder.decode(informationCode, informationOf(5, 2));
  decoder.decode(informationCode, informationOf(7, 2));
  decoder.decodeByAnother(stateCode, stateOf(6, 1));
  EXPECT_EQ(bearersOf(decoder), (std::vector<std::string>{"5", "6", "7"}));
  EXPECT_EQ(decoder.text(first + "QCI"), "9");
  decoder.decodeByAnother(stateCode, stateOf(5, 0));
  EXPECT_EQ(bearersOf(decoder), (std::vector<std::string>{"6", "7"}));
}

}  // namespace
}  // namespace varnel::lte
