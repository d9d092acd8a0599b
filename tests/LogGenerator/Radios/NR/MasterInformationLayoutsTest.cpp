#include <gtest/gtest.h>

#include "LogGenerator/Radios/NR/MasterInformation.h"
#include "tests/support/VersionedHarness.h"

namespace varnel::nr {
namespace {

constexpr std::uint32_t code = 0xB822;

DecoderAlone<MasterInformation> newDecoder() { return DecoderAlone<MasterInformation>(); }
const LayoutRules rules(newDecoder);

// 3GPP TS 38.104, table 5.4.2.1-1.
std::string frequency(std::uint64_t number) {
  if (number > 3279165) return "";
  const auto steps = static_cast<std::int64_t>(number);
  const std::int64_t frequency_khz = steps < 600000    ? 5 * steps
                                     : steps < 2016667 ? 3000000 + 15 * (steps - 600000)
                                                       : 24250080 + 60 * (steps - 2016667);
  return printed("%.3f MHz", static_cast<double>(frequency_khz) / 1000);
}

DescribedLayout layoutOf(std::uint32_t version) {
  const unsigned spacingBit = version == 3 ? 30 : 31;
  return {.logCode = code,
          .version = {version},
          .size = version == 3 ? 14u : 15u,
          .minimum = version == 3 ? 14u : 15u,
          .fields =
              {
                  {"Physical Cell ID", wordAt(4), 301, plainNumber()},
                  {"NR-ARFCN", longAt(6), 641281, plainNumber()},
                  {"Frequency", longAt(6), 641281, frequency},
                  {"System Frame Number", {10, 0, 10}, 713, plainNumber()},
                  {"Subcarrier Spacing",
                   {10, spacingBit, 2},
                   1,
                   choiceOf({"15 kHz", "30 kHz", "60 kHz", "120 kHz"})},
              },
          .isPlausible = [](ByteView payload) {
            return numberIn(payload, wordAt(4)) <= 1007 && numberIn(payload, longAt(6)) <= 3279165;
          }};
}

TEST(NRMasterInformationLayouts, EachFieldMovesItsRowsOnly) {
  for (const std::uint32_t version : {3u, 0x20000u}) rules.expectEachFieldByItself(layoutOf(version));
}

TEST(NRMasterInformationLayouts, KnownVersionsShowTheirNumber) {
  for (const std::uint32_t version : {3u, 0x20000u}) rules.expectVersionKnown(layoutOf(version));
  auto decoder = newDecoder();
  decoder.decode(code, layoutOf(0x20000).payload());
  EXPECT_EQ(decoder.version(), "2.0");
}

TEST(NRMasterInformationLayouts, NothingPastTheEndIsShown) {
  for (const std::uint32_t version : {3u, 0x20000u}) rules.expectNothingPastTheEnd(layoutOf(version));
  rules.expectUnchangedBelowMinimum(layoutOf(3), layoutOf(0x20000));
  rules.expectUnchangedBelowMinimum(layoutOf(0x20000), layoutOf(3));
}

TEST(NRMasterInformationLayouts, OtherVersionsAreNotKnown) {
  for (const std::uint32_t version : {3u, 0x20000u})
    rules.expectOtherVersionsUnknown(layoutOf(version), {3, 0x20000});
}

TEST(NRMasterInformationLayouts, InLiterals) {
  auto decoder = newDecoder();
  // Cell 1007, number 0x00060B5E = 396126 at 5 kHz each, frame 1023, spacing 2.
  decoder.decode(code, Bytes{3, 0, 0, 0, 0xEF, 0x03, 0x5E, 0x0B, 0x06, 0, 0xFF, 0x03, 0, 0x80});
  EXPECT_EQ(differences({{"Physical Cell ID", "1007"},
                         {"NR-ARFCN", "396126"},
                         {"Frequency", "1980.630 MHz"},
                         {"System Frame Number", "1023"},
                         {"Subcarrier Spacing", "60 kHz"}},
                        decoder.rows()),
            "");
  // The highest number: 24250.08 MHz + 60 kHz x 1262498; spacing 3 in bits 31 and 32.
  decoder.decode(code, Bytes{0, 0, 2, 0, 0, 0, 0x3D, 0x09, 0x32, 0, 0x01, 0, 0, 0x80, 0x01});
  EXPECT_EQ(differences({{"Physical Cell ID", "0"},
                         {"NR-ARFCN", "3279165"},
                         {"Frequency", "99999.960 MHz"},
                         {"System Frame Number", "1"},
                         {"Subcarrier Spacing", "120 kHz"}},
                        decoder.rows()),
            "");
}

TEST(NRMasterInformationLayouts, ImplausibleCellsAndNumbersShowNothing) {
  for (const auto& [cell, number] : {std::pair{1008u, 1u}, std::pair{65535u, 1u}, std::pair{1u, 3279166u}}) {
    Bytes payload = layoutOf(3).payload();
    put(payload, wordAt(4), cell);
    put(payload, longAt(6), number);
    auto decoder = newDecoder();
    decoder.decode(code, layoutOf(0x20000).payload());
    const Rows before = decoder.rows();
    decoder.decode(code, payload);
    EXPECT_EQ(differences(before, decoder.rows()), "") << cell << " " << number;
  }
}

}  // namespace
}  // namespace varnel::nr
