#include "programs/varnel/HistoryTrends.h"

#include <gmock/gmock.h>

#include <filesystem>
#include <fstream>

#include "tests/programs/trends/TrendHarness.h"
#include "tests/support/Process.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;
using testing::HasSubstr;
using testing::SizeIs;

class HistoryTrendsTest : public TrendHarness {};

TEST_F(HistoryTrendsTest, ARowSaysWhereItIs) {
  show(0, "-85.0", "-9.5");
  const auto rows = source.rows();
  ASSERT_THAT(rows, SizeIs(2));
  EXPECT_EQ(rows[0].name, "RSRQ");
  EXPECT_EQ(rows[0].place, "LTE > Neighbors > Cells, EARFCN 1300, PCI 16");
  EXPECT_EQ(rows[0].unit, "dB");
  EXPECT_EQ(rows[1].name, "RSRP");
  EXPECT_EQ(rows[1].place, "LTE > Serving Cell");
  EXPECT_EQ(rows[1].key, level);
}

TEST_F(HistoryTrendsTest, ASecondRowOfTheSameKeySaysSo) {
  ValueHistory::Reading second = reading("/A/B (2)", "", "7");
  second.nameLength = 1;
  numbers.add(std::vector{second}, {start, 0});
  EXPECT_EQ(source.row("/A/B (2)")->name, "B (2)");
}

TEST_F(HistoryTrendsTest, ControlCharactersOfNamesAreShown) {
  numbers.add(std::vector{reading("/A\x1b/B", "", "7")}, {start, 0});
  EXPECT_EQ(source.rows()[0].place, "A\\u001B");
}

TEST_F(HistoryTrendsTest, ARowThatHasGoneHasNoValues) {
  show(0, "-85.0");
  EXPECT_FALSE(source.row("/gone"));
  EXPECT_THAT(source.columns("/gone", {0s, 1s}, 3), SizeIs(3));
  EXPECT_EQ(source.summary("/gone", {0s, 1s}).count, 0U);
}

TEST_F(HistoryTrendsTest, TheTableHasALinePerDisplayAndAColumnPerRow) {
  show(0, "-85.0", "-9.5");
  show(2, "-86.5");
  show(4, {}, "-10");
  show(6, {});
  const std::vector<std::string> keys{level, quality};
  EXPECT_EQ(source.table(keys, source.whole()),
            "Time,LTE/Serving Cell/RSRP (dBm),\"LTE/Neighbors/Cells[EARFCN 1300, PCI 16]/RSRQ (dB)\"\n"
            "2023-11-14T22:13:20.000Z,-85.0,-9.5\n"
            "2023-11-14T22:13:22.000Z,-86.5,\n"
            "2023-11-14T22:13:24.000Z,,-10.0\n");
}

TEST_F(HistoryTrendsTest, WithoutADateTheTableCountsSeconds) {
  isDated = false;
  show(0, "-85");
  show(2, "-86");
  EXPECT_EQ(source.table(std::vector<std::string>{level}, source.whole()),
            "Seconds,LTE/Serving Cell/RSRP (dBm)\n0.000,-85\n2.000,-86\n");
  EXPECT_FALSE(source.clockName());
}

TEST_F(HistoryTrendsTest, ACaptureIsInUtc) {
  show(0, "-85");
  EXPECT_EQ(source.clockName(), "UTC");
}

TEST_F(HistoryTrendsTest, EventsAreInWords) {
  show(0, "-85");
  addEvent(EventKind::Handover, 0);
  const auto found = source.events({0s, 1s});
  ASSERT_THAT(found, SizeIs(1));
  EXPECT_EQ(found[0].text, "handover, LTE/Serving Cell: PCI 16 -> PCI 22");
}

TEST_F(HistoryTrendsTest, AFileIsWrittenForItsOwnerAlone) {
  const TemporaryFolder folder;
  const std::string path = folder.file("trend.csv");
  EXPECT_EQ(source.save(path, "Time\n"), "");
  std::ifstream file(path);
  std::string line;
  std::getline(file, line);
  EXPECT_EQ(line, "Time");
  EXPECT_EQ(std::filesystem::status(path).permissions(),
            std::filesystem::perms::owner_read | std::filesystem::perms::owner_write);
}

TEST_F(HistoryTrendsTest, TheOpenFileIsNotOverwritten) {
  const TemporaryFolder folder;
  input = folder.file("capture.pcap");
  std::ofstream(input) << "capture";
  std::filesystem::create_hard_link(input, folder.file("other"));
  EXPECT_THAT(source.save(folder.file("other"), "x"), HasSubstr("is the file that is open"));
  std::ifstream file(input);
  std::string content;
  file >> content;
  EXPECT_EQ(content, "capture");
}

TEST_F(HistoryTrendsTest, AFailureIsASentence) {
  EXPECT_THAT(source.save("/nowhere/at/all.csv", "x"), HasSubstr("/nowhere/at/all.csv was not written: "));
}

}  // namespace
}  // namespace varnel
