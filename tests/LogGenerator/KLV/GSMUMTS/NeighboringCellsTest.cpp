#include "LogGenerator/KLV/GSMUMTS/NeighboringCells.h"

#include "tests/support/CellMonitorRecords.h"
#include "tests/support/DecoderHarness.h"
#include "tests/support/PacketBuilder.h"

namespace varnel {
namespace {

using testing::ElementsAre;

constexpr std::uint32_t measurementCode = 0x5137;
constexpr std::uint32_t colorCode = 0x51FF;
constexpr std::uint32_t cellMonitorCode = 0xFF0001;
constexpr const char* trace = "<4>NeighboringCells";
constexpr const char* failedParse = "<3>Cell Info Array data could not be constructed";
constexpr const char* noArray = "<3>Failed to get Cell Array\n";
constexpr const char* noArfcn = "<3>NeighboringCells: Failed to retrieve ARFCN\n";
constexpr const char* noRssi = "<3>NeighboringCells: Failed to retrieve RSSI\n";

// A packet of zeros with a count of neighbors.
PacketBuilder counted(std::uint8_t neighbors, std::size_t size) {
  PacketBuilder packet(measurementCode, size);
  packet.u8(28, neighbors);
  return packet;
}

// Two neighbors whose fields all differ, among other bytes that must not be shown.
Bytes twoNeighbors() {
  return PacketBuilder(measurementCode, 57)
      .fill(0xEE)
      .u8(28, 2)
      .u16(29, 975)
      .u8(31, 200)
      .u32(32, 0xFFFFFFF6)
      .u16(43, 62)
      .u8(45, 12)
      .u32(46, 66051)
      .bytes();
}

std::string row(const char* arfcn, const char* rssi, const char* c1, const char* bsic = nullptr) {
  return std::string("{ARFCN: \"") + arfcn + "\", RSSI: \"" + rssi + "\", C1 Value: \"" + c1 + "\"" +
         (bsic ? std::string(", BSIC: \"") + bsic + "\"" : "") + "}";
}

struct Color {
  std::uint16_t arfcn;
  std::uint8_t bsic;
};

// A list of BSICs among other bytes that must not count.
Bytes colors(const std::vector<Color>& list) {
  PacketBuilder packet(colorCode, 15 + 4 * list.size());
  packet.fill(0xEE).u8(14, static_cast<std::uint8_t>(list.size()));
  for (std::size_t i = 0; i < list.size(); ++i) {
    packet.u16(15 + 4 * i, list[i].arfcn).u8(15 + 4 * i + 2, list[i].bsic);
  }
  return packet.bytes();
}

Value cell(const char* technology, const char* type, std::int64_t arfcn) {
  return cellRecord(technology, type, {number("ARFCN", arfcn), number("RSSI", -43)});
}

constexpr const char* cellRows = R"({ARFCN: "62", RSSI: "-86 dBm"})";

class NeighboringCellsTest : public ListDecoderTest<NeighboringCells, measurementCode> {
 protected:
  void decodeColors(const std::vector<Color>& list) { decode(colors(list), colorCode); }
  void decodeCells(Array records) { decode(cellMonitorMessage(std::move(records)), cellMonitorCode); }
  /// The BSIC that a single neighbor of that ARFCN shows.
  std::string bsicOf(std::uint16_t arfcn) {
    decode(counted(1, 43).u16(29, arfcn).bytes());
    return shown("BSIC");
  }
  /// Expects the message to empty a filled list and to log only these lines.
  void expectEmptied(const Bytes& message, const std::vector<std::string>& lines) {
    putOldContent();
    log.take();
    decode(message, cellMonitorCode);
    EXPECT_EQ(shown(), "[]") << message.size() << " bytes";
    EXPECT_EQ(log.takeTexts(), lines) << message.size() << " bytes";
  }
};

TEST_F(NeighboringCellsTest, EachNeighborHasThreeEntriesInThisOrder) {
  decode(twoNeighbors());
  EXPECT_EQ(shown(), R"([{ARFCN: "975", RSSI: "200", C1 Value: "-10"}, )"
                     R"({ARFCN: "62", RSSI: "12", C1 Value: "66051"}])");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(NeighboringCellsTest, EachBitCountsInItsOwnEntryAlone) {
  expectTextsOfSingleBits(counted(1, 57).bytes(), 29, 57,
                          {{"ARFCN", 29, 0, "0", unsignedWordBits},
                           {"RSSI", 31, 0, "0", unsignedByteBits},
                           {"C1 Value", 32, 0, "0", signedLongBits}});
  expectTextsOfSingleBits(
      counted(1, 57).bytes(), 13, 28,
      {{"ARFCN", 29, 0, "0", {}}, {"RSSI", 31, 0, "0", {}}, {"C1 Value", 32, 0, "0", {}}});
}

TEST_F(NeighboringCellsTest, ANeighborOfAllOnesIsUnsignedButForC1) {
  decode(counted(0, 43).fill(0xFF).u8(28, 1).bytes());
  EXPECT_EQ(shown(), "[" + row("65535", "255", "-1") + "]");
}

TEST_F(NeighboringCellsTest, ANeighborOfTheLastBsicListShowsItsBsicBehindTheOtherEntries) {
  decodeColors({{62, 21}});
  decode(twoNeighbors());
  EXPECT_EQ(shown(), R"([{ARFCN: "975", RSSI: "200", C1 Value: "-10"}, )"
                     R"({ARFCN: "62", RSSI: "12", C1 Value: "66051", BSIC: "21"}])");
}

TEST_F(NeighboringCellsTest, ABsicListDoesNotTouchTheSection) {
  putOldContent();
  decodeColors({{62, 21}});
  EXPECT_EQ(shown(), oldContent());
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(NeighboringCellsTest, ABsicListServesEveryPacketUntilTheNextOne) {
  decodeColors({{62, 21}, {975, 255}});
  decode(twoNeighbors());
  decode(twoNeighbors());
  EXPECT_EQ(shown(), "[" + row("975", "200", "-10", "255") + ", " + row("62", "12", "66051", "21") + "]");
}

TEST_F(NeighboringCellsTest, ABsicListReplacesTheWholeOneBefore) {
  decodeColors({{62, 21}, {975, 22}});
  decodeColors({{975, 23}});
  decode(twoNeighbors());
  EXPECT_EQ(shown(), "[" + row("975", "200", "-10", "23") + ", " + row("62", "12", "66051") + "]");
}

TEST_F(NeighboringCellsTest, AfterABsicListOfCount0NoNeighborShowsABsic) {
  decodeColors({{62, 21}, {975, 22}});
  decodeColors({});
  decode(twoNeighbors());
  EXPECT_EQ(shown(), "[" + row("975", "200", "-10") + ", " + row("62", "12", "66051") + "]");
}

TEST_F(NeighboringCellsTest, TheLastOfTwoBsicsForOneArfcnWins) {
  decodeColors({{62, 21}, {63, 5}, {62, 22}});
  EXPECT_EQ(bsicOf(62), R"("22")");
  EXPECT_EQ(bsicOf(63), R"("5")");
}

TEST_F(NeighboringCellsTest, BsicsBelongToTheWholeArfcn) {
  decodeColors({{0x0102, 1}});
  EXPECT_EQ(bsicOf(0x0102), R"("1")");
  EXPECT_EQ(bsicOf(0x0002), "absent");
  EXPECT_EQ(bsicOf(0x0100), "absent");
  decodeColors({{0xFFFF, 0}});
  EXPECT_EQ(bsicOf(0xFFFF), R"("0")");
}

TEST_F(NeighboringCellsTest, BsicsBehindTheLastOneThatIsCountedDoNotCount) {
  Bytes packet = colors({{62, 21}, {975, 22}});
  packet[14] = 1;
  decode(packet, colorCode);
  EXPECT_EQ(bsicOf(62), R"("21")");
  EXPECT_EQ(bsicOf(975), "absent");
}

TEST_F(NeighboringCellsTest, TwoHundredFiftyFiveBsicsAllCount) {
  std::vector<Color> list;
  for (std::uint16_t i = 0; i < 255; ++i) {
    list.push_back({static_cast<std::uint16_t>(1000 + i), static_cast<std::uint8_t>(i)});
  }
  decodeColors(list);
  EXPECT_EQ(bsicOf(1000), R"("0")");
  EXPECT_EQ(bsicOf(1254), R"("254")");
  EXPECT_EQ(bsicOf(1255), "absent");
}

TEST_F(NeighboringCellsTest, BsicsBeyondThePacketAreThoseOfArfcn0) {
  decode(PacketBuilder(colorCode, 15).u8(14, 255).bytes(), colorCode);
  EXPECT_EQ(bsicOf(0), R"("0")");
  EXPECT_EQ(bsicOf(1), "absent");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace, trace, trace));
}

TEST_F(NeighboringCellsTest, EveryTruncatedBsicListReadsZerosForWhatIsCutOff) {
  // 300 is 0x012C, 975 is 0x03CF.
  const Bytes whole = colors({{300, 21}, {975, 22}});
  for (std::size_t size = 15; size < whole.size(); ++size) {
    SCOPED_TRACE(std::to_string(size) + " bytes");
    decodeColors({});
    decode(Bytes(whole.data(), whole.data() + size), colorCode);
    EXPECT_EQ(bsicOf(300), size >= 18 ? R"("21")" : size == 17 ? R"("0")" : "absent");
    EXPECT_EQ(bsicOf(44), size == 16 ? R"("0")" : "absent");
    EXPECT_EQ(bsicOf(975), size >= 22 ? R"("22")" : size == 21 ? R"("0")" : "absent");
    EXPECT_EQ(bsicOf(207), size == 20 ? R"("0")" : "absent");
    EXPECT_EQ(bsicOf(0), size < 20 ? R"("0")" : "absent");
  }
}

TEST_F(NeighboringCellsTest, BsicListsOf14BytesAndLessKeepTheOneBefore) {
  decodeColors({{62, 21}});
  log.take();
  expectIgnoredBelow(15, colors({{62, 22}}), colorCode, {trace});
  EXPECT_EQ(bsicOf(62), R"("21")");
}

TEST_F(NeighboringCellsTest, ABsicListOf16BytesIsTakenLikeOneOf15) {
  for (const std::size_t size : {15u, 16u}) {
    decodeColors({{62, 21}});
    decode(PacketBuilder(colorCode, size).bytes(), colorCode);
    EXPECT_EQ(bsicOf(62), "absent") << size;
  }
}

TEST_F(NeighboringCellsTest, EachPacketReplacesTheListOfTheLastOne) {
  putOldContent();
  decode(twoNeighbors());
  EXPECT_EQ(rowCount(), 2u);
  decode(counted(1, 43).u16(29, 7).bytes());
  EXPECT_EQ(shown(), "[" + row("7", "0", "0") + "]");
}

TEST_F(NeighboringCellsTest, ACountOf0EmptiesTheListSilently) {
  putOldContent();
  decode(counted(0, 57).bytes());
  EXPECT_EQ(shown(), "[]");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(NeighboringCellsTest, TwoHundredFiftyFiveNeighborsAreAllShown) {
  decode(counted(255, 3599).u16(29, 1).u16(3585, 255).bytes());
  ASSERT_EQ(rowCount(), 255u);
  EXPECT_EQ(described(section.array()->front()), row("1", "0", "0"));
  EXPECT_EQ(described(section.array()->back()), row("255", "0", "0"));
}

TEST_F(NeighboringCellsTest, NeighborsBeyondThePacketShowZeros) {
  putOldContent();
  decode(counted(255, 29).bytes());
  ASSERT_EQ(rowCount(), 255u);
  for (const Value& neighbor : *section.array()) EXPECT_EQ(described(neighbor), row("0", "0", "0"));
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(NeighboringCellsTest, PacketsOf29And30BytesAreAccepted) {
  for (const std::size_t size : {29u, 30u}) {
    putOldContent();
    decode(counted(0, size).bytes());
    EXPECT_EQ(shown(), "[]") << size;
  }
}

TEST_F(NeighboringCellsTest, EveryTruncatedPacketShowsBothNeighborsWithZerosForWhatIsCutOff) {
  // 975 is 0x03CF, -10 is 0xFFFFFFF6, 66051 is 0x00010203.
  const auto firstOf = [](std::size_t size) {
    if (size >= 36) return row("975", "200", "-10");
    if (size == 35) return row("975", "200", "16777206");
    if (size == 34) return row("975", "200", "65526");
    if (size == 33) return row("975", "200", "246");
    if (size == 32) return row("975", "200", "0");
    if (size == 31) return row("975", "0", "0");
    return row(size == 30 ? "207" : "0", "0", "0");
  };
  const auto secondOf = [](std::size_t size) {
    if (size >= 49) return row("62", "12", "66051");
    if (size == 48) return row("62", "12", "515");
    if (size == 47) return row("62", "12", "3");
    if (size == 46) return row("62", "12", "0");
    return row(size >= 44 ? "62" : "0", "0", "0");
  };
  forEachTruncation(twoNeighbors(), [&](std::size_t size, const std::vector<std::string>& lines) {
    EXPECT_EQ(shown(), size < 29 ? oldContent() : "[" + firstOf(size) + ", " + secondOf(size) + "]");
    EXPECT_THAT(lines, ElementsAre(trace));
  });
}

TEST_F(NeighboringCellsTest, ANeighborGSMCellShowsTwoEntriesInThisOrderAndTwiceItsRssi) {
  decodeCells({cell("GSM", "Neighbor", 62)});
  EXPECT_EQ(shown(), listOf({cellRows}));
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(NeighboringCellsTest, AllNeighborGSMCellsAreShownInTheirOrderAndNoOthers) {
  putOldContent();
  decodeCells({cell("GSM", "Serving", 1), cell("GSM", "Neighbor", 62), cell("UMTS", "Neighbor", 2),
               cell("LTE", "Neighbor", 3), cell("GSM", "neighbor", 4), cell("GSM", "Neighbor", 63)});
  EXPECT_EQ(shown(), listOf({cellRows, R"({ARFCN: "63", RSSI: "-86 dBm"})"}));
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(NeighboringCellsTest, ANeighborOfTheCellMonitorShowsNoBsic) {
  decodeColors({{62, 21}});
  decodeCells({cell("GSM", "Neighbor", 62)});
  EXPECT_EQ(shown(), listOf({cellRows}));
}

TEST_F(NeighboringCellsTest, ACellMonitorMessageKeepsTheBsicList) {
  decodeColors({{62, 21}});
  decodeCells({cell("GSM", "Neighbor", 62)});
  EXPECT_EQ(bsicOf(62), R"("21")");
}

TEST_F(NeighboringCellsTest, ElementsThatAreNoRecordsAreSkippedSilently) {
  Array records = elementsThatAreNoRecords("GSM", "Neighbor", {number("ARFCN", 9)});
  records.push_back(cell("GSM", "Neighbor", 62));
  decodeCells(records);
  EXPECT_EQ(shown(), listOf({cellRows}));
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(NeighboringCellsTest, AnRssiOf32767ShowsAnEmptyText) {
  decodeCells({cellRecord("GSM", "Neighbor", {number("ARFCN", 32767), number("RSSI", 32767)})});
  EXPECT_EQ(shown(), R"([{ARFCN: "32767", RSSI: ""}])");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(NeighboringCellsTest, ValuesAreCutTo16BitsTheArfcnUnsignedTheRssiSigned) {
  const auto rssi = [&](std::int64_t value) {
    decodeCells({cellRecord("GSM", "Neighbor", {number("ARFCN", 65536 + 62), number("RSSI", value)})});
    EXPECT_EQ(shown("ARFCN"), R"("62")");
    return shown("RSSI");
  };
  EXPECT_EQ(rssi(65535), R"("-2 dBm")");
  EXPECT_EQ(rssi(32768), R"("-65536 dBm")");
  EXPECT_EQ(rssi(32766), R"("65532 dBm")");
  EXPECT_EQ(rssi(65536 + 32767), R"("")");
  EXPECT_EQ(rssi(-32769), R"("")");
  EXPECT_EQ(rssi(0), R"("0 dBm")");
  decodeCells({cellRecord("GSM", "Neighbor", {number("ARFCN", -1), {"RSSI", Value::ofReal(-43.9)}})});
  EXPECT_EQ(shown(), R"([{ARFCN: "65535", RSSI: "-86 dBm"}])");
}

TEST_F(NeighboringCellsTest, EachMissingValueHasItsOwnMessageAndNoEntry) {
  decodeCells({cellRecord("GSM", "Neighbor", {number("RSSI", -43)})});
  EXPECT_EQ(shown(), R"([{RSSI: "-86 dBm"}])");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace, noArfcn));
  decodeCells({cellRecord("GSM", "Neighbor", {number("ARFCN", 62)})});
  EXPECT_EQ(shown(), R"([{ARFCN: "62"}])");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace, noRssi));
}

TEST_F(NeighboringCellsTest, ARecordWithoutAnyValueIsAppendedAllTheSame) {
  decodeCells({cellRecord("GSM", "Neighbor"), cell("GSM", "Neighbor", 62)});
  EXPECT_EQ(shown(), listOf({"{}", cellRows}));
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace, noArfcn, noRssi));
}

TEST_F(NeighboringCellsTest, AValueThatIsNoNumberIsAMissingOne) {
  decodeCells({cellRecord("GSM", "Neighbor", {{"ARFCN", "62"}, {"RSSI", Value::ofBoolean(true)}})});
  EXPECT_EQ(shown(), "[{}]");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace, noArfcn, noRssi));
}

