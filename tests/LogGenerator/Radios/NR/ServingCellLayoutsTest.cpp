#include <gtest/gtest.h>

#include "LogGenerator/Radios/NR/ServingCell.h"
#include "tests/support/VersionedHarness.h"

namespace varnel::nr {
namespace {

constexpr std::uint32_t code = 0xB823;

DecoderAlone<ServingCell> newDecoder() { return DecoderAlone<ServingCell>(); }
const LayoutRules rules(newDecoder);

std::string frequency(std::uint64_t number) {
  if (number > 3279165) return "";
  const auto steps = static_cast<std::int64_t>(number);
  const std::int64_t frequency_khz = steps < 600000    ? 5 * steps
                                     : steps < 2016667 ? 3000000 + 15 * (steps - 600000)
                                                       : 24250080 + 60 * (steps - 2016667);
  return printed("%.3f MHz", static_cast<double>(frequency_khz) / 1000);
}

// Where the fields behind the cell begin, in this version.
std::size_t cellAt(std::uint32_t version) { return version >= 0x30002 ? 7 : 4; }
std::size_t behindCell(std::uint32_t version) { return cellAt(version) + (version == 4 ? 2 : 10); }

DescribedLayout layoutOf(std::uint32_t version) {
  const std::size_t cell = cellAt(version), at = behindCell(version);
  const BitRun uplink = longAt(at + 4);
  return {.logCode = code,
          .version = {version},
          .size = at + 32,
          .minimum = at + 32,
          .fields =
              {
                  {"Physical Cell ID", wordAt(cell), 301, plainNumber()},
                  {"NR-ARFCN", longAt(at), 521310, plainNumber()},
                  {"Downlink Frequency", longAt(at), 521310, frequency},
                  {"Uplink NR-ARFCN", uplink, 504990, plainNumber()},
                  {"Uplink Frequency", uplink, 504990, frequency},
                  {"Downlink Bandwidth", wordAt(at + 8), 100, plainNumber("%lld MHz")},
                  {"Uplink Bandwidth", wordAt(at + 10), 40, plainNumber("%lld MHz")},
                  {"Cell Identity",
                   {at + 12, 0, 64},
                   0x123456789,
                   [](std::uint64_t number) { return std::to_string(number); }},
                  {"Allowed Access", byteAt(at + 25), 1, plainNumber()},
                  {"Tracking Area Code", longAt(at + 26), 8465153, plainNumber()},
                  {"Band", wordAt(at + 30), 41, plainNumber("n%lld")},
              },
          .derived = {{"PLMN", [](ByteView) { return std::string("262-007"); }}},
          // Of an uplink number beyond the last nobody tells what to show.
          .fixed = {{{at + 4, 20, 12}, 0},
                    {{at + 4, 0, 20}, 504990},
                    {wordAt(at + 20), 262},
                    {byteAt(at + 22), 3},
                    {wordAt(at + 23), 7}},
          .isPlausible = [=](ByteView payload) {
            return numberIn(payload, wordAt(cell)) <= 1007 && numberIn(payload, longAt(at)) <= 3279165;
          }};
}

const std::vector<std::uint32_t> versions = {4, 0x30000, 0x30002, 0x30003};

TEST(NRServingCellLayouts, LengthsAreThoseOfThePackets) {
  EXPECT_EQ(layoutOf(4).size, 38u);
  EXPECT_EQ(layoutOf(0x30000).size, 46u);
  EXPECT_EQ(layoutOf(0x30002).size, 49u);
  EXPECT_EQ(layoutOf(0x30003).size, 49u);
}

TEST(NRServingCellLayouts, EachFieldMovesItsRowsOnly) {
  for (const std::uint32_t version : versions) rules.expectEachFieldByItself(layoutOf(version));
}

TEST(NRServingCellLayouts, UplinkNumbersMoveTheirRowsOnly) {
  for (const std::uint32_t version : versions) {
    const DescribedLayout layout = layoutOf(version);
    for (unsigned bit = 0; bit < 21; ++bit) {
      Bytes payload = layout.payload();
      put(payload, longAt(behindCell(version) + 4), 1u << bit);
      auto decoder = newDecoder();
      decoder.decode(code, payload);
      EXPECT_EQ(differences(layout.rowsOf(payload), decoder.rows()), "") << layout.name() << " bit " << bit;
    }
  }
}

TEST(NRServingCellLayouts, PLMNHasTheDigitsThatThePacketTells) {
  for (const std::uint32_t version : versions) {
    const auto shown = [&](unsigned country, unsigned digits, unsigned network) {
      Bytes payload = layoutOf(version).payload();
      const std::size_t at = behindCell(version) + 20;
      put(payload, wordAt(at), country);
      put(payload, byteAt(at + 2), digits);
      put(payload, wordAt(at + 3), network);
      auto decoder = newDecoder();
      decoder.decode(code, payload);
      return decoder.text("PLMN");
    };
    EXPECT_EQ(shown(1, 2, 1), "001-01");
    EXPECT_EQ(shown(310, 3, 4), "310-004");
    EXPECT_EQ(shown(310, 3, 410), "310-410");
    for (unsigned bit = 0; bit < 10; ++bit) {
      EXPECT_EQ(shown(1u << bit, 3, 1), printed("%03u-001", 1u << bit));
      EXPECT_EQ(shown(262, 3, 1u << bit), printed("262-%03u", 1u << bit));
    }
  }
}

TEST(NRServingCellLayouts, KnownVersionsShowTheirNumber) {
  for (const std::uint32_t version : versions) rules.expectVersionKnown(layoutOf(version));
  auto decoder = newDecoder();
  decoder.decode(code, layoutOf(0x30002).payload());
  EXPECT_EQ(decoder.version(), "3.2");
}

TEST(NRServingCellLayouts, NothingPastTheEndIsShown) {
  for (const std::uint32_t version : versions) {
    rules.expectNothingPastTheEnd(layoutOf(version));
    rules.expectUnchangedBelowMinimum(layoutOf(version), layoutOf(version == 4 ? 0x30000 : 4));
  }
}

TEST(NRServingCellLayouts, OtherVersionsAreNotKnown) {
  for (const std::uint32_t version : versions) rules.expectOtherVersionsUnknown(layoutOf(version), versions);
}

TEST(NRServingCellLayouts, ImplausibleCellsAndNumbersShowNothing) {
  for (const std::uint32_t version : versions) {
    for (const auto& [cell, number] :
         {std::pair{1008u, 1u}, std::pair{65535u, 1u}, std::pair{1u, 3279166u}}) {
      Bytes payload = layoutOf(version).payload();
      put(payload, wordAt(cellAt(version)), cell);
      put(payload, longAt(behindCell(version)), number);
      auto decoder = newDecoder();
      decoder.decode(code, payload);
      EXPECT_EQ(differences({}, decoder.rows()), "") << cell << " " << number;
    }
  }
}

TEST(NRServingCellLayouts, InLiterals) {
  auto decoder = newDecoder();
  // Number 0x000A0001 = 655361: 3000 MHz + 15 kHz x 55361. Identity 2 to the 35th and 1.
  decoder.decode(code,
                 Bytes{4, 0, 0, 0, 0x64, 0, 0x01, 0x00, 0x0A, 0, 0x01, 0x00, 0x0A, 0,    80,   0, 20, 0,  1,
                       0, 0, 0, 8, 0,    0, 0,    0x36, 0x01, 3, 0x04, 0x01, 2,    0x10, 0x27, 0, 0,  78, 0});
  EXPECT_EQ(decoder.text("Physical Cell ID"), "100");
  EXPECT_EQ(decoder.text("NR-ARFCN"), "655361");
  EXPECT_EQ(decoder.text("Downlink Frequency"), "3830.415 MHz");
  EXPECT_EQ(decoder.text("Uplink Frequency"), "3830.415 MHz");
  EXPECT_EQ(decoder.text("Downlink Bandwidth"), "80 MHz");
  EXPECT_EQ(decoder.text("Uplink Bandwidth"), "20 MHz");
  EXPECT_EQ(decoder.text("Cell Identity"), "34359738369");
  EXPECT_EQ(decoder.text("PLMN"), "310-260");
  EXPECT_EQ(decoder.text("Allowed Access"), "2");
  EXPECT_EQ(decoder.text("Tracking Area Code"), "10000");
  EXPECT_EQ(decoder.text("Band"), "n78");
}

}  // namespace
}  // namespace varnel::nr
