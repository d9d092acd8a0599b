#include "LogGenerator/KLV/GSMUMTS/UMTSSet.h"

#include "tests/support/CellMonitorRecords.h"
#include "tests/support/DecoderHarness.h"
#include "tests/support/PacketBuilder.h"

namespace varnel {
namespace {

using testing::ElementsAre;

constexpr std::uint32_t rankingCode = 0x4005;
constexpr std::uint32_t cellMonitorCode = 0xFF0001;
constexpr const char* trace = "<4>UMTSSet";
constexpr const char* failedParse = "<3>Cell Info Array data could not be constructed";
constexpr const char* noArray = "<3>Failed to get Cell Array\n";
constexpr const char* noUarfcn = "<3>UMTSSet: Failed to retrieve UARFCN\n";
constexpr const char* noScramblingCode = "<3>UMTSSet: Failed to retrieve Scrambling Code\n";
constexpr const char* noRscp = "<3>UMTSSet: Failed to retrieve RSCP\n";
constexpr const char* noEnergy = "<3>UMTSSet: Failed to retrieve Energy Per Chip\n";

class UMTSSetTest : public ListDecoderTest<UMTSSet, rankingCode> {
 protected:
  void decodeCells(Array records) { decode(cellMonitorMessage(std::move(records)), cellMonitorCode); }
  /// Expects the message to empty a filled list and to log only these lines.
  void expectEmptied(const Bytes& message, const std::vector<std::string>& lines) {
    putOldContent();
    log.take();
    decode(message, cellMonitorCode);
    EXPECT_EQ(shown(), "[]") << message.size() << " bytes";
    EXPECT_EQ(log.takeTexts(), lines) << message.size() << " bytes";
  }
};

// A packet of zeros with a count of UMTS cells.
PacketBuilder counted(std::uint8_t cells, std::size_t size) {
  PacketBuilder packet(rankingCode, size);
  packet.u8(13, cells);
  return packet;
}

// Two UMTS cells whose fields all differ.
Bytes twoCells() {
  return counted(2, 35)
      .u16(15, 10564)
      .u16(17, 511)
      .u8(19, 0xB0)
      .u16(20, 0xFFA6)
      .u8(22, 0xF1)
      .u16(23, 0xFFF4)
      .u16(25, 10838)
      .u16(27, 300)
      .u8(29, 25)
      .u16(30, 1000)
      .u8(32, 3)
      .u16(33, 258)
      .bytes();
}

constexpr const char* first =
    R"({Scrambling Code: "511", RSCP: "-101 dB", Energy Per Chip: "-7.500000 dB", )"
    R"(Downlink Frequency: "10564", Ranking Value: "-12", Rank Cell RSCP: "-90 dB"})";
constexpr const char* second =
    R"({Scrambling Code: "300", RSCP: "4 dB", Energy Per Chip: "1.500000 dB", )"
    R"(Downlink Frequency: "10838", Ranking Value: "258", Rank Cell RSCP: "1000 dB"})";
constexpr const char* zeros = R"({Scrambling Code: "0", RSCP: "-21 dB", Energy Per Chip: "0.000000 dB", )"
                              R"(Downlink Frequency: "0", Ranking Value: "0", Rank Cell RSCP: "0 dB"})";

Value cell(const char* technology, const char* type, std::int64_t uarfcn) {
  return cellRecord(
      technology, type,
      {number("UARFCN", uarfcn), number("ScramblingCode", 77), number("RSCP", -95), number("EcN0", -9)});
}

constexpr const char* cellRows =
    R"({UARFCN: "10564", Scrambling Code: "77", RSCP: "-95 dBm", Energy Per Chip: "-9 dB"})";

TEST_F(UMTSSetTest, EachRankedCellHasSixEntriesInThisOrder) {
  decode(twoCells());
  EXPECT_EQ(shown(), listOf({first, second}));
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(UMTSSetTest, AnEnergyByteOf0xF1ShowsMinus7Point5WithSixDecimals) {
  decode(counted(1, 25).u8(22, 0xF1).bytes());
  EXPECT_EQ(shown("Energy Per Chip"), R"("-7.500000 dB")");
}

TEST_F(UMTSSetTest, TheEnergyIsASignedNumberOfHalfDecibels) {
  const auto energy = [&](std::uint8_t raw) {
    decode(counted(1, 25).u8(22, raw).bytes());
    return shown("Energy Per Chip");
  };
  EXPECT_EQ(energy(0), R"("0.000000 dB")");
  EXPECT_EQ(energy(1), R"("0.500000 dB")");
  EXPECT_EQ(energy(0xFF), R"("-0.500000 dB")");
  EXPECT_EQ(energy(0x7F), R"("63.500000 dB")");
  EXPECT_EQ(energy(0x80), R"("-64.000000 dB")");
}

TEST_F(UMTSSetTest, TheRscpIsASignedByteLess21) {
  const auto rscp = [&](std::uint8_t raw) {
    decode(counted(1, 25).u8(19, raw).bytes());
    return shown("RSCP");
  };
  EXPECT_EQ(rscp(21), R"("0 dB")");
  EXPECT_EQ(rscp(0x7F), R"("106 dB")");
  EXPECT_EQ(rscp(0x80), R"("-149 dB")");
  EXPECT_EQ(rscp(0xFF), R"("-22 dB")");
}

TEST_F(UMTSSetTest, TheDownlinkFrequencyIsShownSignedAndTheScramblingCodeUnsigned) {
  decode(counted(1, 25).u16(15, 0xFFFF).u16(17, 0xFFFF).bytes());
  EXPECT_EQ(shown("Downlink Frequency"), R"("-1")");
  EXPECT_EQ(shown("Scrambling Code"), R"("65535")");
  decode(counted(1, 25).u16(15, 0x8000).u16(17, 0x8000).bytes());
  EXPECT_EQ(shown("Downlink Frequency"), R"("-32768")");
  EXPECT_EQ(shown("Scrambling Code"), R"("32768")");
}

TEST_F(UMTSSetTest, EachBitCountsInItsOwnEntryAlone) {
  const std::vector<std::string_view> signedWordBits = {"1",    "2",    "4",     "8",     "16",   "32",
                                                        "64",   "128",  "256",   "512",   "1024", "2048",
                                                        "4096", "8192", "16384", "-32768"};
  expectTextsOfSingleBits(counted(1, 35).bytes(), 14, 35,
                          {{"Downlink Frequency", 15, 0, "0", signedWordBits},
                           {"Scrambling Code", 17, 0, "0", unsignedWordBits},
                           {"RSCP",
                            19,
                            0,
                            "-21 dB",
                            {"-20 dB", "-19 dB", "-17 dB", "-13 dB", "-5 dB", "11 dB", "43 dB", "-149 dB"}},
                           {"Rank Cell RSCP",
                            20,
                            0,
                            "0 dB",
                            {"1 dB", "2 dB", "4 dB", "8 dB", "16 dB", "32 dB", "64 dB", "128 dB", "256 dB",
                             "512 dB", "1024 dB", "2048 dB", "4096 dB", "8192 dB", "16384 dB", "-32768 dB"}},
                           {"Energy Per Chip",
                            22,
                            0,
                            "0.000000 dB",
                            {"0.500000 dB", "1.000000 dB", "2.000000 dB", "4.000000 dB", "8.000000 dB",
                             "16.000000 dB", "32.000000 dB", "-64.000000 dB"}},
                           {"Ranking Value", 23, 0, "0", signedWordBits}});
}

TEST_F(UMTSSetTest, TheCountOfGSMCellsIsNotTheCountOfRecords) {
  putOldContent();
  decode(counted(0, 50).u8(14, 3).bytes());
  EXPECT_EQ(shown(), "[]");
  decode(counted(1, 50).u8(14, 3).bytes());
  EXPECT_EQ(shown(), listOf({zeros}));
}

TEST_F(UMTSSetTest, EachPacketReplacesTheListOfTheLastOne) {
  putOldContent();
  decode(twoCells());
  EXPECT_EQ(rowCount(), 2u);
  decode(counted(1, 25).bytes());
  EXPECT_EQ(shown(), listOf({zeros}));
}

TEST_F(UMTSSetTest, ACountOf0EmptiesTheListSilently) {
  putOldContent();
  decode(counted(0, 35).bytes());
  EXPECT_EQ(shown(), "[]");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(UMTSSetTest, TwoHundredFiftyFiveCellsAreAllShown) {
  decode(counted(255, 2565).u16(17, 1).u16(2557, 255).bytes());
  ASSERT_EQ(rowCount(), 255u);
  EXPECT_EQ(described(section.array()->front().dictionary()->get("Scrambling Code")), R"("1")");
  EXPECT_EQ(described(section.array()->back().dictionary()->get("Scrambling Code")), R"("255")");
}

TEST_F(UMTSSetTest, PacketsOf15And16BytesAreAccepted) {
  for (const std::size_t size : {15u, 16u}) {
    putOldContent();
    decode(counted(0, size).bytes());
    EXPECT_EQ(shown(), "[]") << size;
  }
}

TEST_F(UMTSSetTest, CellsBeyondThePacketAreShownOfZeros) {
  putOldContent();
  decode(counted(255, 15).bytes());
  ASSERT_EQ(rowCount(), 255u);
  for (const Value& shownCell : *section.array()) EXPECT_EQ(described(shownCell), zeros);
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(UMTSSetTest, EveryTruncatedPacketShowsBothCellsWithZerosForWhatIsCutOff) {
  const auto row = [](const char* code, const char* rscp, const char* energy, const char* frequency,
                      const char* ranking, const char* rankRscp) {
    return std::string("{Scrambling Code: \"") + code + "\", RSCP: \"" + rscp + " dB\", Energy Per Chip: \"" +
           energy + " dB\", Downlink Frequency: \"" + frequency + "\", Ranking Value: \"" + ranking +
           "\", Rank Cell RSCP: \"" + rankRscp + " dB\"}";
  };
  // 10564 is 0x2944, 511 is 0x01FF, -90 is 0xFFA6, -12 is 0xFFF4.
  const std::string firsts[] = {row("0", "-21", "0.000000", "0", "0", "0"),
                                row("0", "-21", "0.000000", "68", "0", "0"),
                                row("0", "-21", "0.000000", "10564", "0", "0"),
                                row("255", "-21", "0.000000", "10564", "0", "0"),
                                row("511", "-21", "0.000000", "10564", "0", "0"),
                                row("511", "-101", "0.000000", "10564", "0", "0"),
                                row("511", "-101", "0.000000", "10564", "0", "166"),
                                row("511", "-101", "0.000000", "10564", "0", "-90"),
                                row("511", "-101", "-7.500000", "10564", "0", "-90"),
                                row("511", "-101", "-7.500000", "10564", "244", "-90")};
  // 10838 is 0x2A56, 300 is 0x012C, 1000 is 0x03E8, 258 is 0x0102.
  const std::string seconds[] = {
      row("0", "-21", "0.000000", "0", "0", "0"),        row("0", "-21", "0.000000", "86", "0", "0"),
      row("0", "-21", "0.000000", "10838", "0", "0"),    row("44", "-21", "0.000000", "10838", "0", "0"),
      row("300", "-21", "0.000000", "10838", "0", "0"),  row("300", "4", "0.000000", "10838", "0", "0"),
      row("300", "4", "0.000000", "10838", "0", "232"),  row("300", "4", "0.000000", "10838", "0", "1000"),
      row("300", "4", "1.500000", "10838", "0", "1000"), row("300", "4", "1.500000", "10838", "2", "1000")};
  forEachTruncation(twoCells(), [&](std::size_t size, const std::vector<std::string>& lines) {
    std::string expected = oldContent();
    if (size >= 15 && size < 25) expected = "[" + firsts[size - 15] + ", " + zeros + "]";
    if (size >= 25) expected = std::string("[") + first + ", " + seconds[size - 25] + "]";
    EXPECT_EQ(shown(), expected);
    EXPECT_THAT(lines, ElementsAre(trace));
  });
}

TEST_F(UMTSSetTest, ANeighborUMTSCellShowsFourEntriesInThisOrder) {
  decodeCells({cell("UMTS", "Neighbor", 10564)});
  EXPECT_EQ(shown(), listOf({cellRows}));
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(UMTSSetTest, AllNeighborUMTSCellsAreShownInTheirOrderAndNoOthers) {
  putOldContent();
  decodeCells({cell("UMTS", "Serving", 1), cell("UMTS", "Neighbor", 10564), cell("GSM", "Neighbor", 2),
               cell("UTRAN", "Neighbor", 3), cell("LTE", "Neighbor", 4), cell("UMTS", "neighbor", 5),
               cell("UMTS", "Neighbor", 10565)});
  EXPECT_EQ(shown(), std::string("[") + cellRows +
                         R"(, {UARFCN: "10565", Scrambling Code: "77", RSCP: "-95 dBm", )"
                         R"(Energy Per Chip: "-9 dB"}])");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(UMTSSetTest, ElementsThatAreNoRecordsAreSkippedSilently) {
  Array records = elementsThatAreNoRecords("UMTS", "Neighbor", {number("UARFCN", 9)});
  records.push_back(cell("UMTS", "Neighbor", 10564));
  decodeCells(records);
  EXPECT_EQ(shown(), listOf({cellRows}));
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(UMTSSetTest, AnRscpOf32767ShowsAnEmptyText) {
  const Value record = cell("UMTS", "Neighbor", 10564);
  record.dictionary()->set("RSCP", Value::ofInteger(32767));
  decodeCells({record});
  EXPECT_EQ(shown(), R"([{UARFCN: "10564", Scrambling Code: "77", RSCP: "", Energy Per Chip: "-9 dB"}])");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(UMTSSetTest, AnEnergyOf32767ShowsAnEmptyText) {
  const Value record = cell("UMTS", "Neighbor", 10564);
  record.dictionary()->set("EcN0", Value::ofInteger(32767));
  decodeCells({record});
  EXPECT_EQ(shown(), R"([{UARFCN: "10564", Scrambling Code: "77", RSCP: "-95 dBm", Energy Per Chip: ""}])");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(UMTSSetTest, AUarfcnOrScramblingCodeOf32767IsShownAsItIs) {
  decodeCells({cellRecord("UMTS", "Neighbor",
                          {number("UARFCN", 32767), number("ScramblingCode", 32767), number("RSCP", 32766),
                           number("EcN0", 32766)})});
  EXPECT_EQ(shown(), R"([{UARFCN: "32767", Scrambling Code: "32767", RSCP: "32766 dBm", )"
                     R"(Energy Per Chip: "32766 dB"}])");
}

TEST_F(UMTSSetTest, ValuesAreCutTo16BitsTheFirstTwoUnsignedTheOthersSigned) {
  decodeCells({cellRecord("UMTS", "Neighbor",
                          {number("UARFCN", -1), number("ScramblingCode", 65536 + 77), number("RSCP", 65535),
                           number("EcN0", 32768)})});
  EXPECT_EQ(shown(), R"([{UARFCN: "65535", Scrambling Code: "77", RSCP: "-1 dBm", )"
                     R"(Energy Per Chip: "-32768 dB"}])");
}

TEST_F(UMTSSetTest, TheTestFor32767IsMadeOnTheCutValue) {
  decodeCells({cellRecord("UMTS", "Neighbor",
                          {number("UARFCN", 1), number("ScramblingCode", 2), number("RSCP", 65536 + 32767),
                           number("EcN0", -32769)})});
  EXPECT_EQ(shown(), R"([{UARFCN: "1", Scrambling Code: "2", RSCP: "", Energy Per Chip: ""}])");
}

TEST_F(UMTSSetTest, RealsAreTruncatedTowardsZero) {
  decodeCells({cellRecord("UMTS", "Neighbor",
                          {{"UARFCN", Value::ofReal(10564.9)},
                           {"ScramblingCode", Value::ofReal(77.5)},
                           {"RSCP", Value::ofReal(-95.9)},
                           {"EcN0", Value::ofReal(-9.1)}})});
  EXPECT_EQ(shown(), listOf({cellRows}));
}

TEST_F(UMTSSetTest, EachMissingValueHasItsOwnMessageAndNoEntry) {
  const auto linesWithout = [&](const char* key) {
    const Value record = cell("UMTS", "Neighbor", 10564);
    record.dictionary()->remove(key);
    log.take();
    decodeCells({record});
    return log.takeTexts();
  };
  EXPECT_THAT(linesWithout("UARFCN"), ElementsAre(trace, noUarfcn));
  EXPECT_EQ(shown(), R"([{Scrambling Code: "77", RSCP: "-95 dBm", Energy Per Chip: "-9 dB"}])");
  EXPECT_THAT(linesWithout("ScramblingCode"), ElementsAre(trace, noScramblingCode));
  EXPECT_EQ(shown(), R"([{UARFCN: "10564", RSCP: "-95 dBm", Energy Per Chip: "-9 dB"}])");
  EXPECT_THAT(linesWithout("RSCP"), ElementsAre(trace, noRscp));
  EXPECT_EQ(shown(), R"([{UARFCN: "10564", Scrambling Code: "77", Energy Per Chip: "-9 dB"}])");
  EXPECT_THAT(linesWithout("EcN0"), ElementsAre(trace, noEnergy));
  EXPECT_EQ(shown(), R"([{UARFCN: "10564", Scrambling Code: "77", RSCP: "-95 dBm"}])");
}

TEST_F(UMTSSetTest, ARecordWithoutAnyValueIsAppendedAllTheSame) {
  decodeCells({cellRecord("UMTS", "Neighbor"), cell("UMTS", "Neighbor", 10564)});
  EXPECT_EQ(shown(), listOf({"{}", cellRows}));
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace, noUarfcn, noScramblingCode, noRscp, noEnergy));
}

TEST_F(UMTSSetTest, AValueThatIsNoNumberIsAMissingOne) {
  decodeCells({cellRecord("UMTS", "Neighbor",
                          {{"UARFCN", "10564"},
                           {"ScramblingCode", Value::ofBoolean(true)},
                           {"RSCP", Value::ofArray()},
                           {"EcN0", Value::ofDictionary()}})});
  EXPECT_EQ(shown(), "[{}]");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace, noUarfcn, noScramblingCode, noRscp, noEnergy));
}

TEST_F(UMTSSetTest, AnArrayWithoutANeighborUMTSCellEmptiesTheListSilently) {
  expectEmptied(cellMonitorMessage({cell("UMTS", "Serving", 1), cell("GSM", "Neighbor", 2)}), {trace});
}

TEST_F(UMTSSetTest, AnEmptyArrayEmptiesTheListSilently) { expectEmptied(cellMonitorMessage({}), {trace}); }

TEST_F(UMTSSetTest, APayloadThatIsNoPropertyListEmptiesTheListAndIsReportedTwice) {
  expectEmptied(serverMessageOfText(cellMonitorCode, "<plist"), {trace, failedParse, noArray});
}

TEST_F(UMTSSetTest, APayloadThatIsADictionaryIsAFailedParse) {
  expectEmptied(serverMessage(cellMonitorCode, cell("UMTS", "Neighbor", 1)), {trace, failedParse, noArray});
}

TEST_F(UMTSSetTest, EveryTruncatedCellMonitorMessageIsAFailedParse) {
  Bytes message = cellMonitorMessage({cell("UMTS", "Neighbor", 1)});
  while (!message.empty()) {
    message.pop_back();
    expectEmptied(message, {trace, failedParse, noArray});
  }
}

TEST_F(UMTSSetTest, EachOfTheTwoCodesReplacesTheListOfTheOther) {
  decode(twoCells());
  decodeCells({cell("UMTS", "Neighbor", 10564)});
  EXPECT_EQ(shown(), listOf({cellRows}));
  decode(twoCells());
  EXPECT_EQ(shown(), listOf({first, second}));
}

}  // namespace
}  // namespace varnel
