#include "widgets/RowWidget.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>

#include "tests/support/TestWidgets.h"
#include "widgets/Colors.h"

namespace varnel {
namespace {

// A table of 360 × 400 with one leaf in it.
class RowWidgetTest : public testing::Test {
 protected:
  RowWidget& show(const std::string& name, const std::string& value) {
    delegate.rows = {{name, value}};
    table.resize(360, 400);
    table.setDelegate(&delegate);
    table.show();
    return *table.visibleRows().front();
  }
  // A record of a list, or a section.
  RowWidget& showSection(const std::string& name, CellFacts facts) {
    delegate.rows = {{name, std::nullopt, std::move(facts)}};
    table.resize(360, 400);
    table.setDelegate(&delegate);
    table.show();
    return *table.visibleRows().front();
  }
  // The same row with other facts.
  RowWidget& tell(CellFacts facts) {
    delegate.rows.front().facts = std::move(facts);
    table.showFactsAgain();
    return *table.visibleRows().front();
  }
  // The highest contrast in this part of the row to its ground.
  static double contrastIn(RowWidget& row, const QRect& area) {
    const QImage picture = row.grab(area).toImage();
    const QColor ground = row.palette().color(QPalette::Base);
    double highest = 1;
    for (int y = 0; y < picture.height(); ++y) {
      for (int x = 0; x < picture.width(); ++x)
        highest = std::max(highest, contrast(ground, picture.pixelColor(x, y)));
    }
    return highest;
  }
  // How many of the four bars of a mark that ends here are filled.
  static int filledBars(RowWidget& row, int end) {
    const QImage picture = row.grab().toImage();
    const auto ground = row.palette().color(QPalette::Base);
    int filled = 0;
    for (const double middle : {-16.5, -11.5, -6.5, -1.5}) {
      const QColor color = picture.pixelColor(end + static_cast<int>(std::floor(middle)), 30);
      filled += contrast(ground, color) > 2.5 ? 1 : 0;
    }
    return filled;
  }
  static CellFacts withCourse(double first, double last) { return {.course = {first, last}}; }
  enum class Edge { Left, Right };
  // Whether the three dots are painted at this edge, with nothing between them.
  static bool hasDots(RowWidget& row, Edge edge) {
    const QImage picture = row.grab().toImage();
    const auto isPainted = [&](int distance) {
      const int x = edge == Edge::Left ? distance : picture.width() - distance;
      return picture.pixelColor(x, 25) != picture.pixelColor(x, 12);
    };
    return isPainted(6) && !isPainted(9) && isPainted(12) && !isPainted(15) && isPainted(18);
  }

