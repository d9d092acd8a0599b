#include "widgets/TableWidget.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <QAction>
#include <QScrollBar>
#include <QTextDocument>
#include <QToolTip>
#include <algorithm>

#include "tests/support/EventLoop.h"
#include "tests/support/TestWidgets.h"

namespace varnel {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

// A table of 360 × 400: eight rows are visible.
class TableWidgetTest : public testing::Test {
 protected:
  TableWidgetTest() { table.resize(360, 400); }

  void showWith(std::vector<TestRow> rows) {
    delegate.rows = std::move(rows);
    table.setDelegate(&delegate);
    table.show();
    table.activateWindow();
    table.setFocus();
    ASSERT_TRUE(QTest::qWaitForWindowActive(&table, patience_ms));
    ASSERT_TRUE(table.hasFocus());
    QCoreApplication::processEvents();
  }
  void press(Qt::Key key, Qt::KeyboardModifiers modifiers = Qt::NoModifier) {
    QTest::keyClick(&table, key, modifiers);
  }
  RowWidget& row(std::size_t index) const { return *table.visibleRows().at(index); }
  // The row with the focus frame; -1 when there is none.
  int current() const {
    for (const RowWidget* each : table.visibleRows()) {
      if (each->emphasis().hasFocusFrame) return static_cast<int>(each->row());
    }
    return -1;
  }
  int selected() const {
    for (const RowWidget* each : table.visibleRows()) {
      if (each->emphasis().isSelected) return static_cast<int>(each->row());
    }
    return -1;
  }
  void click(const QPoint& position, Qt::MouseButton button = Qt::LeftButton) {
    QTest::mouseClick(table.viewport(), button, {}, position);
  }

