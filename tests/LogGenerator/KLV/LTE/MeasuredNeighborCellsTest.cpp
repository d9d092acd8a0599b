#include "LogGenerator/KLV/LTE/MeasuredNeighborCells.h"

#include "tests/support/DecoderHarness.h"
#include "tests/support/PacketBuilder.h"

namespace varnel {
namespace {

using testing::ElementsAre;

constexpr std::uint32_t reportCode = 0xB179;
constexpr const char* trace = "<4>Measured Neighbor Cells";

using MeasuredNeighborCellsTest = ListDecoderTest<MeasuredNeighborCells, reportCode>;

// A report with a count of neighbors and detected cells. All other bytes are 0.
PacketBuilder report(std::uint8_t neighbors, std::uint8_t detected, std::size_t size) {
  PacketBuilder packet(reportCode, size);
  packet.u8(27, neighbors).u8(28, detected);
  return packet;
}

// Three neighbors and two detected cells, among other bytes that must not be shown.
Bytes threeNeighbors() {
  return PacketBuilder(reportCode, 51)
      .fill(0xEE)
      .u8(27, 3)
      .u8(28, 2)
      .u16(29, 301)
      .u16(31, 171)
      .u16(33, 66)
      .u16(35, 302)
      .u16(37, 200)
      .u16(39, 81)
      .u16(41, 65000)
      .u16(43, 0)
      .u16(45, 160)
      .bytes();
}

constexpr const char* first =
    R"({Physical Cell ID: "301", Filtered RSRP: "-97.25 dBm", Filtered RSRQ: "-11.75 dB"})";
constexpr const char* second =
    R"({Physical Cell ID: "302", Filtered RSRP: "-90.00 dBm", Filtered RSRQ: "-9.88 dB"})";
constexpr const char* third =
    R"({Physical Cell ID: "65000", Filtered RSRP: "-140.00 dBm", Filtered RSRQ: "0.00 dB"})";

TEST_F(MeasuredNeighborCellsTest, EachNeighborIsACellOfThreeEntriesInThisOrder) {
  decode(threeNeighbors());
  EXPECT_EQ(shown(), listOf({first, second, third}));
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(MeasuredNeighborCellsTest, EachReportReplacesTheListOfTheLastOne) {
  putOldContent();
  decode(threeNeighbors());
  EXPECT_EQ(shown(), listOf({first, second, third}));
  decode(report(1, 0, 35).bytes());
  EXPECT_EQ(shown(),
            R"([{Physical Cell ID: "0", Filtered RSRP: "-140.00 dBm", Filtered RSRQ: "-20.00 dB"}])");
}

TEST_F(MeasuredNeighborCellsTest, RawRsrp0ShowsMinus140AndRawRsrq160Shows0) {
  decode(report(1, 0, 35).u16(31, 0).u16(33, 160).bytes());
  EXPECT_EQ(shown("Filtered RSRP"), R"("-140.00 dBm")");
  EXPECT_EQ(shown("Filtered RSRQ"), R"("0.00 dB")");
}

TEST_F(MeasuredNeighborCellsTest, AllOnesShowTheHighEndOfEachScale) {
  decode(report(1, 0, 35).u32(29, 0xFFFFFFFF).u16(33, 0xFFFF).bytes());
  EXPECT_EQ(shown(),
            R"([{Physical Cell ID: "65535", Filtered RSRP: "16243.75 dBm", Filtered RSRQ: "8171.88 dB"}])");
}

TEST_F(MeasuredNeighborCellsTest, EachBitCountsInItsOwnEntryAlone) {
  expectTextsOfSingleBits(
      report(1, 0, 41).bytes(), 29, 41,
      {{"Physical Cell ID",
        29,
        0,
        "0",
        {"1", "2", "4", "8", "16", "32", "64", "128", "256", "512", "1024", "2048", "4096", "8192", "16384",
         "32768"}},
       {"Filtered RSRP",
        31,
        0,
        "-140.00 dBm",
        {"-139.75 dBm", "-139.50 dBm", "-139.00 dBm", "-138.00 dBm", "-136.00 dBm", "-132.00 dBm",
         "-124.00 dBm", "-108.00 dBm", "-76.00 dBm", "-12.00 dBm", "116.00 dBm", "372.00 dBm", "884.00 dBm",
         "1908.00 dBm", "3956.00 dBm", "8052.00 dBm"}},
       {"Filtered RSRQ",
        33,
        0,
        "-20.00 dB",
        {"-19.88 dB", "-19.75 dB", "-19.50 dB", "-19.00 dB", "-18.00 dB", "-16.00 dB", "-12.00 dB",
         "-4.00 dB", "12.00 dB", "44.00 dB", "108.00 dB", "236.00 dB", "492.00 dB", "1004.00 dB",
         "2028.00 dB", "4076.00 dB"}}});
}

TEST_F(MeasuredNeighborCellsTest, NoNeighborsEmptyTheListAndAreReportedAsAnUnexpectedSizeOf0) {
  putOldContent();
  decode(report(0, 0, 29).bytes());
  EXPECT_EQ(shown(), "[]");
  EXPECT_THAT(log.takeTexts(),
              ElementsAre(trace, "<3>Unexpected log packet bytes size: expected=0 actual=29"));
}

TEST_F(MeasuredNeighborCellsTest, TheActualSizeCountsTheHeaderButNotTheDetectedCells) {
  decode(report(0, 3, 35).bytes());
  EXPECT_THAT(log.takeTexts(),
              ElementsAre(trace, "<3>Unexpected log packet bytes size: expected=0 actual=29"));
}

TEST_F(MeasuredNeighborCellsTest, AnExpectedSizeAboveTheActualOneEmptiesTheListAndIsReported) {
  putOldContent();
  decode(report(5, 0, 29).bytes());
  EXPECT_EQ(shown(), "[]");
  EXPECT_THAT(log.takeTexts(),
              ElementsAre(trace, "<3>Unexpected log packet bytes size: expected=30 actual=29"));
}

TEST_F(MeasuredNeighborCellsTest, AnExpectedSizeThatEqualsTheActualOneIsNotReported) {
  putOldContent();
  decode(report(5, 0, 30).bytes());
  EXPECT_EQ(shown(), "[]");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(MeasuredNeighborCellsTest, ThirtySevenNeighborsAreTheMostWhoseWholeReportPassesUntruncated) {
  decode(report(37, 0, 251).bytes());
  EXPECT_EQ(rowCount(), 37u);
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(MeasuredNeighborCellsTest, AWholeReportIsRejectedWhenItsSizeTruncatedTo8BitsIsTooSmall) {
  putOldContent();
  decode(report(38, 0, 257).bytes());
  EXPECT_EQ(shown(), "[]");
  EXPECT_THAT(log.takeTexts(),
              ElementsAre(trace, "<3>Unexpected log packet bytes size: expected=228 actual=1"));
  decode(report(42, 0, 281).bytes());
  EXPECT_EQ(shown(), "[]");
  EXPECT_THAT(log.takeTexts(),
              ElementsAre(trace, "<3>Unexpected log packet bytes size: expected=252 actual=25"));
}

TEST_F(MeasuredNeighborCellsTest, AnExpectedSizeTruncatedTo8BitsLetsMoreNeighborsPass) {
  decode(report(43, 0, 287).bytes());
  EXPECT_EQ(rowCount(), 43u);
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
  decode(report(128, 0, 797).bytes());
  EXPECT_EQ(rowCount(), 128u);
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(MeasuredNeighborCellsTest, AnActualSizeBelow0WrapsToAnUnsignedNumber) {
  decode(report(0, 15, 29).bytes());
  EXPECT_THAT(log.takeTexts(),
              ElementsAre(trace, "<3>Unexpected log packet bytes size: expected=0 actual=255"));
  decode(report(0, 255, 29).bytes());
  EXPECT_THAT(log.takeTexts(),
              ElementsAre(trace, "<3>Unexpected log packet bytes size: expected=0 actual=31"));
  decode(report(42, 15, 29).bytes());
  EXPECT_EQ(shown(), "[]");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(MeasuredNeighborCellsTest, TheWholeReportOf255NeighborsIsRejected) {
  decode(report(255, 0, 1559).bytes());
  EXPECT_EQ(shown(), "[]");
  EXPECT_THAT(log.takeTexts(),
              ElementsAre(trace, "<3>Unexpected log packet bytes size: expected=250 actual=23"));
}

TEST_F(MeasuredNeighborCellsTest, TwoHundredFiftyFiveNeighborsAreAllShown) {
  decode(report(255, 0, 1786).u16(29, 1).u16(1553, 255).bytes());
  ASSERT_EQ(rowCount(), 255u);
  EXPECT_EQ(described(section.array()->front()),
            R"({Physical Cell ID: "1", Filtered RSRP: "-140.00 dBm", Filtered RSRQ: "-20.00 dB"})");
  EXPECT_EQ(described(section.array()->back()),
            R"({Physical Cell ID: "255", Filtered RSRP: "-140.00 dBm", Filtered RSRQ: "-20.00 dB"})");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(MeasuredNeighborCellsTest, ARecordThatIsCutOffIsDroppedAndThoseBeforeItAreKept) {
  Bytes packet = threeNeighbors();
  packet.resize(46);
  decode(packet);
  EXPECT_EQ(shown(), listOf({first, second}));
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(MeasuredNeighborCellsTest, RecordsBeyondThePacketLeaveAnEmptyListWithoutALine) {
  putOldContent();
  decode(report(4, 0, 29).bytes());
  EXPECT_EQ(shown(), "[]");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(MeasuredNeighborCellsTest, EveryTruncatedReportKeepsItsWholeRecords) {
  forEachTruncation(threeNeighbors(), [&](std::size_t size, const std::vector<std::string>& lines) {
    std::string expected = listOf({first, second, third});
    if (size < 47) expected = listOf({first, second});
    if (size < 41) expected = listOf({first});
    if (size < 35) expected = "[]";
    if (size < 29) expected = oldContent();
    EXPECT_EQ(shown(), expected);
    EXPECT_THAT(lines, ElementsAre(trace));
  });
}

TEST_F(MeasuredNeighborCellsTest, AReportOf30BytesIsAccepted) {
  putOldContent();
  decode(report(0, 0, 30).bytes());
  EXPECT_EQ(shown(), "[]");
  EXPECT_THAT(log.takeTexts(),
              ElementsAre(trace, "<3>Unexpected log packet bytes size: expected=0 actual=30"));
}

}  // namespace
}  // namespace varnel
