#include "LogGenerator/KLV/GSMUMTS/GSMServingCell.h"

#include "tests/support/CellMonitorRecords.h"
#include "tests/support/DecoderHarness.h"
#include "tests/support/PacketBuilder.h"

namespace varnel {
namespace {

using testing::ElementsAre;

constexpr std::uint32_t identityCode = 0x5134;
constexpr std::uint32_t measurementCode = 0x5137;
constexpr std::uint32_t dedicatedCode = 0x5076;
constexpr std::uint32_t cellMonitorCode = 0xFF0001;
constexpr const char* trace = "<4>GSMServingCell";
constexpr const char* failedParse = "<3>Cell Info Array data could not be constructed";
constexpr const char* noArray = "<3>Failed to get Cell Array\n";
constexpr const char* noCellId = "<3>GSMServingCell: Failed to retrieve Cell ID\n";
constexpr const char* noArfcn = "<3>GSMServingCell: Failed to retrieve ARFCN\n";

class GSMServingCellTest : public RowsDecoderTest<GSMServingCell, identityCode> {
 protected:
  void decodeCells(Array records) { decode(cellMonitorMessage(std::move(records)), cellMonitorCode); }
};

Bytes identity(std::size_t size = 26) {
  return PacketBuilder(identityCode, size).fill(0xEE).u16(13, 975).u16(15, 300).u16(17, 40001).bytes();
}

constexpr const char* identityRows = R"({Cell ID: "40001", ARFCN: "975", BSIC: "300"})";

Bytes measurement(std::size_t size = 29) {
  return PacketBuilder(measurementCode, size).fill(0xEE).u8(15, 200).u32(16, 0x0001012C).u32(20, 7).bytes();
}

constexpr const char* measurementRows = R"({RSSI: "200 dBm", C1 Value: "300", C2 Value: "7"})";

Bytes dedicated(std::uint16_t value, std::size_t size = 17) {
  return PacketBuilder(dedicatedCode, size).fill(0xEE).u16(13, value).bytes();
}

Value cell(const char* technology, const char* type, std::int64_t arfcn) {
  return cellRecord(technology, type, {number("CellIdentity", 40002), number("ARFCN", arfcn)});
}

constexpr const char* cellRows = R"({Cell ID: "40002", ARFCN: "62"})";

TEST_F(GSMServingCellTest, AnIdentityPacketShowsThreeEntriesInThisOrder) {
  decode(identity());
  EXPECT_EQ(shown(), identityRows);
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(GSMServingCellTest, EachBitOfAnIdentityCountsInItsOwnEntryAlone) {
  expectTextsOfSingleBits(PacketBuilder(identityCode, 28).bytes(), 13, 28,
                          {{"ARFCN", 13, 0, "0", unsignedWordBits},
                           {"BSIC", 15, 0, "0", unsignedWordBits},
                           {"Cell ID", 17, 0, "0", unsignedWordBits}});
}

TEST_F(GSMServingCellTest, AnIdentityOfAllOnesIsUnsigned) {
  decode(PacketBuilder(identityCode, 26).fill(0xFF).bytes());
  EXPECT_EQ(shown(), R"({Cell ID: "65535", ARFCN: "65535", BSIC: "65535"})");
}

TEST_F(GSMServingCellTest, AnIdentityPacketOf27BytesShowsTheSameAsOneOf26) {
  decode(identity(27));
  EXPECT_EQ(shown(), identityRows);
}

TEST_F(GSMServingCellTest, AMeasurementPacketShowsThreeEntriesInThisOrder) {
  decode(measurement(), measurementCode);
  EXPECT_EQ(shown(), measurementRows);
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(GSMServingCellTest, C1OfMinus10Shows65526) {
  decode(PacketBuilder(measurementCode, 29).u32(16, 0xFFFFFFF6).bytes(), measurementCode);
  EXPECT_EQ(shown("C1 Value"), R"("65526")");
  EXPECT_EQ(shown("C2 Value"), R"("0")");
}

TEST_F(GSMServingCellTest, AMeasurementOfAllOnesIsUnsigned) {
  decode(PacketBuilder(measurementCode, 29).fill(0xFF).bytes(), measurementCode);
  EXPECT_EQ(shown(), R"({RSSI: "255 dBm", C1 Value: "65535", C2 Value: "65535"})");
}

TEST_F(GSMServingCellTest, EachBitOfAMeasurementCountsInItsOwnEntryAloneAndC1AndC2HaveTheLow16) {
  expectTextsOfSingleBits(PacketBuilder(measurementCode, 31).bytes(), 13, 31,
                          {{"RSSI",
                            15,
                            0,
                            "0 dBm",
                            {"1 dBm", "2 dBm", "4 dBm", "8 dBm", "16 dBm", "32 dBm", "64 dBm", "128 dBm"}},
                           {"C1 Value", 16, 0, "0", unsignedWordBits},
                           {"C2 Value", 20, 0, "0", unsignedWordBits}},
                          measurementCode);
}

TEST_F(GSMServingCellTest, AMeasurementPacketOf30BytesShowsTheSameAsOneOf29) {
  decode(measurement(30), measurementCode);
  EXPECT_EQ(shown(), measurementRows);
}

TEST_F(GSMServingCellTest, ADedicatedFieldOf0x0123Shows35) {
  decode(dedicated(0x0123), dedicatedCode);
  EXPECT_EQ(shown(), R"({MA Dedicated ARFCN: "35"})");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(GSMServingCellTest, OnlyTheLowByteOfTheDedicatedFieldIsShown) {
  expectTextsOfSingleBits(PacketBuilder(dedicatedCode, 19).bytes(), 13, 19,
                          {{"MA Dedicated ARFCN", 13, 0, "0", unsignedByteBits}}, dedicatedCode);
  decode(dedicated(0xFFFF), dedicatedCode);
  EXPECT_EQ(shown("MA Dedicated ARFCN"), R"("255")");
}

TEST_F(GSMServingCellTest, DedicatedPacketsOf17And18BytesAreDecoded) {
  for (const std::size_t size : {17u, 18u}) {
    putOldContent();
    decode(dedicated(62, size), dedicatedCode);
    EXPECT_EQ(shown(), R"({Old: "row", MA Dedicated ARFCN: "62"})") << size;
  }
}

TEST_F(GSMServingCellTest, AServingGSMCellShowsTwoEntriesInThisOrder) {
  decodeCells({cell("GSM", "Serving", 62)});
  EXPECT_EQ(shown(), cellRows);
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(GSMServingCellTest, TheFirstServingGSMCellIsTaken) {
  decodeCells({cell("UMTS", "Serving", 1), cell("LTE", "Serving", 2), cell("GSM", "Neighbor", 3),
               cell("GSM", "Serving", 62), cell("GSM", "Serving", 4)});
  EXPECT_EQ(shown(), cellRows);
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(GSMServingCellTest, LaterCellsAreNotLookedAtThoughTheyHaveMore) {
  decodeCells({cellRecord("GSM", "Serving", {number("ARFCN", 1)}), cell("GSM", "Serving", 2)});
  EXPECT_EQ(shown(), R"({ARFCN: "1"})");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace, noCellId));
}

TEST_F(GSMServingCellTest, ElementsThatAreNoRecordsAreSkippedSilently) {
  Array records = elementsThatAreNoRecords("GSM", "Serving", {number("ARFCN", 9)});
  records.push_back(cell("GSM", "Serving", 62));
  decodeCells(records);
  EXPECT_EQ(shown(), cellRows);
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(GSMServingCellTest, AnArrayWithoutAServingGSMCellChangesNothingSilently) {
  expectIgnored(cellMonitorMessage({cell("GSM", "Neighbor", 1), cell("UMTS", "Serving", 2)}), cellMonitorCode,
                {trace});
}

TEST_F(GSMServingCellTest, AnEmptyArrayChangesNothingSilently) {
  expectIgnored(cellMonitorMessage({}), cellMonitorCode, {trace});
}

TEST_F(GSMServingCellTest, ValuesThatAreMissingAreReportedInOrderAndKeepTheirEntries) {
  decode(identity());
  log.take();
  decodeCells({cellRecord("GSM", "Serving")});
  EXPECT_EQ(shown(), identityRows);
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace, noCellId, noArfcn));
}

TEST_F(GSMServingCellTest, AMissingArfcnIsReportedAndTheCellIdIsShown) {
  decodeCells({cellRecord("GSM", "Serving", {number("CellIdentity", 40002)})});
  EXPECT_EQ(shown(), R"({Cell ID: "40002"})");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace, noArfcn));
}

TEST_F(GSMServingCellTest, AValueThatIsNoNumberIsAMissingOne) {
  decodeCells({cellRecord("GSM", "Serving", {{"CellIdentity", "40002"}, {"ARFCN", Value::ofBoolean(true)}})});
  EXPECT_EQ(shown(), "{}");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace, noCellId, noArfcn));
}