  TestRows delegate{{}};
  TableWidget table;
};

TEST_F(TableWidgetTest, AsksNobodyBeforeItIsOnTheScreen) {
  delegate.rows = leaves(3);
  table.setDelegate(&delegate);
  EXPECT_THAT(delegate.asked, IsEmpty());
  table.show();
  EXPECT_THAT(delegate.asked, ElementsAre(0, 1, 2));
}

TEST_F(TableWidgetTest, HasCellsForItsVisibleRowsOnly) {
  showWith(leaves(1000));
  EXPECT_THAT(delegate.asked, ElementsAre(0, 1, 2, 3, 4, 5, 6, 7));
  EXPECT_EQ(table.visibleRows().size(), 8u);
  EXPECT_EQ(delegate.made, 8u);
}

TEST_F(TableWidgetTest, RowsAre50HighOneBelowTheOther) {
  showWith(leaves(3));
  EXPECT_EQ(row(0).geometry(), QRect(0, 0, 360, 50));
  EXPECT_EQ(row(2).geometry(), QRect(0, 100, 360, 50));
}

TEST_F(TableWidgetTest, AReloadOfTheSameRowsMakesNoCellAndGivesEachRowItsOwn) {
  showWith({{"A"}, {"B", "1"}, {"C"}, {"D", "2"}});
  const auto before = table.visibleRows();
  delegate.rows[1].value = "3";
  table.reloadData();
  EXPECT_EQ(delegate.made, 4u);
  EXPECT_EQ(table.visibleRows(), before);
  EXPECT_EQ(row(1).description(), "B: 3");
}

TEST_F(TableWidgetTest, AReloadGivesEachRowItsOwnCellAlsoWhenOthersWereScrolledAway) {
  auto rows = leaves(100);
  for (std::size_t i = 0; i < rows.size(); i += 3) rows[i].value.reset();
  showWith(rows);
  table.verticalScrollBar()->setValue(25);  // nine rows
  table.verticalScrollBar()->setValue(0);   // eight again, and a cell in the pool
  const auto before = table.visibleRows();
  table.reloadData();
  EXPECT_EQ(table.visibleRows(), before);
}

TEST_F(TableWidgetTest, AReloadRepaintsOnlyWhatHasChanged) {
  showWith(leaves(8));
  PaintCounter counter;
  for (RowWidget* each : table.visibleRows()) counter.watch(*each);
  // After this no repaint of the start is pending.
  for (RowWidget* each : table.visibleRows()) each->update();
  ASSERT_TRUE(QTest::qWaitFor([&] { return counter.painted.size() >= 8; }, patience_ms));
  counter.painted.clear();
  table.reloadData();
  QTest::qWait(50);
  EXPECT_THAT(counter.painted, IsEmpty());
  delegate.rows[5].value = "new";
  table.reloadData();
  ASSERT_TRUE(QTest::qWaitFor([&] { return !counter.painted.empty(); }, patience_ms));
  QTest::qWait(50);
  EXPECT_THAT(counter.painted, ElementsAre(&row(5)));
}

TEST_F(TableWidgetTest, AReloadKeepsPositionAndSelection) {
  showWith(leaves(100));
  table.verticalScrollBar()->setValue(1234);
  click({100, 100});  // row 26
  for (TestRow& each : delegate.rows) each.value = "changed";
  press(Qt::Key_Down);
  table.reloadData();
  EXPECT_EQ(table.verticalScrollBar()->value(), 1234);
  EXPECT_EQ(selected(), 27);
  EXPECT_EQ(current(), 27);
}

TEST_F(TableWidgetTest, AReloadWithFewerRowsDropsTheSelectionOfALostOneAndScrollsBack) {
  showWith(leaves(100));
  press(Qt::Key_End);
  delegate.rows = leaves(10);
  table.reloadData();
  EXPECT_EQ(selected(), -1);
  EXPECT_EQ(table.verticalScrollBar()->value(), 100);
  EXPECT_EQ(table.visibleRows().front()->row(), 2u);
}

TEST_F(TableWidgetTest, AReloadWithFewerRowsLeavesNoneOfTheLostOnesOnTheScreen) {
  const auto shownRows = [this] {
    const auto all = table.viewport()->findChildren<RowWidget*>();
    return std::ranges::count_if(all, [](const RowWidget* each) { return each->isVisible(); });
  };
  showWith(leaves(8));
  EXPECT_EQ(shownRows(), 8);
  delegate.rows = leaves(3);
  table.reloadData();
  EXPECT_EQ(shownRows(), 3);
  delegate.rows = leaves(8);
  table.reloadData();
  EXPECT_EQ(shownRows(), 8);
}

TEST_F(TableWidgetTest, ASectionThatBecomesALeafShowsItsNameOnlyUntilAReloadChangesHowManyRowsThereAre) {
  showWith({{"Cells"}, {"RSRP", "-97 dBm"}});
  delegate.rows[0].value = "none";
  table.reloadData();
  EXPECT_EQ(row(0).description(), "Cells");
  table.reloadData();
  EXPECT_EQ(row(0).description(), "Cells");
  delegate.rows.push_back({"RSRQ", "-11 dB"});
  table.reloadData();
  EXPECT_EQ(row(0).description(), "Cells: none");
  EXPECT_EQ(delegate.made, 5u);
}

TEST_F(TableWidgetTest, AReloadWithOtherNamesMakesFreshCells) {
  showWith({{"Cells"}, {"RSRP", "-97 dBm"}});
  delegate.rows = {{"RSRP", "-97 dBm"}, {"RSRQ", "-11 dB"}};
  table.reloadData();
  EXPECT_EQ(row(0).description(), "RSRP: -97 dBm");
  EXPECT_EQ(row(1).description(), "RSRQ: -11 dB");
}

TEST_F(TableWidgetTest, CellsThatWereScrolledAwayBeforeTheRowsChangedAreNotHandedOutAfterwards) {
  showWith(leaves(20));
  for (TestRow& each : delegate.rows) each.value.reset();
  delegate.rows.pop_back();
  table.reloadData();
  table.verticalScrollBar()->setValue(500);  // the cells of the sections go into the pool
  table.verticalScrollBar()->setValue(0);
  delegate.rows = leaves(20);
  table.reloadData();
  table.verticalScrollBar()->setValue(25);  // a ninth cell
  EXPECT_EQ(row(8).description(), "Row 8: 8");
}

TEST_F(TableWidgetTest, ARowKeepsSidewaysPositionAndFocusWhenTheRowsChange) {
  showWith(leaves(2, std::string(200, 'x')));
  press(Qt::Key_Down);
  press(Qt::Key_Right, Qt::ShiftModifier);
  delegate.rows = leaves(3, std::string(200, 'x'));
  table.reloadData();
  EXPECT_EQ(row(0).sidewaysPosition(), 60);
  EXPECT_EQ(row(1).sidewaysPosition(), 0);
  EXPECT_EQ(current(), 0);
}

TEST_F(TableWidgetTest, ARowKeepsItsSidewaysPositionOverAReload) {
  showWith(leaves(2, std::string(200, 'x')));
  press(Qt::Key_Down);
  press(Qt::Key_Right, Qt::ShiftModifier);
  EXPECT_EQ(row(0).sidewaysPosition(), 60);
  delegate.rows[0].value = std::string(210, 'y');
  table.reloadData();
  EXPECT_EQ(row(0).sidewaysPosition(), 60);
}

TEST_F(TableWidgetTest, ACellThatComesToAnotherRowBeginsAtItsLeftEnd) {
  showWith(leaves(100, std::string(200, 'x')));
  press(Qt::Key_Down);
  press(Qt::Key_Right, Qt::ShiftModifier);
  table.verticalScrollBar()->setValue(2000);
  for (const RowWidget* each : table.visibleRows()) EXPECT_EQ(each->sidewaysPosition(), 0);
}

TEST_F(TableWidgetTest, ScrolledAwayCellsAreUsedAgainInTheOrderInWhichTheyLeft) {
  showWith(leaves(100));
  RowWidget& first = row(0);
  RowWidget& second = row(1);
  table.verticalScrollBar()->setValue(100);
  EXPECT_EQ(delegate.made, 8u);
  EXPECT_EQ(first.row(), 8u);
  EXPECT_EQ(second.row(), 9u);
}

TEST_F(TableWidgetTest, AWheelScrollsUpAndDown) {
  showWith(leaves(100));
  turnWheel(*table.viewport(), {100, 100}, {0, -60});
  EXPECT_EQ(table.verticalScrollBar()->value(), 75);  // three lines, half a row each
  turnWheel(*table.viewport(), {100, 100}, {0, 60});
  EXPECT_EQ(table.verticalScrollBar()->value(), 0);
}

TEST_F(TableWidgetTest, AWheelSidewaysScrollsTheRowBelowIt) {
  showWith(leaves(5, std::string(200, 'x')));
  turnWheel(*table.viewport(), {100, 110}, {-40, 0});
  EXPECT_EQ(row(2).sidewaysPosition(), 40);
  EXPECT_EQ(row(1).sidewaysPosition(), 0);
  turnWheel(*table.viewport(), {100, 110}, {0, 15}, Qt::ShiftModifier);
  EXPECT_EQ(row(2).sidewaysPosition(), 25);
  turnWheel(*table.viewport(), {100, 110}, {400, 0});
  EXPECT_EQ(row(2).sidewaysPosition(), 0) << "not past the beginning";
}

TEST_F(TableWidgetTest, ARowThatFitsDoesNotScrollSideways) {
  showWith(leaves(5));
  turnWheel(*table.viewport(), {100, 110}, {-40, 0});
  EXPECT_EQ(row(2).sidewaysRange(), 0);
  EXPECT_EQ(row(2).sidewaysPosition(), 0);
}

TEST_F(TableWidgetTest, ShiftAndArrowsScrollTheCurrentRowSideways) {
  showWith(leaves(5, std::string(200, 'x')));
  press(Qt::Key_Down);
  press(Qt::Key_Down);
  press(Qt::Key_Right, Qt::ShiftModifier);
  press(Qt::Key_Right, Qt::ShiftModifier);
  press(Qt::Key_Left, Qt::ShiftModifier);
  EXPECT_EQ(row(1).sidewaysPosition(), 60);
  EXPECT_THAT(delegate.chosen, IsEmpty());
}

TEST_F(TableWidgetTest, ArrowKeysGoFromRowToRowAndStopAtTheEnds) {
  showWith(leaves(3));
  EXPECT_EQ(current(), -1);
  press(Qt::Key_Down);
  EXPECT_EQ(current(), 0);
  press(Qt::Key_Down);
  press(Qt::Key_Down);
  press(Qt::Key_Down);
  EXPECT_EQ(current(), 2);
  EXPECT_EQ(selected(), 2);
  press(Qt::Key_Up);
  EXPECT_EQ(current(), 1);
  press(Qt::Key_Home);
  press(Qt::Key_Up);
  EXPECT_EQ(current(), 0);
  EXPECT_THAT(delegate.chosen, IsEmpty()) << "going there chooses nothing";
}

TEST_F(TableWidgetTest, PageAndEndKeysScroll) {
  showWith(leaves(100));
  press(Qt::Key_Down);
  press(Qt::Key_PageDown);
  EXPECT_EQ(current(), 8);
  EXPECT_EQ(table.verticalScrollBar()->value(), 400);
  press(Qt::Key_End);
  EXPECT_EQ(current(), 99);
  EXPECT_EQ(table.verticalScrollBar()->value(), 4600);
  press(Qt::Key_PageUp);
  EXPECT_EQ(current(), 91);
  EXPECT_EQ(table.verticalScrollBar()->value(), 4200);
  press(Qt::Key_Home);
  EXPECT_EQ(table.verticalScrollBar()->value(), 0);
}

TEST_F(TableWidgetTest, TheFirstPageDownPagesWithoutACurrentRow) {
  showWith(leaves(100));
  press(Qt::Key_PageDown);
  EXPECT_EQ(table.verticalScrollBar()->value(), 400);
  EXPECT_EQ(current(), 8);
}

TEST_F(TableWidgetTest, TheFirstPageDownAfterAClickPagesAndKeepsTheRowsPlaceOnTheScreen) {
  showWith(leaves(100));
  click({100, 125});
  press(Qt::Key_PageDown);
  EXPECT_EQ(table.verticalScrollBar()->value(), 400);
  EXPECT_EQ(current(), 10);
  press(Qt::Key_PageUp);
  EXPECT_EQ(table.verticalScrollBar()->value(), 0);
  EXPECT_EQ(current(), 2);
}

TEST_F(TableWidgetTest, APageGoesOnFromTheScreenWhenTheClickedRowWasScrolledAway) {
  showWith(leaves(100));
  click({100, 125});
  table.verticalScrollBar()->setValue(2000);
  press(Qt::Key_PageDown);
  EXPECT_EQ(table.verticalScrollBar()->value(), 2400);
  EXPECT_EQ(current(), 48);
}

TEST_F(TableWidgetTest, AtTheEndAPageLeadsToTheLastRow) {
  showWith(leaves(10));
  click({100, 275});
  press(Qt::Key_PageDown);
  EXPECT_EQ(table.verticalScrollBar()->value(), 100);
  EXPECT_EQ(current(), 9);
}

TEST_F(TableWidgetTest, ReturnEnterSpaceAndRightChooseTheCurrentRow) {
  showWith({{"A"}, {"B"}});
  press(Qt::Key_Return);
  EXPECT_THAT(delegate.chosen, IsEmpty()) << "there is no current row yet";
  press(Qt::Key_Down);
  press(Qt::Key_Return);
  press(Qt::Key_Enter);
  press(Qt::Key_Space);
  press(Qt::Key_Down);
  press(Qt::Key_Right);
  EXPECT_THAT(delegate.chosen, ElementsAre(0, 0, 0, 1));
}

TEST_F(TableWidgetTest, ADeselectedRowStaysTheOneThatArrowsGoOnFrom) {
  showWith(leaves(5));
  press(Qt::Key_Down);
  press(Qt::Key_Down);
  press(Qt::Key_Return);
  EXPECT_EQ(selected(), -1);
  EXPECT_EQ(current(), 1);
  press(Qt::Key_Down);
  EXPECT_EQ(selected(), 2);
}

TEST_F(TableWidgetTest, AClickChoosesTheRowUnderIt) {
  showWith({{"A"}, {"B"}, {"C"}});
  click({100, 75});
  EXPECT_THAT(delegate.chosen, ElementsAre(1));
  EXPECT_EQ(selected(), 1);
  EXPECT_EQ(current(), -1) << "no frame for the mouse";
  click({100, 300});
  click({100, 25}, Qt::RightButton);
  EXPECT_THAT(delegate.chosen, ElementsAre(1));
}

TEST_F(TableWidgetTest, AMouseThatLeavesTheRowChoosesNothing) {
  showWith(leaves(3));
  QTest::mousePress(table.viewport(), Qt::LeftButton, {}, {100, 25});
  QTest::mouseRelease(table.viewport(), Qt::LeftButton, {}, {100, 75});
  EXPECT_THAT(delegate.chosen, IsEmpty());
}

TEST_F(TableWidgetTest, AMouseDragScrollsALongValueAndChoosesNothing) {
  showWith(leaves(3, std::string(200, 'x')));
  QTest::mousePress(table.viewport(), Qt::LeftButton, {}, {300, 75});
  QTest::mouseMove(table.viewport(), {220, 80});
  EXPECT_EQ(row(1).sidewaysPosition(), 80);
  QTest::mouseMove(table.viewport(), {295, 80});
  EXPECT_EQ(row(1).sidewaysPosition(), 5);
  QTest::mouseRelease(table.viewport(), Qt::LeftButton, {}, {295, 80});
  EXPECT_EQ(row(0).sidewaysPosition(), 0);
  EXPECT_THAT(delegate.chosen, IsEmpty());
}

TEST_F(TableWidgetTest, ATremblingClickOnALongValueChoosesItsRow) {
  showWith(leaves(3, std::string(200, 'x')));
  QTest::mousePress(table.viewport(), Qt::LeftButton, {}, {300, 75});
  QTest::mouseMove(table.viewport(), {298, 76});
  QTest::mouseRelease(table.viewport(), Qt::LeftButton, {}, {298, 76});
  EXPECT_EQ(row(1).sidewaysPosition(), 0);
  EXPECT_THAT(delegate.chosen, ElementsAre(1));
}

TEST_F(TableWidgetTest, ADragOverAReloadGoesOn) {
  showWith(leaves(3, std::string(200, 'x')));
  QTest::mousePress(table.viewport(), Qt::LeftButton, {}, {300, 75});
  delegate.rows.push_back({"More", "1"});
  table.reloadData();
  QTest::mouseMove(table.viewport(), {260, 75});
  EXPECT_EQ(row(1).sidewaysPosition(), 40);
  delegate.rows.clear();
  table.reloadData();
  QTest::mouseMove(table.viewport(), {200, 75});
  QTest::mouseRelease(table.viewport(), Qt::LeftButton, {}, {200, 75});
  EXPECT_THAT(delegate.chosen, IsEmpty());
}

TEST_F(TableWidgetTest, ARowThatIsTooShortForItsValueTellsAllOfItInATooltip) {
  const auto pointAt = [this](const QPoint& position) {
    QHelpEvent event(QEvent::ToolTip, position, table.viewport()->mapToGlobal(position));
    QApplication::sendEvent(table.viewport(), &event);
  };
  showWith({{"Short", "1"}, {"Number", std::string(80, 'x') + " <b>&"}});
  pointAt({100, 75});
  EXPECT_TRUE(QToolTip::isVisible());
  QTextDocument tip;
  tip.setHtml(QToolTip::text());
  EXPECT_EQ(tip.toPlainText().remove(QChar(0x200B)).toStdString(),
            "Number: " + std::string(80, 'x') + " <b>&");
  pointAt({100, 25});
  // The toolkit removes a tooltip after a delay, but its text at once.
  EXPECT_TRUE(runUntil([] { return !QToolTip::isVisible(); }));
}

TEST_F(TableWidgetTest, WithoutADelegateItIsEmpty) {
  showWith(leaves(3));
  table.setDelegate(nullptr);
  EXPECT_THAT(table.visibleRows(), IsEmpty());
}

TEST_F(TableWidgetTest, ASilentTableKeepsWhatItShowsAndCallsNobody) {
  showWith(leaves(100));
  table.fallSilent();
  delegate.asked.clear();
  click({100, 75});
  table.verticalScrollBar()->setValue(500);
  EXPECT_THAT(delegate.asked, IsEmpty());
  EXPECT_THAT(delegate.chosen, IsEmpty());
}

TEST_F(TableWidgetTest, AnotherWidthLaysTheVisibleCellsOutAgain) {
  showWith(leaves(3));
  table.resize(500, 400);
  QCoreApplication::processEvents();
  EXPECT_EQ(row(1).width(), 500);
  EXPECT_EQ(row(1).contentBounds(), (Rect{0, 0, 500, 50}));
}

TEST_F(TableWidgetTest, AHigherWindowShowsMoreRows) {
  showWith(leaves(100));
  table.resize(360, 600);
  QCoreApplication::processEvents();
  EXPECT_EQ(table.visibleRows().size(), 12u);
}

TEST_F(TableWidgetTest, SizedToFitItIsAsHighAsItsRows) {
  table.sizeToFit();
  EXPECT_THAT(delegate.asked, IsEmpty());
  showWith(leaves(3));
  EXPECT_EQ(table.maximumHeight(), 150);
}

TEST_F(TableWidgetTest, AClickOnTheSmallLineOfARowAsksForItsCourseAlone) {
  showWith({{"A", "1"}, {"B", "2"}});
  row(1).setFacts({.course = {1, 2, 3}});
  QCoreApplication::processEvents();
  ASSERT_FALSE(row(1).sparklineArea().isEmpty());
  const QPoint line = row(1).mapTo(table.viewport(), row(1).sparklineArea().center().toPoint());
  click(line);
  EXPECT_THAT(delegate.chosen, testing::ElementsAre(1)) << "nobody shows courses";

  auto* const course = new QAction(&table);
  course->setObjectName(TableWidget::courseCommand);
  int asked = 0;
  QObject::connect(course, &QAction::triggered, &table, [&] { ++asked; });
  click(line);
  EXPECT_EQ(asked, 1);
  EXPECT_EQ(table.currentPlace(), 1U);
  click(row(1).mapTo(table.viewport(), QPoint(5, 25)));
  EXPECT_EQ(asked, 1);
  EXPECT_THAT(delegate.chosen, testing::ElementsAre(1, 1));
}

}  // namespace
}  // namespace varnel