TEST_F(NeighboringCellsTest, AnArrayWithoutANeighborGSMCellEmptiesTheListSilently) {
  expectEmptied(cellMonitorMessage({cell("GSM", "Serving", 1), cell("UMTS", "Neighbor", 2)}), {trace});
}

TEST_F(NeighboringCellsTest, AnEmptyArrayEmptiesTheListSilently) {
  expectEmptied(cellMonitorMessage({}), {trace});
}

TEST_F(NeighboringCellsTest, APayloadThatIsNoPropertyListEmptiesTheListAndIsReportedTwice) {
  expectEmptied(serverMessageOfText(cellMonitorCode, "<plist"), {trace, failedParse, noArray});
}

TEST_F(NeighboringCellsTest, APayloadThatIsADictionaryIsAFailedParse) {
  expectEmptied(serverMessage(cellMonitorCode, cell("GSM", "Neighbor", 1)), {trace, failedParse, noArray});
}

TEST_F(NeighboringCellsTest, EveryTruncatedCellMonitorMessageIsAFailedParse) {
  Bytes message = cellMonitorMessage({cell("GSM", "Neighbor", 1)});
  while (!message.empty()) {
    message.pop_back();
    expectEmptied(message, {trace, failedParse, noArray});
  }
}

TEST_F(NeighboringCellsTest, EachOfTheTwoSourcesReplacesTheListOfTheOther) {
  decode(twoNeighbors());
  decodeCells({cell("GSM", "Neighbor", 62)});
  EXPECT_EQ(shown(), listOf({cellRows}));
  decode(twoNeighbors());
  EXPECT_EQ(shown(), "[" + row("975", "200", "-10") + ", " + row("62", "12", "66051") + "]");
}

TEST_F(NeighboringCellsTest, AForeignCodeIsReportedBehindTheTraceLineAndChangesNothing) {
  decodeColors({{62, 21}});
  log.take();
  expectIgnored(twoNeighbors(), 0x5134, {trace, "<3>Received an unknown log message: 20788"});
  expectIgnored({}, 0xFFFFFFFF, {trace, "<3>Received an unknown log message: -1"});
  EXPECT_EQ(bsicOf(62), R"("21")");
}

}  // namespace
}  // namespace varnel