  TestRows delegate{{}};
  TableWidget table;
};

TEST_F(RowWidgetTest, AShortValueHasNoMarkAtEitherEdge) {
  RowWidget& row = show("RSRP", "-97.25 dBm");
  EXPECT_FALSE(hasDots(row, Edge::Left));
  EXPECT_FALSE(hasDots(row, Edge::Right));
  EXPECT_FALSE(row.reachesPastItsEdge());
}

TEST_F(RowWidgetTest, AValueOutsideTheRowIsMarkedAtTheRightEdge) {
  RowWidget& row = show("EF-3GPP MAIL BOX DIALING NUMBER", "+15550100");
  EXPECT_FALSE(hasDots(row, Edge::Left));
  EXPECT_TRUE(hasDots(row, Edge::Right));
  EXPECT_TRUE(row.reachesPastItsEdge());
}

TEST_F(RowWidgetTest, ScrolledSidewaysTheMarkIsWhereTheRestIs) {
  RowWidget& row = show("EF-3GPP MAIL BOX DIALING NUMBER", "+15550100");
  row.scrollSidewaysTo(60);
  EXPECT_TRUE(hasDots(row, Edge::Left));
  EXPECT_TRUE(hasDots(row, Edge::Right));
  row.scrollSidewaysTo(10000);
  EXPECT_TRUE(hasDots(row, Edge::Left));
  EXPECT_FALSE(hasDots(row, Edge::Right));
}

TEST_F(RowWidgetTest, ItsNameIsTheFirstOfItsTextsAlsoWhenThatIsEmpty) {
  EXPECT_EQ(show("RSRP", "-97 dBm").name(), "RSRP");
  delegate.rows = {{"", "-97 dBm"}};
  table.reloadData();
  EXPECT_EQ(table.visibleRows().front()->name(), "");
}

constexpr QRect changeMark(2, 20, 7, 10);
// Where a value of usual length begins, less the gap before it, in a row of 360.
constexpr int endOfLevelMark = 360 - 106;
// That of a record, before the room of the disclosure indicator.
constexpr int endOfRecordsLevelMark = 330;

TEST_F(RowWidgetTest, AChangedRowHasADotBeforeItsText) {
  RowWidget& row = show("RSRP", "-97.25 dBm");
  EXPECT_EQ(contrastIn(row, changeMark), 1);
  tell({.change = CellChange::Changed});
  EXPECT_GT(contrastIn(row, changeMark), 3);
  tell({});
  EXPECT_EQ(contrastIn(row, changeMark), 1);
}

TEST_F(RowWidgetTest, TheMarkOfTheCurrentRowIsPalerWhileCommandsAreForAnother) {
  RowWidget& row = showSection("Cell", {});
  const auto ground = [&row] { return row.grab().toImage().pixelColor(2, 2).name().toStdString(); };
  table.selectRow({0, 0});
  EXPECT_EQ(ground(), selectionColor(row.palette()).name().toStdString());
  table.setPale(true);
  EXPECT_EQ(ground(), paleSelectionColor(row.palette()).name().toStdString());
  table.setPale(false);
  EXPECT_EQ(ground(), selectionColor(row.palette()).name().toStdString());
}

TEST_F(RowWidgetTest, ALevelIsANumberOfBars) {
  RowWidget& row = show("RSRP", "-97.25 dBm");
  EXPECT_EQ(filledBars(row, endOfLevelMark), 0);
  const std::pair<CellLevel, int> levels[] = {
      {CellLevel::Poor, 1}, {CellLevel::Fair, 2}, {CellLevel::Good, 3}, {CellLevel::Excellent, 4}};
  for (const auto& [level, bars] : levels) {
    tell({.level = level});
    EXPECT_EQ(filledBars(row, endOfLevelMark), bars);
  }
}

TEST_F(RowWidgetTest, MarksMoveNoLabel) {
  RowWidget& row = show("RSRP", "-97.25 dBm");
  const QRect name(10, 0, 60, 50), value(290, 0, 70, 50);
  const QImage nameBefore = row.grab(name).toImage(), valueBefore = row.grab(value).toImage();
  tell({.change = CellChange::Changed, .level = CellLevel::Poor, .course = {1, 2, 3}});
  EXPECT_EQ(row.grab(name).toImage(), nameBefore);
  EXPECT_EQ(row.grab(value).toImage(), valueBefore);
  EXPECT_EQ(row.description(), "RSRP: -97.25 dBm");
}

TEST_F(RowWidgetTest, TheSparklineIsBetweenNameAndLevel) {
  RowWidget& row = show("RSRP", "-97.25 dBm");
  EXPECT_TRUE(row.sparklineArea().isEmpty());
  tell({.level = CellLevel::Good, .course = {-97, -96}});
  EXPECT_EQ(row.sparklineArea(), QRectF(endOfLevelMark - 18 - 8 - 96, 12, 96, 26));
  EXPECT_GT(contrastIn(row, row.sparklineArea().toRect()), 3);
}

TEST_F(RowWidgetTest, ThereIsNoSparklineBelow60Points) {
  RowWidget& row = show("A name that takes much room", "-97.25 dBm");
  tell(withCourse(1, 2));
  EXPECT_TRUE(row.sparklineArea().isEmpty());
  table.resize(500, 400);
  EXPECT_FALSE(row.sparklineArea().isEmpty());
  EXPECT_GE(row.sparklineArea().width(), 60);
}

TEST_F(RowWidgetTest, ARowThatScrollsHasNoSparklineAndKeepsItsLevel) {
  RowWidget& row = show("RSRP", std::string(80, 'x'));
  const QImage before = row.grab().toImage();
  tell({.level = CellLevel::Good, .course = {1, 2}});
  EXPECT_TRUE(row.sparklineArea().isEmpty());
  EXPECT_NE(row.grab().toImage(), before);
}

TEST_F(RowWidgetTest, TheSparklineIsDrawnOnlyWhenTheCourseChanges) {
  RowWidget& row = show("RSRP", "-97.25 dBm");
  tell(withCourse(-97, -96));
  row.grab();
  EXPECT_EQ(row.sparklinesDrawn(), 1u);
  delegate.rows.front().value = "-98.25 dBm";
  delegate.rows.front().facts.change = CellChange::Changed;
  table.reloadData();
  row.grab();
  EXPECT_EQ(row.sparklinesDrawn(), 1u);
  tell(withCourse(-97, -98));
  row.grab();
  EXPECT_EQ(row.sparklinesDrawn(), 2u);
}

TEST_F(RowWidgetTest, FactsThatAreTheSameRepaintNothing) {
  RowWidget& row = show("RSRP", "-97.25 dBm");
  tell(withCourse(-97, -96));
  QCoreApplication::processEvents();
  PaintCounter counter;
  counter.watch(row);
  tell(withCourse(-97, -96));
  QCoreApplication::processEvents();
  EXPECT_TRUE(counter.painted.empty());
  tell(withCourse(-97, -95));
  QCoreApplication::processEvents();
  EXPECT_EQ(counter.painted.size(), 1u);
}

TEST_F(RowWidgetTest, AnOldValueIsPalerThanItsName) {
  RowWidget& row = show("RSRP", "-97.25 dBm");
  const QRect name(10, 0, 60, 50), value(260, 0, 100, 45);
  const double plain = contrastIn(row, value);
  tell({.dimming = CellDimming::Value});
  EXPECT_LT(contrastIn(row, value), 0.6 * plain);
  EXPECT_GE(contrastIn(row, value), 4.4) << "still easy to read";
  EXPECT_GT(contrastIn(row, name), 0.9 * plain);
  tell({.dimming = CellDimming::All});
  EXPECT_LT(contrastIn(row, name), 0.6 * plain);
}

TEST_F(RowWidgetTest, ASummaryStandsBesideTheNameAndIsReadAfterIt) {
  RowWidget& row =
      showSection("0", {.level = CellLevel::Good, .summary = {"PCI 16", "\u221284.0 dBm", "\u22129.0 dB"}});
  EXPECT_EQ(row.name(), "0");
  EXPECT_EQ(row.description().toStdString(), "0: PCI 16, \u221284.0 dBm, \u22129.0 dB");
  EXPECT_FALSE(row.reachesPastItsEdge());
  EXPECT_GT(contrastIn(row, {200, 10, 100, 30}), 4.4);
  EXPECT_EQ(filledBars(row, endOfRecordsLevelMark), 3);
}

TEST_F(RowWidgetTest, PartsOfASummaryWithoutRoomAreLeftOutAndToldInTheDetails) {
  RowWidget& row = showSection("0", {.summary = {"PCI 16", std::string(60, 'x')}});
  EXPECT_TRUE(row.reachesPastItsEdge());
  EXPECT_EQ(row.details("It is far.").toStdString(), "0: PCI 16, " + std::string(60, 'x') + "\nIt is far.");
  // Only the first part is there, at the right edge.
  EXPECT_EQ(contrastIn(row, {30, 10, 200, 30}), 1);
  EXPECT_GT(contrastIn(row, {280, 10, 50, 30}), 4.4);
}

TEST_F(RowWidgetTest, APartOfASummaryFromRightToLeftLeavesTheOthersInOrder) {
  RowWidget& row = showSection("0", {.summary = {"\u05E9\u05DC\u05D5\u05DD", "5"}});
  EXPECT_EQ(row.description().toStdString(), "0: \u2068\u05E9\u05DC\u05D5\u05DD\u2069, 5");
}

TEST_F(RowWidgetTest, ARightToLeftDesktopTurnsNoValueAround) {
  RowWidget& row = show("RSRP", "-97.25 dBm");
  const QImage before = row.grab().toImage();
  table.setLayoutDirection(Qt::RightToLeft);
  EXPECT_EQ(row.grab().toImage(), before);
}

}  // namespace
}  // namespace varnel
