#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <QAbstractItemModelTester>
#include <QContextMenuEvent>
#include <QHeaderView>
#include <QHelpEvent>
#include <QScrollBar>
#include <QToolTip>

#include "tests/support/Finger.h"
#include "tests/support/TestWidgets.h"
#include "widgets/Colors.h"
#include "widgets/RecordTableWidget.h"

namespace varnel {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

RecordList::Record cell(const std::string& name, const std::string& identity, double level_dbm) {
  return {name,
          identity,
          {{identity, std::nullopt}, {std::to_string(static_cast<int>(level_dbm)) + " dBm", level_dbm}}};
}

RecordList cells(std::vector<RecordList::Record> records) { return {{"PCI", "RSRP"}, std::move(records)}; }

std::vector<std::string> texts(const QAbstractItemModel& model, int column) {
  std::vector<std::string> all;
  for (int row = 0; row < model.rowCount(); ++row)
    all.push_back(model.index(row, column).data().toString().toStdString());
  return all;
}

class RecordTableModelTest : public testing::Test {
 protected:
  RecordTableModel model;
  QAbstractItemModelTester tester{&model, QAbstractItemModelTester::FailureReportingMode::Fatal};
};

TEST_F(RecordTableModelTest, HasTheNameOfARecordAndAColumnPerEntry) {
  model.show(cells({cell("0", "16", -84), cell("1", "7", -90)}));
  ASSERT_EQ(model.columnCount(), 3);
  EXPECT_EQ(model.headerData(0, Qt::Horizontal, Qt::DisplayRole), "No.");
  EXPECT_EQ(model.headerData(2, Qt::Horizontal, Qt::DisplayRole), "RSRP");
  EXPECT_THAT(texts(model, 0), ElementsAre("0", "1"));
  EXPECT_THAT(texts(model, 2), ElementsAre("-84 dBm", "-90 dBm"));
}

TEST_F(RecordTableModelTest, SortsNumbersByTheirValues) {
  model.show(cells({cell("0", "a", -84), cell("1", "b", -101), cell("2", "c", -9)}));
  model.sort(2, Qt::AscendingOrder);
  EXPECT_THAT(texts(model, 2), ElementsAre("-101 dBm", "-84 dBm", "-9 dBm"));
  model.sort(2, Qt::DescendingOrder);
  EXPECT_THAT(texts(model, 2), ElementsAre("-9 dBm", "-84 dBm", "-101 dBm"));
  model.sort(-1, Qt::AscendingOrder);
  EXPECT_THAT(texts(model, 0), ElementsAre("0", "1", "2"));
}

TEST_F(RecordTableModelTest, SortsTheTenthRecordBehindTheSecond) {
  model.show(cells({cell("10", "a", 0), cell("2", "b", 0)}));
  model.sort(0, Qt::AscendingOrder);
  EXPECT_THAT(texts(model, 0), ElementsAre("2", "10"));
}

TEST_F(RecordTableModelTest, RecordsWithoutTheEntryAreLastInBothOrders) {
  RecordList list = cells({cell("0", "a", -84), cell("1", "b", -101), cell("2", "c", -9)});
  list.records[0].cells[1] = {};
  list.records[1].cells[1] = {"Not Present", std::nullopt};
  model.show(list);
  model.sort(2, Qt::AscendingOrder);
  EXPECT_THAT(texts(model, 2), ElementsAre("-9 dBm", "Not Present", ""));
  model.sort(2, Qt::DescendingOrder);
  EXPECT_THAT(texts(model, 2), ElementsAre("Not Present", "-9 dBm", ""));
}

TEST_F(RecordTableModelTest, ARefreshMovesWhatPointsToARecordWithItsIdentity) {
  model.show(cells({cell("0", "16", -84), cell("1", "7", -90), cell("2", "9", -95)}));
  model.sort(2, Qt::DescendingOrder);
  const QPersistentModelIndex seven = model.index(1, 2);
  const QPersistentModelIndex nine = model.index(2, 0);
  model.show(cells({cell("0", "7", -80), cell("1", "20", -82), cell("2", "16", -99)}));
  EXPECT_THAT(texts(model, 1), ElementsAre("7", "20", "16")) << "the new records are sorted too";
  EXPECT_EQ(seven.row(), 0);
  EXPECT_EQ(seven.data(), "-80 dBm");
  EXPECT_FALSE(nine.isValid()) << "it has gone";
}

TEST_F(RecordTableModelTest, ARefreshInTheOrderOfTheListHasTheNewOrder) {
  model.show(cells({cell("0", "16", -84), cell("1", "7", -90)}));
  model.show(cells({cell("0", "7", -80), cell("1", "16", -84), cell("2", "9", -99)}));
  EXPECT_THAT(texts(model, 1), ElementsAre("7", "16", "9"));
  model.show({});
  EXPECT_EQ(model.rowCount(), 0);
  EXPECT_EQ(model.columnCount(), 3) << "an empty list keeps the form of the table";
}

TEST_F(RecordTableModelTest, AColumnKeepsItsPlaceWhenTheRecordsNameOthersFirst) {
  model.show({{"PCI", "RSRP"}, {cell("0", "16", -84)}});
  model.show(
      {{"RSRP", "Band", "PCI"},
       {{"0", "16", {{"-85 dBm", -85.0}, {"3", 3.0}, {"16", 16.0}}}, {"1", "7", {{"-90 dBm", -90.0}}}}});
  EXPECT_EQ(model.columnCount(), 4);
  EXPECT_THAT(texts(model, 1), ElementsAre("16", ""));
  EXPECT_THAT(texts(model, 2), ElementsAre("-85 dBm", "-90 dBm"));
  EXPECT_THAT(texts(model, 3), ElementsAre("3", ""));
}

TEST_F(RecordTableModelTest, BeyondAHundredColumnsTheTableBeginsAnew) {
  RecordList list;
  list.records.push_back({"0", "a", {}});
  for (int i = 0; i < 90; ++i) list.columns.push_back("A" + std::to_string(i));
  model.show(list);
  for (std::string& name : list.columns) name.front() = 'B';
  model.show(list);
  EXPECT_EQ(model.columnCount(), 91);
  EXPECT_EQ(model.columnName(1), "B0");
  EXPECT_EQ(model.rowCount(), 1);
}

TEST_F(RecordTableModelTest, ColumnsOfNumbersStandOnTheRight) {
  RecordList list = cells({cell("0", "16", -84), cell("1", "7", -90)});
  list.records[1].cells[1] = {};
  model.show(list);
  const auto alignment = [&](int column) {
    return model.index(0, column).data(Qt::TextAlignmentRole).toInt();
  };
  EXPECT_TRUE(alignment(2) & Qt::AlignRight);
  EXPECT_TRUE(alignment(1) & Qt::AlignLeft);
}

TEST_F(RecordTableModelTest, TheOpenRecordIsBoldNotOnlyColored) {
  model.show(cells({cell("0", "16", -84), cell("1", "7", -90)}));
  model.markOpen("1");
  EXPECT_TRUE(model.index(1, 2).data(Qt::FontRole).value<QFont>().bold());
  EXPECT_FALSE(model.index(0, 2).data(Qt::FontRole).value<QFont>().bold());
  model.markOpen({});
  EXPECT_FALSE(model.index(1, 2).data(Qt::FontRole).value<QFont>().bold());
}

class RecordTableWidgetTest : public testing::Test {
 protected:
  RecordTableWidgetTest() {
    table.resize(360, 400);
    table.showRecords(cells({cell("0", "16", -84), cell("1", "7", -101), cell("2", "9", -9)}));
    table.show();
    table.activateWindow();
    table.setFocus();
    EXPECT_TRUE(QTest::qWaitForWindowActive(&table, patience_ms));
  }
  void press(Qt::Key key) { QTest::keyClick(&table, key); }
  std::string current() { return table.currentName().toStdString(); }

