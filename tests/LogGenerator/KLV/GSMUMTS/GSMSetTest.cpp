#include "LogGenerator/KLV/GSMUMTS/GSMSet.h"

#include "tests/support/DecoderHarness.h"
#include "tests/support/PacketBuilder.h"

namespace varnel {
namespace {

using testing::ElementsAre;

constexpr std::uint32_t rankingCode = 0x4005;
constexpr const char* trace = "<4>GSMSet";

using GSMSetTest = ListDecoderTest<GSMSet, rankingCode>;

// A packet of zeros with a count of GSM cells.
PacketBuilder counted(std::uint8_t cells, std::size_t size) {
  PacketBuilder packet(rankingCode, size);
  packet.u8(14, cells);
  return packet;
}

// Two GSM cells whose fields all differ.
Bytes twoCells() {
  return counted(2, 29)
      .u16(15, 975)
      .u16(17, 300)
      .u8(19, 0xA9)
      .u16(20, 0xFFF6)
      .u16(22, 62)
      .u16(24, 21)
      .u8(26, 5)
      .u16(27, 1000)
      .bytes();
}

std::string row(const char* arfcn, const char* bsic, const char* rssi, const char* ranking) {
  return std::string("{ARFCN: \"") + arfcn + "\", BSIC: \"" + bsic + "\", RSSI: \"" + rssi +
         " dBm\", Ranking Value: \"" + ranking + "\"}";
}

TEST_F(GSMSetTest, EachCellHasFourEntriesInThisOrder) {
  decode(twoCells());
  EXPECT_EQ(shown(), R"([{ARFCN: "975", BSIC: "300", RSSI: "-87 dBm", Ranking Value: "-10"}, )"
                     R"({ARFCN: "62", BSIC: "21", RSSI: "5 dBm", Ranking Value: "1000"}])");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(GSMSetTest, EachBitCountsInItsOwnEntryAlone) {
  expectTextsOfSingleBits(counted(1, 29).bytes(), 15, 29,
                          {{"ARFCN", 15, 0, "0", unsignedWordBits},
                           {"BSIC", 17, 0, "0", unsignedWordBits},
                           {"RSSI",
                            19,
                            0,
                            "0 dBm",
                            {"1 dBm", "2 dBm", "4 dBm", "8 dBm", "16 dBm", "32 dBm", "64 dBm", "-128 dBm"}},
                           {"Ranking Value",
                            20,
                            0,
                            "0",
                            {"1", "2", "4", "8", "16", "32", "64", "128", "256", "512", "1024", "2048",
                             "4096", "8192", "16384", "-32768"}}});
}

TEST_F(GSMSetTest, AllOnesAreUnsignedButForTheRssiAndTheRanking) {
  decode(counted(0, 22).fill(0xFF).u8(14, 1).bytes());
  EXPECT_EQ(shown(), "[" + row("65535", "65535", "-1", "-1") + "]");
}

TEST_F(GSMSetTest, TheCountOfUMTSCellsIsNotTheCountOfRecords) {
  putOldContent();
  decode(PacketBuilder(rankingCode, 50).u8(13, 3).bytes());
  EXPECT_EQ(shown(), "[]");
  decode(PacketBuilder(rankingCode, 50).u8(13, 3).u8(14, 1).bytes());
  EXPECT_EQ(rowCount(), 1u);
}

TEST_F(GSMSetTest, CellsAreReadFromByte15OnThoughUMTSCellsStandThere) {
  // One UMTS cell (UARFCN 10564, code 511, RSCP -80, rank RSCP -90, -7.5 dB, ranking 12), one GSM cell after
  // it.
  decode(PacketBuilder(rankingCode, 32)
             .u8(13, 1)
             .u8(14, 1)
             .u16(15, 10564)
             .u16(17, 511)
             .u8(19, 0xB0)
             .u16(20, 0xFFA6)
             .u8(22, 0xF1)
             .u16(23, 12)
             .u16(25, 975)
             .bytes());
  EXPECT_EQ(shown(), "[" + row("10564", "511", "-80", "-90") + "]");
}

TEST_F(GSMSetTest, EachPacketReplacesTheListOfTheLastOne) {
  putOldContent();
  decode(twoCells());
  EXPECT_EQ(rowCount(), 2u);
  decode(counted(1, 22).u16(15, 7).bytes());
  EXPECT_EQ(shown(), "[" + row("7", "0", "0", "0") + "]");
}

TEST_F(GSMSetTest, ACountOf0EmptiesTheListSilently) {
  putOldContent();
  decode(counted(0, 29).bytes());
  EXPECT_EQ(shown(), "[]");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(GSMSetTest, TwoHundredFiftyFiveCellsAreAllShown) {
  decode(counted(255, 1800).u16(15, 1).u16(1793, 255).bytes());
  ASSERT_EQ(rowCount(), 255u);
  EXPECT_EQ(described(section.array()->front()), row("1", "0", "0", "0"));
  EXPECT_EQ(described(section.array()->back()), row("255", "0", "0", "0"));
}

TEST_F(GSMSetTest, PacketsOf15And16BytesAreAccepted) {
  for (const std::size_t size : {15u, 16u}) {
    putOldContent();
    decode(counted(0, size).bytes());
    EXPECT_EQ(shown(), "[]") << size;
  }
}

TEST_F(GSMSetTest, CellsBeyondThePacketShowZeros) {
  putOldContent();
  decode(counted(255, 15).bytes());
  ASSERT_EQ(rowCount(), 255u);
  for (const Value& cell : *section.array()) EXPECT_EQ(described(cell), row("0", "0", "0", "0"));
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(GSMSetTest, EveryTruncatedPacketShowsBothCellsWithZerosForWhatIsCutOff) {
  // 975 is 0x03CF, 300 is 0x012C, -10 is 0xFFF6, 1000 is 0x03E8.
  const std::string whole = row("975", "300", "-87", "-10");
  const std::string none = row("0", "0", "0", "0");
  const std::string firsts[] = {none,
                                row("207", "0", "0", "0"),
                                row("975", "0", "0", "0"),
                                row("975", "44", "0", "0"),
                                row("975", "300", "0", "0"),
                                row("975", "300", "-87", "0"),
                                row("975", "300", "-87", "246")};
  const std::string seconds[] = {none,
                                 row("62", "0", "0", "0"),
                                 row("62", "0", "0", "0"),
                                 row("62", "21", "0", "0"),
                                 row("62", "21", "0", "0"),
                                 row("62", "21", "5", "0"),
                                 row("62", "21", "5", "232")};
  forEachTruncation(twoCells(), [&](std::size_t size, const std::vector<std::string>& lines) {
    std::string expected = oldContent();
    if (size >= 15 && size < 22) expected = "[" + firsts[size - 15] + ", " + none + "]";
    if (size >= 22) expected = "[" + whole + ", " + seconds[size - 22] + "]";
    EXPECT_EQ(shown(), expected);
    EXPECT_THAT(lines, ElementsAre(trace));
  });
}

}  // namespace
}  // namespace varnel
