#include "LogGenerator/KLV/UTRAN/UTRANServingCellInfo.h"

#include "tests/support/DecoderHarness.h"
#include "tests/support/DictionaryOf.h"
#include "tests/support/PacketBuilder.h"

namespace varnel {
namespace {

using testing::ElementsAre;

constexpr std::uint32_t cellCode = 0xD0E2;
constexpr std::uint32_t cellMonitorCode = 0xFF0001;
constexpr const char* trace = "<4>Serving Cell Info";
constexpr const char* failedParse = "<3>Cell Info Array data could not be constructed";

class UTRANServingCellInfoTest : public RowsDecoderTest<UTRANServingCellInfo, cellCode> {
 protected:
  void decodeCells(Array records) {
    decode(serverMessage(cellMonitorCode, Value::ofArray(std::move(records))), cellMonitorCode);
  }
};

// Fields that all differ; all bits that are not shown are set.
Bytes servingCell(std::size_t size = 26) {
  return PacketBuilder(cellCode, size)
      .fill(0xEE)
      .u8(14, 3)
      .u8(15, 77)
      .u16(17, 9613)
      .u16(19, 10563)
      .u32(21, 26885891)
      .u8(25, 0xFE)
      .bytes();
}

constexpr const char* servingCellRows =
    R"({Cell Access Restrictions: "3", Cell ID: "26885891", Downlink UARFCN: "10563", )"
    R"(Uplink UARFCN: "9613", URA ID: "77", Allowed Access: "All Calls"})";

Value cell(const char* technology, const char* type, std::int64_t uarfcn) {
  return dictionaryOf({{"RadioAccessTechnology", technology},
                       {"CellType", type},
                       {"UARFCN", Value::ofInteger(uarfcn)},
                       {"ScramblingCode", Value::ofInteger(511)},
                       {"BandInfo", Value::ofInteger(8)},
                       {"CellIdentity", Value::ofInteger(26885892)},
                       {"LAC", Value::ofInteger(40002)}});
}

constexpr const char* cellRows =
    R"({Local Area Code: "40002", Cell ID: "26885892", Freq Band Indicator: "8", )"
    R"(Cell Scrambling Code: "511", Uplink UARFCN: "10564", Downlink UARFCN: "10564"})";

TEST_F(UTRANServingCellInfoTest, AModemPacketShowsSixEntriesInThisOrder) {
  decode(servingCell());
  EXPECT_EQ(shown(), servingCellRows);
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(UTRANServingCellInfoTest, AModemPacketOf27BytesShowsTheSameAsOneOf26) {
  decode(servingCell(27));
  EXPECT_EQ(shown(), servingCellRows);
}

TEST_F(UTRANServingCellInfoTest, AllOnesShowAnUnsignedValueInEachEntryButTheIdentity) {
  decode(PacketBuilder(cellCode, 26).fill(0xFF).bytes());
  EXPECT_EQ(shown(), R"({Cell Access Restrictions: "255", Cell ID: "-1", Downlink UARFCN: "65535", )"
                     R"(Uplink UARFCN: "65535", URA ID: "255", Allowed Access: "Emergency Calls Only"})");
}

TEST_F(UTRANServingCellInfoTest, EachBitCountsInItsOwnEntryAlone) {
  const std::vector<std::string_view> byte = {"1", "2", "4", "8", "16", "32", "64", "128"};
  const std::vector<std::string_view> word = {"1",   "2",   "4",    "8",    "16",   "32",   "64",    "128",
                                              "256", "512", "1024", "2048", "4096", "8192", "16384", "32768"};
  expectTextsOfSingleBits(
      PacketBuilder(cellCode, 26).bytes(), 13, 26,
      {{"Cell Access Restrictions", 14, 0, "0", byte},
       {"URA ID", 15, 0, "0", byte},
       {"Uplink UARFCN", 17, 0, "0", word},
       {"Downlink UARFCN", 19, 0, "0", word},
       {"Cell ID", 21, 0, "0", {"1",          "2",          "4",        "8",         "16",        "32",
                                "64",         "128",        "256",      "512",       "1024",      "2048",
                                "4096",       "8192",       "16384",    "32768",     "65536",     "131072",
                                "262144",     "524288",     "1048576",  "2097152",   "4194304",   "8388608",
                                "16777216",   "33554432",   "67108864", "134217728", "268435456", "536870912",
                                "1073741824", "-2147483648"}},
       {"Allowed Access", 25, 0, "All Calls", {"Emergency Calls Only"}}});
}

TEST_F(UTRANServingCellInfoTest, TheLowestBitOfByte25AloneBarsAccess) {
  decode(PacketBuilder(cellCode, 26).u8(25, 0x03).bytes());
  EXPECT_EQ(shown("Allowed Access"), R"("Emergency Calls Only")");
  decode(PacketBuilder(cellCode, 26).u8(25, 0x02).bytes());
  EXPECT_EQ(shown("Allowed Access"), R"("All Calls")");
}

TEST_F(UTRANServingCellInfoTest, ACellMonitorArrayShowsSixEntriesInThisOrder) {
  decodeCells({cell("UTRAN", "Serving", 10564)});
  EXPECT_EQ(shown(), cellRows);
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(UTRANServingCellInfoTest, ACellMonitorUarfcnIsShownAsUplinkAndAsDownlink) {
  decode(servingCell());
  decodeCells({cell("UTRAN", "Serving", 10838)});
  EXPECT_EQ(shown("Uplink UARFCN"), R"("10838")");
  EXPECT_EQ(shown("Downlink UARFCN"), R"("10838")");
}

TEST_F(UTRANServingCellInfoTest, TheLastServingUTRANCellWins) {
  const Value last = cell("UTRAN", "Serving", 10564);
  const Value earlier = dictionaryOf({{"RadioAccessTechnology", "UTRAN"},
                                      {"CellType", "Serving"},
                                      {"UARFCN", Value::ofInteger(1)},
                                      {"ScramblingCode", Value::ofInteger(2)},
                                      {"BandInfo", Value::ofInteger(3)},
                                      {"CellIdentity", Value::ofInteger(4)},
                                      {"LAC", Value::ofInteger(5)}});
  decodeCells({earlier, last});
  EXPECT_EQ(shown(), cellRows);
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(UTRANServingCellInfoTest, ALaterServingUTRANCellLeavesTheEntriesThatItLacksToTheEarlierOne) {
  decodeCells({cell("UTRAN", "Serving", 1), dictionaryOf({{"RadioAccessTechnology", "UTRAN"},
                                                          {"CellType", "Serving"},
                                                          {"UARFCN", Value::ofInteger(10564)}})});
  EXPECT_EQ(shown(), cellRows);
  EXPECT_THAT(log.takeTexts(),
              ElementsAre(trace, "<3>Serving Cell Info: Failed to retrieve LAC\n",
                          "<3>Serving Cell Info: Failed to retrieve Cell ID\n",
                          "<3>Serving Cell Info: Failed to retrieve Freq Band Indicator\n",
                          "<3>Serving Cell Info: Failed to retrieve Cell Scrambling Code\n"));
}

TEST_F(UTRANServingCellInfoTest, AllElementsButServingUTRANCellsAreSkippedSilently) {
  decodeCells({"no record", cell("UTRAN", "Serving", 10564), cell("UTRAN", "Neighbor", 1),
               cell("GSM", "Serving", 2), cell("UMTS", "Serving", 3), cell("LTE", "Serving", 4),
               dictionaryOf({{"CellType", "Serving"}, {"UARFCN", Value::ofInteger(5)}}),
               dictionaryOf({{"RadioAccessTechnology", "UTRAN"}, {"UARFCN", Value::ofInteger(6)}}),
               dictionaryOf({}), Value::ofArray({cell("UTRAN", "Serving", 7)}), Value::ofInteger(8)});
  EXPECT_EQ(shown(), cellRows);
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(UTRANServingCellInfoTest, AnArrayWithoutAServingUTRANCellChangesNothingSilently) {
  expectIgnored(serverMessage(cellMonitorCode, Value::ofArray({cell("UTRAN", "Neighbor", 1)})),
                cellMonitorCode, {trace});
}

TEST_F(UTRANServingCellInfoTest, AnEmptyArrayChangesNothingSilently) {
  expectIgnored(serverMessage(cellMonitorCode, Value::ofArray()), cellMonitorCode, {trace});
}

TEST_F(UTRANServingCellInfoTest, ValuesThatAreMissingAreReportedInOrderAndKeepTheirEntries) {
  decode(servingCell());
  log.take();
  decodeCells({dictionaryOf({{"RadioAccessTechnology", "UTRAN"}, {"CellType", "Serving"}})});
  EXPECT_EQ(shown(), servingCellRows);
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace, "<3>Serving Cell Info: Failed to retrieve LAC\n",
                                           "<3>Serving Cell Info: Failed to retrieve Cell ID\n",
                                           "<3>Serving Cell Info: Failed to retrieve Freq Band Indicator\n",
                                           "<3>Serving Cell Info: Failed to retrieve Cell Scrambling Code\n",
                                           "<3>Serving Cell Info: Failed to retrieve UARFCN\n"));
}

TEST_F(UTRANServingCellInfoTest, AnEntryThatIsNoNumberIsReportedAndTheNextOnesAreShown) {
  const Value record = cell("UTRAN", "Serving", 10564);
  record.dictionary()->set("LAC", "40002");
  record.dictionary()->set("BandInfo", Value::ofBoolean(true));
  record.dictionary()->set("ScramblingCode", Value::ofArray());
  decodeCells({record});
  EXPECT_EQ(shown(), R"({Cell ID: "26885892", Uplink UARFCN: "10564", Downlink UARFCN: "10564"})");
  EXPECT_THAT(log.takeTexts(),
              ElementsAre(trace, "<3>Serving Cell Info: Failed to retrieve LAC\n",
                          "<3>Serving Cell Info: Failed to retrieve Freq Band Indicator\n",
                          "<3>Serving Cell Info: Failed to retrieve Cell Scrambling Code\n"));
}

TEST_F(UTRANServingCellInfoTest, AUarfcnThatIsNoNumberIsReportedOnceAndKeepsBothEntries) {
  decode(servingCell());
  log.take();
  const Value record = cell("UTRAN", "Serving", 10564);
  record.dictionary()->set("UARFCN", "10564");
  decodeCells({record});
  EXPECT_EQ(shown("Uplink UARFCN"), R"("9613")");
  EXPECT_EQ(shown("Downlink UARFCN"), R"("10563")");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace, "<3>Serving Cell Info: Failed to retrieve UARFCN\n"));
}

TEST_F(UTRANServingCellInfoTest, NumbersAreShownAsSigned32BitOnes) {
  const Value record = cell("UTRAN", "Serving", 4294967295);
  record.dictionary()->set("CellIdentity", Value::ofInteger(4294967301));
  record.dictionary()->set("LAC", Value::ofReal(-1.9));
  record.dictionary()->set("BandInfo", Value::ofInteger(2147483648));
  decodeCells({record});
  EXPECT_EQ(shown(), R"({Local Area Code: "-1", Cell ID: "5", Freq Band Indicator: "-2147483648", )"
                     R"(Cell Scrambling Code: "511", Uplink UARFCN: "-1", Downlink UARFCN: "-1"})");
}

TEST_F(UTRANServingCellInfoTest, APayloadThatIsNoPropertyListIsReportedByOneLineAndChangesNothing) {
  expectIgnored(serverMessageOfText(cellMonitorCode, "<plist"), cellMonitorCode, {trace, failedParse});
}

TEST_F(UTRANServingCellInfoTest, APayloadThatIsADictionaryIsReportedAsAFailedParse) {
  expectIgnored(serverMessage(cellMonitorCode, cell("UTRAN", "Serving", 10564)), cellMonitorCode,
                {trace, failedParse});
}

TEST_F(UTRANServingCellInfoTest, EveryTruncatedCellMonitorMessageIsAFailedParse) {
  Bytes message = serverMessage(cellMonitorCode, Value::ofArray({cell("UTRAN", "Serving", 10564)}));
  while (!message.empty()) {
    message.pop_back();
    expectIgnored(message, cellMonitorCode, {trace, failedParse});
  }
}

TEST_F(UTRANServingCellInfoTest, TheLastPacketOfEitherKindIsShownInTheEntriesThatTheyShare) {
  decode(servingCell());
  decodeCells({cell("UTRAN", "Serving", 10564)});
  EXPECT_EQ(shown(),
            R"({Cell Access Restrictions: "3", Cell ID: "26885892", Downlink UARFCN: "10564", )"
            R"(Uplink UARFCN: "10564", URA ID: "77", Allowed Access: "All Calls", Local Area Code: "40002", )"
            R"(Freq Band Indicator: "8", Cell Scrambling Code: "511"})");
  decode(servingCell());
  EXPECT_EQ(shown("Cell ID"), R"("26885891")");
  EXPECT_EQ(shown("Downlink UARFCN"), R"("10563")");
  EXPECT_EQ(shown("Uplink UARFCN"), R"("9613")");
  EXPECT_EQ(shown("Local Area Code"), R"("40002")");
}

}  // namespace
}  // namespace varnel