  std::vector<std::size_t> chosen;
  RecordTableWidget table{[this](std::size_t place) { chosen.push_back(place); }};
};

TEST_F(RecordTableWidgetTest, TheCurrentRecordStaysCurrentThroughRefreshesAndSorting) {
  table.makeCurrent(1);
  press(Qt::Key_Right);
  press(Qt::Key_Right);
  EXPECT_EQ(table.currentColumn(), "RSRP");
  press(Qt::Key_S);
  EXPECT_EQ(current(), "1");
  EXPECT_EQ(table.currentIndex().row(), 0) << "-101 dBm is the lowest";
  table.showRecords(cells({cell("0", "7", -50), cell("1", "16", -84)}));
  EXPECT_EQ(current(), "0") << "the same cell has another number now";
  EXPECT_EQ(table.currentPlace(), 0u);
  EXPECT_EQ(table.currentIndex().row(), 1);
  EXPECT_EQ(table.currentColumn(), "RSRP");
}

TEST_F(RecordTableWidgetTest, TheMarkOfTheCurrentRecordIsPalerWhileCommandsAreForAnotherRow) {
  table.showRecords(cells({cell("0", "16", -84)}));
  table.makeCurrent(0);
  const auto ground = [this] {
    const QPoint corner = table.visualRect(table.model()->index(0, 1)).topRight() + QPoint(-2, 2);
    return table.viewport()->grab().toImage().pixelColor(corner).name().toStdString();
  };
  EXPECT_EQ(ground(), selectionColor(table.palette()).name().toStdString());
  table.setPale(true);
  EXPECT_EQ(ground(), paleSelectionColor(table.palette()).name().toStdString());
}

TEST_F(RecordTableWidgetTest, SSortsByTheCurrentColumnAndThenTheOtherWayRound) {
  table.makeCurrent(0);
  press(Qt::Key_Right);
  press(Qt::Key_Right);
  press(Qt::Key_S);
  EXPECT_THAT(texts(*table.model(), 2), ElementsAre("-101 dBm", "-84 dBm", "-9 dBm"));
  press(Qt::Key_S);
  EXPECT_THAT(texts(*table.model(), 2), ElementsAre("-9 dBm", "-84 dBm", "-101 dBm"));
}

TEST_F(RecordTableWidgetTest, AClickOnAColumnSortsUpDownAndNotAtAll) {
  QHeaderView& header = *table.horizontalHeader();
  const QPoint title(header.sectionViewportPosition(2) + 5, header.height() / 2);
  QTest::mouseClick(header.viewport(), Qt::LeftButton, {}, title);
  EXPECT_THAT(texts(*table.model(), 0), ElementsAre("1", "0", "2"));
  QTest::mouseClick(header.viewport(), Qt::LeftButton, {}, title);
  EXPECT_THAT(texts(*table.model(), 0), ElementsAre("2", "0", "1"));
  QTest::mouseClick(header.viewport(), Qt::LeftButton, {}, title);
  EXPECT_THAT(texts(*table.model(), 0), ElementsAre("0", "1", "2"));
}

TEST_F(RecordTableWidgetTest, EnterAndAClickChooseTheRecordByItsPlaceInTheList) {
  table.sortByColumn(2, Qt::AscendingOrder);
  press(Qt::Key_Home);
  press(Qt::Key_Return);
  EXPECT_THAT(chosen, ElementsAre(1));
  const QRect last = table.visualRect(table.model()->index(2, 1));
  QTest::mouseClick(table.viewport(), Qt::LeftButton, {}, last.center());
  EXPECT_THAT(chosen, ElementsAre(1, 2));
}

TEST_F(RecordTableWidgetTest, KeysThatLeaveTheTableAreForTheWidgetAround) {
  table.makeCurrent(0);
  const auto isTaken = [&](int key) {
    QKeyEvent event(QEvent::KeyPress, key, Qt::NoModifier);
    QApplication::sendEvent(&table, &event);
    return event.isAccepted();
  };
  EXPECT_FALSE(isTaken(Qt::Key_Left));
  EXPECT_FALSE(isTaken(Qt::Key_Escape));
  EXPECT_TRUE(isTaken(Qt::Key_Right));
  EXPECT_TRUE(isTaken(Qt::Key_Right));
  EXPECT_FALSE(isTaken(Qt::Key_Right)) << "this is the last column";
  QKeyEvent held(QEvent::KeyPress, Qt::Key_Right, Qt::NoModifier, QString(), true);
  QApplication::sendEvent(&table, &held);
  EXPECT_TRUE(held.isAccepted()) << "a key that is held down stops at the edge";
}

TEST_F(RecordTableWidgetTest, AColumnFitsItsTextsUnlessTheUserHasGivenItAWidth) {
  const QHeaderView& header = *table.horizontalHeader();
  const int before = header.sectionSize(1);
  RecordList list = cells({cell("0", "16", -84)});
  list.records[0].cells[0].text = "a text that is longer";
  table.showRecords(list);
  EXPECT_GT(header.sectionSize(1), before);
  table.setColumnWidth(1, 50);
  table.showRecords(list);
  EXPECT_EQ(header.sectionSize(1), 50);
}

TEST_F(RecordTableWidgetTest, ATextThatIsCutHasATooltip) {
  const auto ask = [this] {
    const QRect rect = table.visualRect(table.model()->index(0, 2));
    QHelpEvent question(QEvent::ToolTip, rect.center(), table.viewport()->mapToGlobal(rect.center()));
    QApplication::sendEvent(table.viewport(), &question);
    return QToolTip::text();
  };
  EXPECT_EQ(ask(), "");
  table.setColumnWidth(2, 30);
  EXPECT_TRUE(ask().contains("-84 dBm"));
  QToolTip::hideText();
}

TEST_F(RecordTableWidgetTest, TheRightButtonAndARestingFingerMakeTheCellCurrent) {
  const QRect rect = table.visualRect(table.model()->index(2, 1));
  QContextMenuEvent wish(QContextMenuEvent::Mouse, rect.center(), QPoint());
  QApplication::sendEvent(table.viewport(), &wish);
  EXPECT_FALSE(wish.isAccepted()) << "what is around the table opens the menu";
  EXPECT_EQ(current(), "2");
  EXPECT_EQ(table.currentColumn(), "PCI");
  EXPECT_THAT(chosen, IsEmpty());
}

TEST_F(RecordTableWidgetTest, AWideTableIsScrolledSidewaysByTouch) {
  RecordList list;
  list.records.push_back({"0", "a", {}});
  for (int i = 0; i < 20; ++i) {
    list.columns.push_back("Column " + std::to_string(i));
    list.records[0].cells.push_back({"value", std::nullopt});
  }
  table.showRecords(list);
  QCoreApplication::processEvents();
  ASSERT_GT(table.horizontalScrollBar()->maximum(), 300);
  Finger finger(*table.viewport());
  finger.drag({300, 100}, {100, 100});
  EXPECT_TRUE(QTest::qWaitFor([this] { return table.horizontalScrollBar()->value() > 100; }, patience_ms));
  EXPECT_THAT(chosen, IsEmpty());
  ASSERT_TRUE(finger.waitForRest());
  finger.tap({100, table.rowHeight(0) / 2});
  EXPECT_THAT(chosen, ElementsAre(0));
}

}  // namespace
}  // namespace varnel
