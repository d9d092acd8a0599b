#include "LogGenerator/KLV/GSMUMTS/UMTSRRInfo.h"

#include "tests/support/CellMonitorRecords.h"
#include "tests/support/DecoderHarness.h"
#include "tests/support/PacketBuilder.h"

namespace varnel {
namespace {

using testing::ElementsAre;

constexpr std::uint32_t stateCode = 0x4125;
constexpr std::uint32_t powerCode = 0x4031;
constexpr std::uint32_t cellCode = 0x4127;
constexpr std::uint32_t cipheringCode = 0x4157;
constexpr std::uint32_t cellMonitorCode = 0xFF0001;
constexpr const char* trace = "<4>UMTSRRInfo";
constexpr const char* failedParse = "<3>Cell Info Array data could not be constructed";
constexpr const char* noArray = "<3>Failed to get Cell Array\n";
constexpr const char* noCellId = "<3>UMTSRRInfo: Failed to retrieve Cell ID\n";
constexpr const char* noUarfcn = "<3>UMTSRRInfo: Failed to retrieve UARFCN\n";
constexpr const char* noScramblingCode = "<3>UMTSRRInfo: Failed to retrieve Scrambling Code\n";
constexpr const char* noPower = R"({Transmit Power: " nan dBm"})";

Bytes state(std::uint8_t value, std::size_t size = 14) {
  return PacketBuilder(stateCode, size).fill(0xEE).u8(13, value).bytes();
}

// A packet of samples among other bytes that must not count.
Bytes powers(const std::vector<std::int16_t>& samples) {
  PacketBuilder packet(powerCode, 16 + 14 * samples.size());
  packet.fill(0x55).u8(14, static_cast<std::uint8_t>(samples.size()));
  for (std::size_t i = 0; i < samples.size(); ++i) {
    packet.u16(16 + 14 * i + 4, static_cast<std::uint16_t>(samples[i]));
  }
  return packet.bytes();
}

// A cell whose fields all differ.
Bytes servingCell(std::size_t size = 29) {
  return PacketBuilder(cellCode, size)
      .fill(0xEE)
      .u32(13, 9613)
      .u32(17, 10563)
      .u32(21, 26885891)
      .u16(25, 40001)
      .bytes();
}

constexpr const char* servingCellRows =
    R"({Cell ID: "26885891", Downlink Frequency: "10563", Uplink Frequency: "9613", URA ID: "40001"})";

Bytes ciphering(std::uint8_t flag, std::size_t size = 19) {
  return PacketBuilder(cipheringCode, size).fill(0xEE).u8(13, flag).bytes();
}

Value cell(const char* technology, const char* type, std::int64_t uarfcn) {
  return cellRecord(
      technology, type,
      {number("CellIdentity", 26885892), number("UARFCN", uarfcn), number("ScramblingCode", 77)});
}

constexpr const char* cellRows = R"({Cell ID: "26885892", UARFCN: "10564", Scrambling Code: "77"})";

class UMTSRRInfoTest : public RowsDecoderTest<UMTSRRInfo, stateCode> {
 protected:
  void decodeCells(Array records) { decode(cellMonitorMessage(std::move(records)), cellMonitorCode); }
  std::string shownPower(const std::vector<std::int16_t>& samples) {
    decode(powers(samples), powerCode);
    return shown("Transmit Power");
  }
};

TEST_F(UMTSRRInfoTest, AStatePacketShowsItsStateAlone) {
  decode(state(3));
  EXPECT_EQ(shown(), R"({RRC State: "CELL_DCH"})");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(UMTSRRInfoTest, EachStateHasItsTextAndAllFrom6OnAreUnknown) {
  expectTableOfByte(state(0), 13, "RRC State",
                    {"Disconnected", "Connecting", "CELL_FACH", "CELL_DCH", "CELL_PCH", "URA_PCH"},
                    "Unknown");
}

TEST_F(UMTSRRInfoTest, AStatePacketOf15BytesShowsTheSameAsOneOf14) {
  decode(state(5, 15));
  EXPECT_EQ(shown(), R"({RRC State: "URA_PCH"})");
}

TEST_F(UMTSRRInfoTest, SamplesOf88AndMinus12ShowAMeanOfMinus15) {
  decode(powers({88, -12}), powerCode);
  EXPECT_EQ(shown(), R"({Transmit Power: "-15.00 dBm"})");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(UMTSRRInfoTest, APowerPacketWithoutSamplesShowsNotANumberInAFieldOfFour) {
  decode(powers({}), powerCode);
  EXPECT_EQ(shown(), noPower);
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(UMTSRRInfoTest, SamplesOf0AloneShowNotANumber) {
  decode(powers({0, 0, 0}), powerCode);
  EXPECT_EQ(shown(), noPower);
}

TEST_F(UMTSRRInfoTest, SamplesOf0DoNotCountInTheMean) {
  EXPECT_EQ(shownPower({0, 88, 0, -12, 0}), R"("-15.00 dBm")");
}

TEST_F(UMTSRRInfoTest, EachSampleIsTruncatedTowardsZeroBeforeTheMean) {
  EXPECT_EQ(shownPower({97}), R"("-10.00 dBm")");
  EXPECT_EQ(shownPower({98}), R"("-9.00 dBm")");
  EXPECT_EQ(shownPower({-512}), R"("-70.00 dBm")");
  EXPECT_EQ(shownPower({-513}), R"("-70.00 dBm")");
  EXPECT_EQ(shownPower({-521}), R"("-70.00 dBm")");
  EXPECT_EQ(shownPower({-522}), R"("-71.00 dBm")");
  EXPECT_EQ(shownPower({97, 97}), R"("-10.00 dBm")");
}

TEST_F(UMTSRRInfoTest, TheMeanHasTwoDecimals) {
  EXPECT_EQ(shownPower({88, 88, 78}), R"("-10.33 dBm")");
  EXPECT_EQ(shownPower({88, 78, 78}), R"("-10.67 dBm")");
  EXPECT_EQ(shownPower({188}), R"("0.00 dBm")");
  EXPECT_EQ(shownPower({188, 178}), R"("-0.50 dBm")");
  EXPECT_EQ(shownPower({300}), R"("11.00 dBm")");
}

TEST_F(UMTSRRInfoTest, SamplesAreSignedAndTheirSumIsNotCut) {
  EXPECT_EQ(shownPower({32767}), R"("3257.00 dBm")");
  EXPECT_EQ(shownPower({-32768}), R"("-3295.00 dBm")");
  EXPECT_EQ(shownPower({1}), R"("-19.00 dBm")");
  EXPECT_EQ(shownPower({-1}), R"("-19.00 dBm")");
}

TEST_F(UMTSRRInfoTest, TwoHundredFiftyFiveSamplesAllCount) {
  std::vector<std::int16_t> samples(255, 188);
  samples.front() = 698;
  samples.back() = 2738;
  EXPECT_EQ(shownPower(samples), R"("1.20 dBm")");
}

TEST_F(UMTSRRInfoTest, SamplesBehindTheLastOneThatIsCountedDoNotCount) {
  Bytes packet = powers({88, -12, -12});
  packet[14] = 1;
  decode(packet, powerCode);
  EXPECT_EQ(shown("Transmit Power"), R"("-10.00 dBm")");
}

TEST_F(UMTSRRInfoTest, SamplesBeyondThePacketDoNotCount) {
  decode(PacketBuilder(powerCode, 16).u8(14, 255).bytes(), powerCode);
  EXPECT_EQ(shown("Transmit Power"), R"(" nan dBm")");
  Bytes packet = powers({88});
  packet[14] = 255;
  decode(packet, powerCode);
  EXPECT_EQ(shown("Transmit Power"), R"("-10.00 dBm")");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace, trace));
}

TEST_F(UMTSRRInfoTest, EveryTruncatedPowerPacketCountsCutBytesAsZero) {
  // 88 is 0x0058; -12 is 0xFFF4, of which 0xF4 alone is 244 and gives 5.
  const auto check = [&](std::size_t size, const std::vector<std::string>& lines) {
    std::string expected = R"({Old: "row", Transmit Power: "-15.00 dBm"})";
    if (size < 36) expected = R"({Old: "row", Transmit Power: "-2.50 dBm"})";
    if (size < 35) expected = R"({Old: "row", Transmit Power: "-10.00 dBm"})";
    if (size < 21) expected = R"({Old: "row", Transmit Power: " nan dBm"})";
    if (size < 16) expected = oldContent();
    EXPECT_EQ(shown(), expected);
    EXPECT_THAT(lines, ElementsAre(trace));
  };
  forEachTruncation(powers({88, -12}), check, powerCode);
}

TEST_F(UMTSRRInfoTest, PowerPacketsOf16And17BytesAreDecodedAndOneOf15IsNot) {
  decode(PacketBuilder(powerCode, 16).bytes(), powerCode);
  EXPECT_EQ(shown(), noPower);
  *section.dictionary() = {};
  decode(PacketBuilder(powerCode, 17).bytes(), powerCode);
  EXPECT_EQ(shown(), noPower);
  expectIgnored(PacketBuilder(powerCode, 15).bytes(), powerCode, {trace});
}

TEST_F(UMTSRRInfoTest, ACellPacketShowsFourEntriesInThisOrder) {
  decode(servingCell(), cellCode);
  EXPECT_EQ(shown(), servingCellRows);
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(UMTSRRInfoTest, ACellPacketOf30BytesShowsTheSameAsOneOf29) {
  decode(servingCell(30), cellCode);
  EXPECT_EQ(shown(), servingCellRows);
}

TEST_F(UMTSRRInfoTest, CellPacketsOf28BytesAndLessAreDroppedSilentlyAndKeepTheUarfcn) {
  section.dictionary()->set("UARFCN", "10564");
  expectIgnoredBelow(29, servingCell(), cellCode, {trace});
  *section.dictionary() = {};
  section.dictionary()->set("UARFCN", "10564");
  decode(servingCell(28), cellCode);
  EXPECT_EQ(shown(), R"({UARFCN: "10564"})");
}

TEST_F(UMTSRRInfoTest, ValuesOf32BitsAreShownSignedAndTheUraUnsigned) {
  decode(PacketBuilder(cellCode, 29).fill(0xFF).bytes(), cellCode);
  EXPECT_EQ(shown(), R"({Cell ID: "-1", Downlink Frequency: "-1", Uplink Frequency: "-1", URA ID: "65535"})");
}

TEST_F(UMTSRRInfoTest, EachBitOfACellPacketCountsInItsOwnEntryAlone) {
  expectTextsOfSingleBits(PacketBuilder(cellCode, 31).bytes(), 13, 31,
                          {{"Uplink Frequency", 13, 0, "0", signedLongBits},
                           {"Downlink Frequency", 17, 0, "0", signedLongBits},
                           {"Cell ID", 21, 0, "0", signedLongBits},
                           {"URA ID", 25, 0, "0", unsignedWordBits}},
                          cellCode);
}

TEST_F(UMTSRRInfoTest, ACellPacketRemovesTheUarfcnUntilTheNextCellMonitorMessage) {
  decodeCells({cell("UMTS", "Serving", 10564)});
  EXPECT_EQ(shown(), cellRows);
  decode(servingCell(), cellCode);
  EXPECT_EQ(shown(), R"({Cell ID: "26885891", Scrambling Code: "77", Downlink Frequency: "10563", )"
                     R"(Uplink Frequency: "9613", URA ID: "40001"})");
  decodeCells({cell("UMTS", "Serving", 10565)});
  EXPECT_EQ(shown("UARFCN"), R"("10565")");
}

TEST_F(UMTSRRInfoTest, OnlyACellPacketRemovesTheUarfcn) {
  section.dictionary()->set("UARFCN", "10564");
  decode(state(0));
  decode(powers({88}), powerCode);
  decode(ciphering(0), cipheringCode);
  EXPECT_EQ(shown("UARFCN"), R"("10564")");
}

TEST_F(UMTSRRInfoTest, CipheringIsEnabledByAnyFlagBut0) {
  expectTextOfEachByte(
      ciphering(0), 13, "Ciphering", [](unsigned flag) { return flag == 0 ? "Disabled" : "Enabled"; },
      cipheringCode);
}

TEST_F(UMTSRRInfoTest, CipheringPacketsOf19And20BytesAreDecoded) {
  for (const std::size_t size : {19u, 20u}) {
    putOldContent();
    decode(ciphering(1, size), cipheringCode);
    EXPECT_EQ(shown(), R"({Old: "row", Ciphering: "Enabled"})") << size;
  }
}

TEST_F(UMTSRRInfoTest, AServingUMTSCellShowsThreeEntriesInThisOrder) {
  decodeCells({cell("UMTS", "Serving", 10564)});
  EXPECT_EQ(shown(), cellRows);
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(UMTSRRInfoTest, TheFirstServingUMTSCellIsTaken) {
  decodeCells({cell("GSM", "Serving", 1), cell("UTRAN", "Serving", 2), cell("LTE", "Serving", 3),
               cell("UMTS", "Neighbor", 4), cell("UMTS", "Serving", 10564), cell("UMTS", "Serving", 5)});
  EXPECT_EQ(shown(), cellRows);
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(UMTSRRInfoTest, LaterCellsAreNotLookedAtThoughTheyHaveMore) {
  decodeCells({cellRecord("UMTS", "Serving", {number("UARFCN", 1)}), cell("UMTS", "Serving", 2)});
  EXPECT_EQ(shown(), R"({UARFCN: "1"})");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace, noCellId, noScramblingCode));
}

TEST_F(UMTSRRInfoTest, ElementsThatAreNoRecordsAreSkippedSilently) {
  Array records = elementsThatAreNoRecords("UMTS", "Serving", {number("UARFCN", 9)});
  records.push_back(cell("UMTS", "Serving", 10564));
  decodeCells(records);
  EXPECT_EQ(shown(), cellRows);
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(UMTSRRInfoTest, AnArrayWithoutAServingUMTSCellChangesNothingSilently) {
  expectIgnored(cellMonitorMessage({cell("UMTS", "Neighbor", 1), cell("GSM", "Serving", 2)}), cellMonitorCode,
                {trace});
}

TEST_F(UMTSRRInfoTest, AnEmptyArrayChangesNothingSilently) {
  expectIgnored(cellMonitorMessage({}), cellMonitorCode, {trace});
}

TEST_F(UMTSRRInfoTest, ValuesThatAreMissingAreReportedInOrderAndKeepTheirEntries) {
  decodeCells({cell("UMTS", "Serving", 10564)});
  log.take();
  decodeCells({cellRecord("UMTS", "Serving")});
  EXPECT_EQ(shown(), cellRows);
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace, noCellId, noUarfcn, noScramblingCode));
}

TEST_F(UMTSRRInfoTest, EachMissingValueHasItsOwnMessageAndTheOthersAreShown) {
  const auto linesWithout = [&](const char* key) {
    *section.dictionary() = {};
    const Value record = cell("UMTS", "Serving", 10564);
    record.dictionary()->remove(key);
    log.take();
    decodeCells({record});
    return log.takeTexts();
  };
  EXPECT_THAT(linesWithout("CellIdentity"), ElementsAre(trace, noCellId));
  EXPECT_EQ(shown(), R"({UARFCN: "10564", Scrambling Code: "77"})");
  EXPECT_THAT(linesWithout("UARFCN"), ElementsAre(trace, noUarfcn));
  EXPECT_EQ(shown(), R"({Cell ID: "26885892", Scrambling Code: "77"})");
  EXPECT_THAT(linesWithout("ScramblingCode"), ElementsAre(trace, noScramblingCode));
  EXPECT_EQ(shown(), R"({Cell ID: "26885892", UARFCN: "10564"})");
}

TEST_F(UMTSRRInfoTest, AValueThatIsNoNumberIsAMissingOne) {
  decodeCells({cellRecord(
      "UMTS", "Serving",
      {{"CellIdentity", "1"}, {"UARFCN", Value::ofBoolean(true)}, {"ScramblingCode", Value::ofArray()}})});
  EXPECT_EQ(shown(), "{}");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace, noCellId, noUarfcn, noScramblingCode));
}

TEST_F(UMTSRRInfoTest, NumbersAreShownAsSigned32BitOnes) {
  decodeCells({cellRecord("UMTS", "Serving",
                          {number("CellIdentity", 4294967295),
                           number("UARFCN", 2147483648),
                           {"ScramblingCode", Value::ofReal(65613.9)}})});
  EXPECT_EQ(shown(), R"({Cell ID: "-1", UARFCN: "-2147483648", Scrambling Code: "65613"})");
}

TEST_F(UMTSRRInfoTest, APayloadThatIsNoPropertyListIsReportedTwiceAndChangesNothing) {
  expectIgnored(serverMessageOfText(cellMonitorCode, "<plist"), cellMonitorCode,
                {trace, failedParse, noArray});
}

TEST_F(UMTSRRInfoTest, APayloadThatIsADictionaryIsReportedAsAFailedParse) {
  expectIgnored(serverMessage(cellMonitorCode, cell("UMTS", "Serving", 1)), cellMonitorCode,
                {trace, failedParse, noArray});
}

TEST_F(UMTSRRInfoTest, EveryTruncatedCellMonitorMessageIsAFailedParse) {
  const Bytes message = cellMonitorMessage({cell("UMTS", "Serving", 1)});
  expectIgnoredBelow(message.size(), message, cellMonitorCode, {trace, failedParse, noArray});
}

}  // namespace
}  // namespace varnel