TEST_F(GSMServingCellTest, NumbersAreShownAsSigned32BitOnes) {
  decodeCells({cellRecord("GSM", "Serving",
                          {number("CellIdentity", 4294967295), {"ARFCN", Value::ofReal(65598.9)}})});
  EXPECT_EQ(shown(), R"({Cell ID: "-1", ARFCN: "65598"})");
}

TEST_F(GSMServingCellTest, APayloadThatIsNoPropertyListIsReportedTwiceAndChangesNothing) {
  expectIgnored(serverMessageOfText(cellMonitorCode, "<plist"), cellMonitorCode,
                {trace, failedParse, noArray});
}

TEST_F(GSMServingCellTest, APayloadThatIsADictionaryIsReportedAsAFailedParse) {
  expectIgnored(serverMessage(cellMonitorCode, cell("GSM", "Serving", 1)), cellMonitorCode,
                {trace, failedParse, noArray});
}

TEST_F(GSMServingCellTest, EveryTruncatedCellMonitorMessageIsAFailedParse) {
  const Bytes message = cellMonitorMessage({cell("GSM", "Serving", 1)});
  expectIgnoredBelow(message.size(), message, cellMonitorCode, {trace, failedParse, noArray});
}

TEST_F(GSMServingCellTest, EntriesOfTheFourCodesMixAndTheLastValueOfEachStays) {
  decode(dedicated(62), dedicatedCode);
  decode(measurement(), measurementCode);
  decode(identity());
  decodeCells({cell("GSM", "Serving", 62)});
  EXPECT_EQ(shown(), R"({MA Dedicated ARFCN: "62", RSSI: "200 dBm", C1 Value: "300", C2 Value: "7", )"
                     R"(Cell ID: "40002", ARFCN: "62", BSIC: "300"})");
}

}  // namespace
}  // namespace varnel
