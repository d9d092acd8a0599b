#include "LogGenerator/KLV/LTE/DetectedCells.h"

#include "tests/support/DecoderHarness.h"
#include "tests/support/PacketBuilder.h"

namespace varnel {
namespace {

using testing::ElementsAre;

constexpr std::uint32_t reportCode = 0xB179;
constexpr const char* trace = "<4>Detected Cells";

using DetectedCellsTest = ListDecoderTest<DetectedCells, reportCode>;

// A report that announces neighbors and detected cells, among other bytes that must not be shown.
PacketBuilder report(std::uint8_t neighbors, std::uint8_t detected, std::size_t size) {
  PacketBuilder packet(reportCode, size);
  packet.fill(0xEE).u8(27, neighbors).u8(28, detected);
  return packet;
}

// Two neighbors, then three detected cells.
Bytes threeDetected() { return report(2, 3, 47).u16(41, 301).u16(43, 2).u16(45, 65000).bytes(); }

TEST_F(DetectedCellsTest, EachDetectedCellBehindTheNeighborsHasARecord) {
  decode(threeDetected());
  EXPECT_EQ(shown(), R"([{Physical Cell ID: "301"}, {Physical Cell ID: "2"}, {Physical Cell ID: "65000"}])");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(DetectedCellsTest, WithoutNeighborsTheyBeginAtByte29) {
  decode(report(0, 1, 31).u16(29, 503).bytes());
  EXPECT_EQ(shown(), R"([{Physical Cell ID: "503"}])");
}

TEST_F(DetectedCellsTest, EachReportReplacesTheListOfTheLastOne) {
  putOldContent();
  decode(threeDetected());
  EXPECT_EQ(rowCount(), 3u);
  decode(report(0, 1, 31).u16(29, 7).bytes());
  EXPECT_EQ(shown(), R"([{Physical Cell ID: "7"}])");
}

TEST_F(DetectedCellsTest, NoDetectedCellsEmptyTheListSilently) {
  putOldContent();
  decode(report(2, 0, 47).bytes());
  EXPECT_EQ(shown(), "[]");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(DetectedCellsTest, EachBitOfACellCounts) {
  expectTextsOfSingleBits(PacketBuilder(reportCode, 37).u8(27, 1).u8(28, 1).bytes(), 29, 37,
                          {{"Physical Cell ID",
                            35,
                            0,
                            "0",
                            {"1", "2", "4", "8", "16", "32", "64", "128", "256", "512", "1024", "2048",
                             "4096", "8192", "16384", "32768"}}});
}

TEST_F(DetectedCellsTest, ACellOfAllOnesShows65535) {
  decode(report(0, 1, 31).u16(29, 0xFFFF).bytes());
  EXPECT_EQ(shown(), R"([{Physical Cell ID: "65535"}])");
}

TEST_F(DetectedCellsTest, TwoHundredFiftyFiveDetectedCellsAreAllShown) {
  decode(report(0, 255, 539).u16(29, 1).u16(537, 255).bytes());
  ASSERT_EQ(rowCount(), 255u);
  EXPECT_EQ(described(section.array()->front()), R"({Physical Cell ID: "1"})");
  EXPECT_EQ(described(section.array()->back()), R"({Physical Cell ID: "255"})");
}

TEST_F(DetectedCellsTest, TheyLieBehind255NeighborsAsWell) {
  decode(report(255, 1, 1561).u16(1559, 504).bytes());
  EXPECT_EQ(shown(), R"([{Physical Cell ID: "504"}])");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(DetectedCellsTest, ThePacketLengthIsNotComparedWithTheAnnouncedSize) {
  putOldContent();
  decode(report(42, 1, 29).bytes());
  EXPECT_EQ(shown(), "[]");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(DetectedCellsTest, ARecordThatIsCutOffIsDroppedAndThoseBeforeItAreKept) {
  decode(report(0, 2, 32).u16(29, 301).bytes());
  EXPECT_EQ(shown(), R"([{Physical Cell ID: "301"}])");
}

TEST_F(DetectedCellsTest, RecordsBeyondThePacketLeaveAnEmptyList) {
  putOldContent();
  decode(report(0, 255, 30).bytes());
  EXPECT_EQ(shown(), "[]");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(DetectedCellsTest, EveryTruncatedReportKeepsItsWholeRecords) {
  forEachTruncation(threeDetected(), [&](std::size_t size, const std::vector<std::string>& lines) {
    std::string expected = R"([{Physical Cell ID: "301"}, {Physical Cell ID: "2"}])";
    if (size < 45) expected = R"([{Physical Cell ID: "301"}])";
    if (size < 43) expected = "[]";
    if (size < 29) expected = oldContent();
    EXPECT_EQ(shown(), expected);
    EXPECT_THAT(lines, ElementsAre(trace));
  });
}

TEST_F(DetectedCellsTest, ReportsOf29And30BytesAreAccepted) {
  for (const std::size_t size : {29u, 30u}) {
    putOldContent();
    decode(report(0, 0, size).bytes());
    EXPECT_EQ(shown(), "[]") << size << " bytes";
  }
}

}  // namespace
}  // namespace varnel
