#include "LogGenerator/KLV/GSMUMTS/ServingPLMN.h"

#include "tests/support/CellMonitorRecords.h"
#include "tests/support/DecoderHarness.h"
#include "tests/support/PacketBuilder.h"

namespace varnel {
namespace {

using testing::ElementsAre;

constexpr std::uint32_t identityCode = 0x7135;
constexpr std::uint32_t selectionCode = 0x7132;
constexpr std::uint32_t cellMonitorCode = 0xFF0001;
constexpr const char* trace = "<4>Serving PLMN";
constexpr const char* failedParse = "<3>Cell Info Array data could not be constructed";
constexpr const char* noArray = "<3>Failed to get Cell Array\n";
constexpr const char* noMcc = "<3>ServingPLMN: Failed to retrieve MCC\n";
constexpr const char* noMnc = "<3>ServingPLMN: Failed to retrieve MNC\n";
constexpr const char* noLac = "<3>ServingPLMN: Failed to retrieve LAC\n";

class ServingPLMNTest : public RowsDecoderTest<ServingPLMN, identityCode> {
 protected:
  void decodeCells(Array records) { decode(cellMonitorMessage(std::move(records)), cellMonitorCode); }
  /// The two codes of a network that has these three bytes.
  std::string codesOf(std::uint8_t byte15, std::uint8_t byte16, std::uint8_t byte17) {
    decode(PacketBuilder(identityCode, 32).u8(15, byte15).u8(16, byte16).u8(17, byte17).bytes());
    return shown("Mobile Country Code") + " " + shown("Mobile Network Code");
  }
};

// A network whose fields all differ, among other bytes that must not be shown.
Bytes identity(std::size_t size = 32) {
  return PacketBuilder(identityCode, size)
      .fill(0xEE)
      .u8(14, 3)
      .u8(15, 0x13)
      .u8(16, 0xF0)
      .u8(17, 0x32)
      .u8(18, 0x12)
      .u8(19, 0x34)
      .u8(20, 99)
      .bytes();
}

constexpr const char* identityRows =
    R"({Mobile Country Code: "310", Mobile Network Code: "23 ", Location Area Code: "4660", )"
    R"(Routing Area Code: "99", Service Type: "CS_PS_SERVICE"})";

Bytes selection(std::uint8_t mode, std::size_t size = 16) {
  return PacketBuilder(selectionCode, size).fill(0xEE).u8(14, mode).bytes();
}

Value cell(const char* technology, const char* type, std::int64_t lac) {
  return cellRecord(technology, type, {number("MCC", 262), number("MNC", 1), number("LAC", lac)});
}

constexpr const char* cellRows =
    R"({Mobile Country Code: "262", Mobile Network Code: "1", Location Area Code: "40002"})";

TEST_F(ServingPLMNTest, AnIdentityPacketShowsFiveEntriesInThisOrder) {
  decode(identity());
  EXPECT_EQ(shown(), identityRows);
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(ServingPLMNTest, PlmnBytes0x13_0xF0_0x32Show310And23WithATrailingBlank) {
  EXPECT_EQ(codesOf(0x13, 0xF0, 0x32), R"("310" "23 ")");
}

TEST_F(ServingPLMNTest, AThreeDigitNetworkCodeShowsAllItsDigits) {
  EXPECT_EQ(codesOf(0x21, 0x63, 0x54), R"("123" "456")");
}

TEST_F(ServingPLMNTest, ANibbleOf9IsADigitAndAllFrom10OnAreBlanksInEachPlace) {
  EXPECT_EQ(codesOf(0x99, 0x99, 0x99), R"("999" "999")");
  EXPECT_EQ(codesOf(0xFF, 0xFF, 0xFF), R"("   " "   ")");
  EXPECT_EQ(codesOf(0xAA, 0xAA, 0xAA), R"("   " "   ")");
  EXPECT_EQ(codesOf(0x1A, 0x00, 0x00), R"(" 10" "000")");
  EXPECT_EQ(codesOf(0xA1, 0x00, 0x00), R"("1 0" "000")");
  EXPECT_EQ(codesOf(0x11, 0x0B, 0x00), R"("11 " "000")");
  EXPECT_EQ(codesOf(0x00, 0xC0, 0x00), R"("000" "00 ")");
  EXPECT_EQ(codesOf(0x00, 0x00, 0x0D), R"("000" " 00")");
  EXPECT_EQ(codesOf(0x00, 0x00, 0xE0), R"("000" "0 0")");
}

TEST_F(ServingPLMNTest, AHighDigitOf9ShowsWhateverItsLowNeighborIs) {
  EXPECT_EQ(codesOf(0x9F, 0x9F, 0x9F), R"(" 9 " " 99")");
}

TEST_F(ServingPLMNTest, LacBytes0x12_0x34Show4660) {
  decode(PacketBuilder(identityCode, 32).u8(18, 0x12).u8(19, 0x34).bytes());
  EXPECT_EQ(shown("Location Area Code"), R"("4660")");
}

TEST_F(ServingPLMNTest, AreaCodesAreUnsigned) {
  decode(PacketBuilder(identityCode, 32).fill(0xFF).bytes());
  EXPECT_EQ(shown(), R"({Mobile Country Code: "   ", Mobile Network Code: "   ", )"
                     R"(Location Area Code: "65535", Routing Area Code: "255", Service Type: "Unknown"})");
}

TEST_F(ServingPLMNTest, EachBitCountsInItsOwnEntryAlone) {
  expectTextsOfSingleBits(
      PacketBuilder(identityCode, 32).bytes(), 13, 32,
      {{"Service Type",
        14,
        0,
        "NO_SERVICE",
        {"CS_ONLY", "PS_ONLY", "LIMITED_SERVICE", "Unknown", "Unknown", "Unknown", "Unknown", "Unknown"}},
       {"Mobile Country Code",
        15,
        0,
        "000",
        {"100", "200", "400", "800", "010", "020", "040", "080", "001", "002", "004", "008"}},
       {"Mobile Network Code",
        16,
        4,
        "000",
        {"001", "002", "004", "008", "100", "200", "400", "800", "010", "020", "040", "080"}},
       {"Location Area Code",
        18,
        0,
        "0",
        {"256", "512", "1024", "2048", "4096", "8192", "16384", "32768", "1", "2", "4", "8", "16", "32", "64",
         "128"}},
       {"Routing Area Code", 20, 0, "0", unsignedByteBits}});
}

TEST_F(ServingPLMNTest, EachServiceTypeHasItsTextAndAllFrom5OnAreUnknown) {
  expectTableOfByte(identity(), 14, "Service Type",
                    {"NO_SERVICE", "CS_ONLY", "PS_ONLY", "CS_PS_SERVICE", "LIMITED_SERVICE"}, "Unknown");
}

TEST_F(ServingPLMNTest, AnIdentityPacketOf33BytesShowsTheSameAsOneOf32) {
  decode(identity(33));
  EXPECT_EQ(shown(), identityRows);
}

TEST_F(ServingPLMNTest, ASelectionPacketShowsTheModeInByte14Alone) {
  decode(selection(1), selectionCode);
  EXPECT_EQ(shown(), R"({PLMN Sel Mod: "Manual"})");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(ServingPLMNTest, EachSelectionModeHasItsTextAndAllFrom5OnAreUnknown) {
  expectTableOfByte(selection(0), 14, "PLMN Sel Mod",
                    {"Automatic", "Manual", "Limited", "LIMITED_ROUTINE_ACQ", "LIMITED_MANUAL_ACQ"},
                    "Unknown", selectionCode);
}

TEST_F(ServingPLMNTest, SelectionPacketsOf16And17BytesAreDecoded) {
  for (const std::size_t size : {16u, 17u}) {
    putOldContent();
    decode(selection(0, size), selectionCode);
    EXPECT_EQ(shown(), R"({Old: "row", PLMN Sel Mod: "Automatic"})") << size;
  }
}

TEST_F(ServingPLMNTest, AServingGSMCellShowsThreeDecimalsInThisOrder) {
  decodeCells({cell("GSM", "Serving", 40002)});
  EXPECT_EQ(shown(), cellRows);
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(ServingPLMNTest, AServingUMTSCellShowsThemAsWell) {
  decodeCells({cell("UMTS", "Serving", 40002)});
  EXPECT_EQ(shown(), cellRows);
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(ServingPLMNTest, TheFirstServingGSMOrUMTSCellIsTaken) {
  decodeCells({cell("LTE", "Serving", 1), cell("UTRAN", "Serving", 2), cell("GSM", "Neighbor", 3),
               cell("UMTS", "Neighbor", 4), cell("gsm", "Serving", 5), cell("UMTS", "Serving", 40002),
               cell("GSM", "Serving", 6), cell("UMTS", "Serving", 7)});
  EXPECT_EQ(shown(), cellRows);
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(ServingPLMNTest, AGSMCellBeforeAUMTSCellIsTaken) {
  decodeCells({cell("GSM", "Serving", 40002), cell("UMTS", "Serving", 1)});
  EXPECT_EQ(shown(), cellRows);
}

TEST_F(ServingPLMNTest, LaterCellsAreNotLookedAtThoughTheyHaveMore) {
  decodeCells({cellRecord("GSM", "Serving", {number("MNC", 1)}), cell("UMTS", "Serving", 40002)});
  EXPECT_EQ(shown(), R"({Mobile Network Code: "1"})");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace, noMcc, noLac));
}

TEST_F(ServingPLMNTest, ElementsThatAreNoRecordsAreSkippedSilently) {
  Array records =
      elementsThatAreNoRecords("GSM", "Serving", {number("MCC", 9), number("MNC", 9), number("LAC", 9)});
  records.push_back(cell("GSM", "Serving", 40002));
  decodeCells(records);
  EXPECT_EQ(shown(), cellRows);
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(ServingPLMNTest, AnArrayWithoutSuchACellChangesNothingSilently) {
  expectIgnored(cellMonitorMessage({cell("GSM", "Neighbor", 1), cell("LTE", "Serving", 2)}), cellMonitorCode,
                {trace});
}

TEST_F(ServingPLMNTest, AnEmptyArrayChangesNothingSilently) {
  expectIgnored(cellMonitorMessage({}), cellMonitorCode, {trace});
}

TEST_F(ServingPLMNTest, ValuesThatAreMissingAreReportedInOrderAndKeepTheirEntries) {
  decode(identity());
  log.take();
  decodeCells({cellRecord("UMTS", "Serving")});
  EXPECT_EQ(shown(), identityRows);
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace, noMcc, noMnc, noLac));
}

TEST_F(ServingPLMNTest, EachMissingValueHasItsOwnMessageAndTheOthersAreShown) {
  const auto linesWithout = [&](const char* key) {
    *section.dictionary() = {};
    const Value record = cell("GSM", "Serving", 40002);
    record.dictionary()->remove(key);
    log.take();
    decodeCells({record});
    return log.takeTexts();
  };
  EXPECT_THAT(linesWithout("MCC"), ElementsAre(trace, noMcc));
  EXPECT_EQ(shown(), R"({Mobile Network Code: "1", Location Area Code: "40002"})");
  EXPECT_THAT(linesWithout("MNC"), ElementsAre(trace, noMnc));
  EXPECT_EQ(shown(), R"({Mobile Country Code: "262", Location Area Code: "40002"})");
  EXPECT_THAT(linesWithout("LAC"), ElementsAre(trace, noLac));
  EXPECT_EQ(shown(), R"({Mobile Country Code: "262", Mobile Network Code: "1"})");
}

TEST_F(ServingPLMNTest, AValueThatIsNoNumberIsAMissingOne) {
  decodeCells({cellRecord("GSM", "Serving",
                          {{"MCC", "262"}, {"MNC", Value::ofBoolean(true)}, {"LAC", Value::ofArray()}})});
  EXPECT_EQ(shown(), "{}");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace, noMcc, noMnc, noLac));
}

TEST_F(ServingPLMNTest, NumbersAreShownAsSigned32BitOnesWithoutLeadingZeros) {
  decodeCells(
      {cellRecord("GSM", "Serving",
                  {number("MCC", 4294967295), {"MNC", Value::ofReal(-1.9)}, number("LAC", 2147483648)})});
  EXPECT_EQ(shown(),
            R"({Mobile Country Code: "-1", Mobile Network Code: "-1", Location Area Code: "-2147483648"})");
  decodeCells(
      {cellRecord("GSM", "Serving", {number("MCC", 1), number("MNC", 0), number("LAC", 4294967301)})});
  EXPECT_EQ(shown(), R"({Mobile Country Code: "1", Mobile Network Code: "0", Location Area Code: "5"})");
}

TEST_F(ServingPLMNTest, APayloadThatIsNoPropertyListIsReportedTwiceAndChangesNothing) {
  expectIgnored(serverMessageOfText(cellMonitorCode, "<plist"), cellMonitorCode,
                {trace, failedParse, noArray});
}

TEST_F(ServingPLMNTest, APayloadThatIsADictionaryIsReportedAsAFailedParse) {
  expectIgnored(serverMessage(cellMonitorCode, cell("GSM", "Serving", 1)), cellMonitorCode,
                {trace, failedParse, noArray});
}

TEST_F(ServingPLMNTest, EveryTruncatedCellMonitorMessageIsAFailedParse) {
  const Bytes message = cellMonitorMessage({cell("GSM", "Serving", 1)});
  expectIgnoredBelow(message.size(), message, cellMonitorCode, {trace, failedParse, noArray});
}

TEST_F(ServingPLMNTest, WhicheverCameLastIsShownInTheEntriesThatTheCodesShare) {
  decode(selection(0), selectionCode);
  decode(identity());
  decodeCells({cell("GSM", "Serving", 40002)});
  EXPECT_EQ(shown(),
            R"({PLMN Sel Mod: "Automatic", Mobile Country Code: "262", Mobile Network Code: "1", )"
            R"(Location Area Code: "40002", Routing Area Code: "99", Service Type: "CS_PS_SERVICE"})");
  decode(identity());
  EXPECT_EQ(shown(),
            R"({PLMN Sel Mod: "Automatic", Mobile Country Code: "310", Mobile Network Code: "23 ", )"
            R"(Location Area Code: "4660", Routing Area Code: "99", Service Type: "CS_PS_SERVICE"})");
}

}  // namespace
}  // namespace varnel
