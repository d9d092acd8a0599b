#include <gtest/gtest.h>

#include "LogGenerator/Radios/LTE/RandomAccess.h"
#include "tests/support/VersionedHarness.h"

namespace varnel::lte {
namespace {

constexpr std::uint32_t triggerCode = 0xB061, attemptCode = 0xB062, configurationCode = 0xB166,
                        preambleCode = 0xB167, responseCode = 0xB168, contentionCode = 0xB16A;

DecoderAlone<RandomAccess> newDecoder() { return DecoderAlone<RandomAccess>(); }
const LayoutRules rules(newDecoder);

std::string distance(std::uint64_t timingAdvance) {
  const std::string rounded = printed("%.0f m", 78.1 * static_cast<double>(timingAdvance));
  // Half of 16 x 299792458 / 30720000 m is 78.0709 m; where that makes a difference, either will do.
  const std::string exact = printed("%.0f m", 78.0709 * static_cast<double>(timingAdvance));
  return rounded == exact ? rounded : anyText;
}

DescribedLayout configurationLayout() {
  const DescribedLayout layout{
      .logCode = triggerCode,
      .size = 28,
      .minimum = 27,
      .fields = {{"Preamble Initial Power", wordAt(4), 0xFF98, signedNumber("%lld dBm", 16)},
                 {"Power Ramping", byteAt(6), 2, plainNumber("%lld dB")},
                 {"Maximum Preamble Transmissions", byteAt(9), 10, plainNumber()},
                 {"Contention Resolution Timer", wordAt(10), 48, plainNumber("%lld ms")},
                 {"P-Max", wordAt(15), 23, signedNumber("%lld dBm", 16)},
                 {"PRACH Configuration", byteAt(19), 5, plainNumber()},
                 {"Root Sequence", wordAt(21), 713, plainNumber()},
                 {"Maximum Message 3 Transmissions", byteAt(25), 4, plainNumber()},
                 {"Response Window", byteAt(26), 10, plainNumber()}}};
  return inSubpacket(layout, 3, 2);
}

const std::vector<std::string> reasons = {"Connection Request", "Radio Link Failure", "Uplink Data",
                                          "Downlink Data", "Handover"};
const std::vector<std::string> results = {"Success", "Failure at Message 2", "Unknown (2)", "Unknown (3)",
                                          "Aborted"};

DescribedLayout reasonLayout() {
  const DescribedLayout layout{.logCode = triggerCode,
                               .size = 20,
                               .minimum = 19,
                               .fields = {{"Reason", byteAt(4), 2, choiceOf(reasons)},
                                          {"Preamble", byteAt(12), 37, plainNumber()},
                                          {"Path Loss", byteAt(16), 101, plainNumber("%lld dB")},
                                          {"C-RNTI", wordAt(17), 40001, plainNumber()}},
                               .derived = {{"Contention", [](ByteView) { return std::string("Yes"); }}},
                               .fixed = {{byteAt(11), 1}}};
  return inSubpacket(layout, 5, 1);
}

// Failed at message 2: there was no response.
constexpr std::uint64_t failedAtMessage2 = 1;

DescribedLayout attemptLayout(std::uint8_t version) {
  const std::size_t before = version == 2 ? 0 : 2, behindPreamble = before + (version == 50 ? 3 : 0);
  const std::size_t size = version == 2 ? 40 : version == 3 ? 42 : version == 49 ? 44 : 47;
  const BitRun result = byteAt(before + 5);
  DescribedLayout layout{
      .logCode = attemptCode,
      .size = size,
      .minimum = behindPreamble + 19,
      .fields = {{"Attempt", byteAt(before + 4), 3, plainNumber()},
                 {"Result", result, 0, choiceOf(results)},
                 {"Preamble", byteAt(before + 8), 37, plainNumber()}},
      .derived = {{"Contention", [](ByteView) { return std::string("No"); }}},
      // All three messages follow, with a response.
      .fixed = {{byteAt(before + 6), 0}, {byteAt(before + 7), 7}, {byteAt(behindPreamble + 14), 1}}};
  const auto addOfResponse = [&](const char* label, BitRun run, std::uint64_t number, const TextOf& text) {
    layout.fields.push_back({label, run, number, text});
    layout.derived.push_back({label, [=](ByteView subpacket) {
                                const bool hasResponse = numberIn(subpacket, result) != failedAtMessage2;
                                return hasResponse ? text(numberIn(subpacket, run)) : std::string();
                              }});
  };
  addOfResponse("Backoff", wordAt(behindPreamble + 12), 160, plainNumber("%lld ms"));
  addOfResponse("Temporary C-RNTI", wordAt(behindPreamble + 15), 40001, plainNumber());
  addOfResponse("Timing Advance", wordAt(behindPreamble + 17), 12, plainNumber());
  addOfResponse("Distance", wordAt(behindPreamble + 17), 12, distance);
  return inSubpacket(layout, 6, version);
}
const std::uint8_t attemptVersions[] = {2, 3, 49, 50};

DescribedLayout physicalConfigurationLayout() {
  return {.logCode = configurationCode,
          .version = {3},
          .size = 8,
          .minimum = 4,
          .fields = {{"Root Sequence", {2, 0, 10}, 713, plainNumber()},
                     {"PRACH Configuration", {2, 10, 6}, 21, plainNumber()}}};
}
DescribedLayout preambleLayout() {
  return {.logCode = preambleCode,
          .version = {5},
          .size = 28,
          .minimum = 6,
          .fields = {{"Preamble", {4, 0, 6}, 37, plainNumber()}, {"RA-RNTI", wordAt(20), 7, plainNumber()}},
          .derived = {{"Transmit Power", [](ByteView) { return std::string("-18 dBm"); }}},
          // The transmit power stands in two places.
          .fixed = {{byteAt(8), 0xEE}, {longAt(24), 0xFFFFFFEE}}};
}
DescribedLayout responseLayout() {
  return {.logCode = responseCode,
          .version = {1},
          .size = 12,
          .minimum = 6,
          .fields = {{"System Frame Number", {4, 0, 10}, 713, plainNumber()},
                     {"Subframe", {4, 10, 4}, 9, plainNumber()},
                     {"Timing Advance", {6, 0, 11}, 12, plainNumber()},
                     {"Distance", {6, 0, 11}, 12, distance},
                     {"Temporary C-RNTI", {8, 8, 16}, 40001, plainNumber()}}};
}
DescribedLayout contentionLayout() {
  return {.logCode = contentionCode,
          .version = {1},
          .size = 8,
          .minimum = 6,
          .fields = {{"System Frame Number", {4, 0, 10}, 713, plainNumber()},
                     {"Subframe", {4, 10, 4}, 9, plainNumber()}}};
}

std::vector<DescribedLayout> subpackets() {
  std::vector<DescribedLayout> layouts = {configurationLayout(), reasonLayout()};
  for (const std::uint8_t version : attemptVersions) layouts.push_back(attemptLayout(version));
  return layouts;
}
std::vector<DescribedLayout> plainPackets() {
  return {physicalConfigurationLayout(), preambleLayout(), responseLayout(), contentionLayout()};
}

TEST(LTERandomAccessLayouts, EachFieldMovesItsRowsOnly) {
  for (const DescribedLayout& layout : subpackets()) rules.expectEachFieldByItself(layout);
  for (const DescribedLayout& layout : plainPackets()) rules.expectEachFieldByItself(layout);
}

TEST(LTERandomAccessLayouts, KnownVersionsShowTheirNumber) {
  for (const DescribedLayout& layout : subpackets()) rules.expectVersionKnown(layout);
  for (const DescribedLayout& layout : plainPackets()) rules.expectVersionKnown(layout);
}

TEST(LTERandomAccessLayouts, NothingPastTheEndIsShown) {
  for (const DescribedLayout& layout : subpackets()) {
    rules.expectNothingPastTheEnd(layout);
    rules.expectNothingPastTheSubpacketsEnd(layout);
  }
  for (const DescribedLayout& layout : plainPackets()) {
    rules.expectNothingPastTheEnd(layout);
    rules.expectUnchangedBelowMinimum(layout, reasonLayout());
  }
}

TEST(LTERandomAccessLayouts, OtherVersionsAreNotKnown) {
  rules.expectOtherVersionsUnknown(physicalConfigurationLayout(), {3});
  rules.expectOtherVersionsUnknown(preambleLayout(), {5});
  rules.expectOtherVersionsUnknown(responseLayout(), {1});
  rules.expectOtherVersionsUnknown(contentionLayout(), {1});
  for (const DescribedLayout& layout : subpackets()) rules.expectOtherVersionsUnknown(layout, {1});
  rules.expectOtherSubpacketVersionsUnknown(configurationLayout(), {2});
  rules.expectOtherSubpacketVersionsUnknown(reasonLayout(), {1});
  rules.expectOtherSubpacketVersionsUnknown(attemptLayout(2), {2, 3, 49, 50});
}

TEST(LTERandomAccessLayouts, ContentionIsYesOrNo) {
  const std::size_t places[] = {4 + 11, 4 + 6, 4 + 8, 4 + 8, 4 + 8};
  const DescribedLayout layouts[] = {reasonLayout(), attemptLayout(2), attemptLayout(3), attemptLayout(49),
                                     attemptLayout(50)};
  for (std::size_t index = 0; index < 5; ++index) {
    Bytes payload = layouts[index].payload();
    auto decoder = newDecoder();
    payload[places[index]] = 0;
    decoder.decode(layouts[index].logCode, payload);
    EXPECT_EQ(decoder.text("Contention"), "No") << layouts[index].name();
    payload[places[index]] = 1;
    decoder.decode(layouts[index].logCode, payload);
    EXPECT_EQ(decoder.text("Contention"), "Yes") << layouts[index].name();
  }
}

TEST(LTERandomAccessLayouts, EveryReasonAndResult) {
  for (unsigned number = 0; number < 256; ++number) {
    Bytes reason = reasonLayout().payload(), result = attemptLayout(3).payload();
    reason[4 + 4] = static_cast<std::uint8_t>(number);
    result[4 + 7] = static_cast<std::uint8_t>(number);
    auto decoder = newDecoder();
    decoder.decode(triggerCode, reason);
    decoder.decode(attemptCode, result);
    EXPECT_EQ(decoder.text("Reason"), choiceOf(reasons)(number));
    EXPECT_EQ(decoder.text("Result"), choiceOf(results)(number));
  }
}

TEST(LTERandomAccessLayouts, TheTransmitPowerIsSigned) {
  for (const int power : {-128, -40, -1, 0, 1, 23, 127}) {
    Bytes payload = preambleLayout().payload();
    put(payload, byteAt(8), static_cast<std::uint8_t>(power));
    put(payload, longAt(24), static_cast<std::uint32_t>(power));
    auto decoder = newDecoder();
    decoder.decode(preambleCode, payload);
    EXPECT_EQ(decoder.text("Transmit Power"), printed("%d dBm", power));
  }
}

// 78.1 m times the advance.
TEST(LTERandomAccessLayouts, DistancesInLiterals) {
  const auto distanceOf = [](unsigned advance) {
    Bytes payload = responseLayout().payload();
    put(payload, {6, 0, 11}, advance);
    auto decoder = newDecoder();
    decoder.decode(responseCode, payload);
    return decoder.text("Distance");
  };
  EXPECT_EQ(distanceOf(0), "0 m");
  EXPECT_EQ(distanceOf(1), "78 m");
  EXPECT_EQ(distanceOf(10), "781 m");
  EXPECT_EQ(distanceOf(12), "937 m");
}

TEST(LTERandomAccessLayouts, SubpacketsOfOnePacketAddUp) {
  Rows expected = configurationLayout().rowsOf(configurationLayout().payload());
  for (const auto& [path, text] : reasonLayout().rowsOf(reasonLayout().payload())) expected[path] = text;
  const Bytes configuration = subpacketOf(configurationLayout().payload());
  const Bytes reason = subpacketOf(reasonLayout().payload());
  const Bytes unknown = {99, 1, 6, 0, 0xFF, 0xFF};
  for (const std::vector<Bytes>& parts :
       {std::vector{configuration, reason}, std::vector{reason, configuration},
        std::vector{unknown, reason, unknown, configuration}}) {
    auto decoder = newDecoder();
    decoder.decode(triggerCode, packetOfSubpackets(parts));
    EXPECT_EQ(differences(expected, decoder.rows()), "");
  }
}

TEST(LTERandomAccessLayouts, ASubpacketBehindALyingSizeIsNotRead) {
  const Bytes reason = subpacketOf(reasonLayout().payload());
  for (const unsigned size : {0u, 3u, 500u, 65535u}) {
    const Bytes liar = {99, 1, static_cast<std::uint8_t>(size), static_cast<std::uint8_t>(size >> 8)};
    auto decoder = newDecoder();
    decoder.decode(triggerCode, packetOfSubpackets({liar, reason}));
    EXPECT_EQ(differences({}, decoder.rows()), "") << size;
  }
  Bytes payload = packetOfSubpackets({subpacketOf(configurationLayout().payload()), reason});
  payload[1] = 1;
  auto decoder = newDecoder();
  decoder.decode(triggerCode, payload);
  EXPECT_EQ(decoder.text("Reason"), "");
}

TEST(LTERandomAccessLayouts, AttemptInLiterals) {
  auto decoder = newDecoder();
  decoder.decode(attemptCode, Bytes{1,    1,    0,    0, 6, 2,    40,   0, 2, 4,    1, 7, 0x2A, 0xFF, 0xA6,
                                    0xFF, 0x14, 0x00, 1, 5, 0x10, 0x64, 0, 0, 0xAA, 9, 9, 9,    0x12, 0,
                                    2,    0,    0,    0, 0, 0,    0,    0, 0, 0,    0, 0, 0,    0});
  EXPECT_EQ(differences({{"Attempt", "2"},
                         {"Result", "Aborted"},
                         {"Contention", "Yes"},
                         {"Preamble", "42"},
                         {"Backoff", "20 ms"},
                         {"Temporary C-RNTI", "4101"},
                         {"Timing Advance", "100"},
                         {"Distance", anyText}},
                        decoder.rows()),
            "");
}

}  // namespace
}  // namespace varnel::lte
