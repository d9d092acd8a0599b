#include <gmock/gmock.h>

#include <QImage>
#include <QMenu>
#include <QPointingDevice>
#include <QScrollBar>
#include <QSignalSpy>
#include <QTest>
#include <QToolTip>
#include <fstream>
#include <sstream>

#include "programs/varnel/trends/TrendPageWidget.h"
#include "tests/programs/trends/TrendHarness.h"
#include "tests/support/Process.h"
#include "tests/support/TestWidgets.h"
#include "widgets/Colors.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;
using testing::SizeIs;

// A page as large as a small window, on a history of ten minutes. The level goes up from -100 to -80.
class TrendPageTest : public TrendHarness {
 protected:
  TrendPageTest() {
    for (int i = 0; i <= 300; ++i) {
      const std::string rsrp = std::to_string(-100 + i / 15) + ".0";
      show(2 * i, rsrp, i < 150 ? "-9.5" : "");
    }
    addEvent(EventKind::Handover, 300);
  }

  TrendPageWidget& open(std::vector<std::string> keys = {level}, QSize size = {700, 500}) {
    page = std::make_unique<TrendPageWidget>(source);
    for (const std::string& key : keys) page->addRow(key);
    page->resize(size);
    page->show();
    EXPECT_TRUE(QTest::qWaitForWindowExposed(page.get(), patience_ms));
    page->refresh();
    return *page;
  }
  TrendView& view() { return page->view(); }
  QString cell(int row, TrendTable::Column column) {
    return page->table().model()->index(row, column).data().toString();
  }
  double length() {
    return std::chrono::duration<double>(view().data().stretch.end - view().data().stretch.begin).count();
  }
  // The page's picture on the screen.
  QImage grab() { return view().viewport()->grab().toImage(); }
  int pixelsOf(QRgb color) {
    const QImage image = grab();
    int count = 0;
    for (int y = 0; y < image.height(); ++y)
      for (int x = 0; x < image.width(); ++x) count += image.pixel(x, y) == color;
    return count;
  }
  QRgb lineColor(std::size_t line = 0) {
    return TrendLook::of(page->palette(), page->font()).penOf(line).color().rgb();
  }
  void key(int key, Qt::KeyboardModifiers modifiers = Qt::NoModifier) {
    QTest::keyClick(view().viewport(), static_cast<Qt::Key>(key), modifiers);
  }

  std::unique_ptr<TrendPageWidget> page;
};

TEST_F(TrendPageTest, TellsTheLowestValueTheMeanAndTheHighestValueOfWhatIsShown) {
  open();
  EXPECT_EQ(cell(0, TrendTable::Name), "RSRP (dBm) — LTE > Serving Cell");
  EXPECT_EQ(cell(0, TrendTable::Lowest), "-100.0");
  EXPECT_EQ(cell(0, TrendTable::Highest), "-80.0");
  QTest::keyClick(page.get(), Qt::Key_1);
  EXPECT_EQ(length(), 120);
  EXPECT_EQ(cell(0, TrendTable::Lowest), "-84.0");
  EXPECT_EQ(cell(0, TrendTable::Highest), "-80.0");
}

TEST_F(TrendPageTest, DrawsALineInItsColor) {
  open();
  EXPECT_GT(pixelsOf(lineColor()), 300);
  page->removeRow(level);
  EXPECT_EQ(pixelsOf(lineColor()), 0);
}

TEST_F(TrendPageTest, AValueThatNoPacketRenewedIsDrawnThin) {
  numbers.clear();
  for (int i = 0; i <= 60; ++i) show(2 * i, "-90.0", {}, true);
  open();
  const int thick = pixelsOf(lineColor());
  numbers.clear();
  for (int i = 0; i <= 60; ++i) show(2 * i, "-90.0", {}, false);
  page->refresh();
  EXPECT_LT(pixelsOf(lineColor()), thick / 2);
}

TEST_F(TrendPageTest, WhereNothingCameThereIsAGap) {
  numbers.clear();
  for (int i = 0; i <= 20; ++i) show(2 * i, "-90.0");
  for (int i = 40; i <= 60; ++i) show(2 * i, "-90.0");
  open();
  const auto& columns = view().data().lines.at(0).columns;
  EXPECT_FALSE(columns.front().isEmpty);
  EXPECT_TRUE(columns[columns.size() / 2].isEmpty);
  EXPECT_FALSE(columns.back().isEmpty);
}

TEST_F(TrendPageTest, EachUnitHasItsAxis) {
  open({level, quality});
  QStringList titles;
  for (QAbstractAxis* const axis : view().chart().axes(Qt::Vertical)) titles.append(axis->titleText());
  EXPECT_EQ(titles, (QStringList{"dBm", "dB"}));
  const auto* const levels = static_cast<QValueAxis*>(view().chart().axes(Qt::Vertical)[0]);
  EXPECT_EQ(levels->min(), -100);
  EXPECT_EQ(levels->max(), -80);
  const auto* const qualities = static_cast<QValueAxis*>(view().chart().axes(Qt::Vertical)[1]);
  EXPECT_EQ(qualities->min(), -10.5);
  EXPECT_EQ(qualities->max(), -8.5);
  page->removeRow(level);
  EXPECT_THAT(view().chart().axes(Qt::Vertical), SizeIs(1));
}

TEST_F(TrendPageTest, TheTimeAxisShowsRoundTimesOfItsClock) {
  open();
  const auto& ticks = view().data().ticks;
  ASSERT_GE(ticks.size(), 2U);
  EXPECT_LE(ticks.size(), 7U);
  EXPECT_EQ(ticks[0].label, "22:14");
  EXPECT_EQ(view().data().axisTitle, "2023-11-14, UTC");
}

TEST_F(TrendPageTest, KeysZoomAndMove) {
  open();
  key(Qt::Key_Plus);
  EXPECT_EQ(length(), 300);
  key(Qt::Key_Left);
  EXPECT_EQ(view().data().stretch.end, 540s);
  key(Qt::Key_End);
  EXPECT_EQ(view().data().stretch.end, 600s);
  key(Qt::Key_Home);
  EXPECT_EQ(view().data().stretch.begin, 0s);
  key(Qt::Key_Minus);
  EXPECT_EQ(length(), 600);
}

TEST_F(TrendPageTest, TheWheelZoomsAtThePointer) {
  open();
  const QRectF area = view().chart().lines().area();
  const QPointF middle = area.center();
  QWheelEvent event(middle, view().viewport()->mapToGlobal(middle.toPoint()), {}, {0, 120}, Qt::NoButton,
                    Qt::NoModifier, Qt::NoScrollPhase, false);
  QApplication::sendEvent(view().viewport(), &event);
  EXPECT_NEAR(length(), 480, 0.1);
  EXPECT_NEAR(std::chrono::duration<double>(view().data().stretch.begin).count(), 60, 1.5);
}

TEST_F(TrendPageTest, DraggingMovesInTime) {
  open();
  key(Qt::Key_Plus);
  const QRectF area = view().chart().lines().area();
  const QPoint from(static_cast<int>(area.left()) + 50, 150),
      to(from.x() + static_cast<int>(area.width() / 2), 150);
  QTest::mousePress(view().viewport(), Qt::LeftButton, {}, from);
  QMouseEvent move(QEvent::MouseMove, to, view().viewport()->mapToGlobal(to), Qt::LeftButton, Qt::LeftButton,
                   {});
  QApplication::sendEvent(view().viewport(), &move);
  QTest::mouseRelease(view().viewport(), Qt::LeftButton, {}, to);
  EXPECT_NEAR(std::chrono::duration<double>(view().data().stretch.end).count(), 450, 2);
}

TEST_F(TrendPageTest, TheCursorShowsTheValueAndTheTime) {
  open();
  EXPECT_FALSE(view().cursor());
  key(Qt::Key_Left, Qt::ShiftModifier);
  ASSERT_TRUE(view().cursor());
  EXPECT_EQ(*view().cursor(), view().data().lines[0].columns.size() - 2);
  const QRectF area = view().chart().lines().area();
  QTest::mouseMove(view().viewport(), QPoint(static_cast<int>(area.center().x()), 200));
  ASSERT_TRUE(view().cursor());
  EXPECT_NEAR(static_cast<double>(*view().cursor()), area.width() / 2, 2);
}

TEST_F(TrendPageTest, AMarkTellsItsEvent) {
  open();
  const QRectF area = view().chart().lines().area();
  EXPECT_THAT(view().chart().lines().eventsAt(area.center().x()), SizeIs(1));
  EXPECT_THAT(view().chart().lines().eventsAt(area.center().x() + 30), IsEmpty());
  const std::size_t middle = view().data().lines[0].columns.size() / 2;
  EXPECT_THAT(view().chart().lines().eventsAtColumn(middle), SizeIs(1));
}

TEST_F(TrendPageTest, MarksHaveALegendOfTheKindsThatOccur) {
  addEvent(EventKind::Handover, 310);
  addEvent(EventKind::LossOfService, 320);
  open();
  EXPECT_EQ(page->marks().legend().text(), "handover, loss of service");
  EXPECT_EQ(page->marks().accessibleName(), "Marks of events: handover, loss of service");
  EXPECT_TRUE(page->marks().isVisible());
  QTest::keyClick(page.get(), Qt::Key_1);  // the last two minutes
  EXPECT_FALSE(page->marks().isVisible());
}

TEST_F(TrendPageTest, RowsAreChosenFromAListByUnit) {
  open();
  page->chooseRows();
  QTreeView& tree = page->chooser().tree();
  ASSERT_EQ(tree.model()->rowCount(), 2);
  const QModelIndex unit = tree.model()->index(1, 0);
  EXPECT_EQ(unit.data().toString(), "dB");
  EXPECT_EQ(tree.model()->index(0, 0, unit).data().toString(),
            "RSRQ — LTE > Neighbors > Cells, EARFCN 1300, PCI 16");
  tree.setCurrentIndex(tree.model()->index(0, 0, unit));
  QTest::keyClick(&tree, Qt::Key_Space);
  EXPECT_THAT(page->rows(), ElementsAre(level, quality));
  QTest::keyClick(&tree, Qt::Key_Space);
  EXPECT_THAT(page->rows(), ElementsAre(level));
}

TEST_F(TrendPageTest, ATapChoosesARowOfTheList) {
  open();
  page->chooseRows();
  QTreeView& tree = page->chooser().tree();
  const std::unique_ptr<QPointingDevice> finger(QTest::createTouchDevice());
  const auto tap = [&](const QModelIndex& index) {
    const QPoint place = tree.visualRect(index).center();
    QTest::touchEvent(&tree, finger.get()).press(0, place, tree.viewport());
    QTest::touchEvent(&tree, finger.get()).release(0, place, tree.viewport());
  };
  const QModelIndex unit = tree.model()->index(1, 0);
  tap(tree.model()->index(0, 0, unit));
  EXPECT_THAT(page->rows(), ElementsAre(level, quality));
  tap(unit);
  EXPECT_FALSE(tree.isExpanded(unit));
  EXPECT_THAT(page->rows(), ElementsAre(level, quality));
}

TEST_F(TrendPageTest, AFingerMovesTheListOfRows) {
  std::vector<ValueHistory::Reading> readings;
  std::vector<std::string> keys;
  for (int i = 0; i < 60; ++i) keys.push_back("/A/Row " + std::to_string(i));
  for (const std::string& key : keys) readings.push_back(reading(key, "", "1"));
  numbers.add(readings, {start + 602, 0});
  open();
  page->chooseRows();
  QTreeView& tree = page->chooser().tree();
  const std::unique_ptr<QPointingDevice> finger(QTest::createTouchDevice());
  QTest::touchEvent(&tree, finger.get()).press(0, QPoint(100, 300), tree.viewport());
  for (int y = 290; y >= 100; y -= 10)
    QTest::touchEvent(&tree, finger.get()).move(0, QPoint(100, y), tree.viewport());
  QTest::touchEvent(&tree, finger.get()).release(0, QPoint(100, 100), tree.viewport());
  EXPECT_GT(tree.verticalScrollBar()->value(), 0);
  EXPECT_THAT(page->rows(), ElementsAre(level)) << "it was no tap";
}

TEST_F(TrendPageTest, RowsOfThePictureComeFirstInTheList) {
  open({quality});
  page->chooseRows();
  const QAbstractItemModel& rows = *page->chooser().tree().model();
  ASSERT_EQ(rows.rowCount(), 2);
  const QModelIndex group = rows.index(0, 0);
  EXPECT_EQ(group.data().toString(), "In the picture");
  ASSERT_EQ(rows.rowCount(group), 1);
  EXPECT_EQ(rows.index(0, 0, group).data(Qt::CheckStateRole).toInt(), Qt::Checked);
  EXPECT_EQ(rows.index(0, 0, group).data().toString(), "RSRQ — LTE > Neighbors > Cells, EARFCN 1300, PCI 16");
  // A small window shows both ends of a long name.
  EXPECT_EQ(page->chooser().tree().textElideMode(), Qt::ElideMiddle);
}

TEST_F(TrendPageTest, WordsFindRows) {
  open({quality});
  page->chooseRows();
  page->chooser().words().setText("serv rsrp");
  QTreeView& tree = page->chooser().tree();
  ASSERT_EQ(tree.model()->rowCount(), 1);
  EXPECT_EQ(tree.model()->index(0, 0).data().toString(), "dBm");
  page->chooser().words().setText("no such row");
  EXPECT_EQ(tree.model()->rowCount(), 0);
  QTest::keyClick(&page->chooser().words(), Qt::Key_Escape);
  EXPECT_FALSE(page->chooser().isVisible());
}

TEST_F(TrendPageTest, APictureHasRoomForEightRowsAndFourUnits) {
  std::vector<ValueHistory::Reading> readings;
  std::vector<std::string> keys;
  for (int i = 0; i < 9; ++i) keys.push_back("/A/Row " + std::to_string(i));
  for (int i = 0; i < 4; ++i) keys.push_back("/B/Unit " + std::to_string(i));
  const std::string units[] = {"a", "b", "c", "d"};
  for (std::size_t i = 0; i < keys.size(); ++i)
    readings.push_back(reading(keys[i], i < 9 ? std::string_view() : units[i - 9], "1"));
  numbers.add(readings, {start + 602, 0});
  open({keys.begin(), keys.begin() + 9});
  EXPECT_THAT(page->rows(), SizeIs(8));
  EXPECT_THAT(page->remark().text().toStdString(), HasSubstr("room for 8 rows"));
  open({keys[0], keys[9], keys[10], keys[11], keys[12]});
  EXPECT_THAT(page->rows(), SizeIs(4));
  EXPECT_THAT(page->remark().text().toStdString(), HasSubstr("room for 4 units"));
}

TEST_F(TrendPageTest, WithoutARowThePageSaysWhatToDo) {
  open({});
  EXPECT_THAT(page->remark().text().toStdString(), HasSubstr("has no row yet"));
  page->addRow(level);
  EXPECT_EQ(page->remark().text(), "");
  page->removeRow(level);
  EXPECT_THAT(page->remark().text().toStdString(), HasSubstr("has no row yet"));
}

TEST_F(TrendPageTest, ARowThatHasGoneKeepsItsPlace) {
  open({level, quality});
  numbers.clear();
  page->refresh();
  EXPECT_THAT(page->rows(), SizeIs(2));
  EXPECT_EQ(cell(0, TrendTable::Name), "(gone) /LTE/Serving Cell/RSRP");
  EXPECT_EQ(cell(0, TrendTable::Mean), "");
}

TEST_F(TrendPageTest, AFileThatIsReadShowsItsProgress) {
  progress = 0.4;
  remark = "The file is being read: 40 %";
  open();
  EXPECT_TRUE(page->findChild<QProgressBar*>()->isVisible());
  EXPECT_EQ(page->findChild<QProgressBar*>()->value(), 400);
  EXPECT_EQ(page->remark().text(), "The file is being read: 40 %");
  progress.reset();
  remark = "";
  page->refresh();
  EXPECT_FALSE(page->findChild<QProgressBar*>()->isVisible());
  EXPECT_FALSE(page->remark().isVisible());
}

TEST_F(TrendPageTest, ASmallWindowHasRoomForEverything) {
  open({level, quality}, {360, 560});
  for (QToolButton* const button : page->findChildren<QToolButton*>()) {
    if (!button->isVisible()) continue;
    EXPECT_LE(button->geometry().right(), 360) << button->text().toStdString();
    EXPECT_GE(button->width(), button->sizeHint().width()) << button->text().toStdString();
  }
  EXPECT_GT(view().chart().lines().area().width(), 180);
  EXPECT_LE(page->minimumSizeHint().width(), 360);
}

// As WCAG 2.1 asks for graphics.
TEST(TrendLook, LinesHaveThreeTimesTheContrastOfTheirGround) {
  QPalette dark;
  dark.setColor(QPalette::Base, QColor(0x1e1e1e));
  dark.setColor(QPalette::Text, QColor(0xf0f0f0));
  for (const TrendLook& look : {TrendLook::of(dark, {}), TrendLook::forPaper({})})
    for (std::size_t line = 0; line < mostTrendLines; ++line)
      EXPECT_GE(contrast(look.penOf(line).color(), look.ground), 3) << line << " on " << look.isDark;
}

class SavedTrend : public TrendPageTest {
 protected:
  std::string saved(TrendPageWidget::Format format) {
    const std::string path = folder.file("trend");
    page->save(format, QString::fromStdString(path));
    EXPECT_THAT(page->remark().text().toStdString(), HasSubstr("Saved as " + path));
    std::stringstream content;
    content << std::ifstream(path).rdbuf();
    return content.str();
  }
  TemporaryFolder folder;
};

TEST_F(SavedTrend, PictureIsLargeAndOnWhite) {
  open();
  const std::string bytes = saved(TrendPageWidget::Format::Png);
  const QImage image =
      QImage::fromData(reinterpret_cast<const uchar*>(bytes.data()), static_cast<int>(bytes.size()));
  EXPECT_EQ(image.width(), 2400);
  EXPECT_EQ(image.pixel(1, 1), QColor(Qt::white).rgb());
}

TEST_F(SavedTrend, DrawingHasTheTitleTheUnitAndTheStatistics) {
  open({level, quality});
  const std::string svg = saved(TrendPageWidget::Format::Svg);
  EXPECT_THAT(svg, HasSubstr("<svg"));
  EXPECT_THAT(svg, HasSubstr("RSRP, RSRQ — a &lt;capture&gt;"));
  EXPECT_THAT(svg, HasSubstr("dBm"));
  EXPECT_THAT(svg, HasSubstr("RSRP (dBm) — LTE &gt; Serving Cell: lowest -100.0, mean"));
  EXPECT_THAT(svg, HasSubstr(">handover<"));
  EXPECT_THAT(svg, Not(HasSubstr("registration")));
}

TEST_F(SavedTrend, TableHasWhatIsShown) {
  open();
  QTest::keyClick(page.get(), Qt::Key_1);
  const std::string csv = saved(TrendPageWidget::Format::Csv);
  EXPECT_THAT(csv, HasSubstr("Time,LTE/Serving Cell/RSRP (dBm)\n2023-11-14T22:21:20.000Z,-84.0\n"));
  EXPECT_EQ(std::ranges::count(csv, '\n'), 62);
}

TEST_F(SavedTrend, AControlCharacterInTheNameOfTheFileIsShownAsAnEscape) {
  open();
  page->save(TrendPageWidget::Format::Csv, QString::fromStdString(folder.file("a\nb")));
  EXPECT_THAT(page->remark().text().toStdString(), HasSubstr("Saved as " + folder.file("a\\x0ab") + "."));
}

TEST_F(SavedTrend, AFailureIsShown) {
  open();
  page->save(TrendPageWidget::Format::Csv, "/nowhere/at/all.csv");
  EXPECT_THAT(page->remark().text().toStdString(), HasSubstr("was not written"));
}

TEST_F(SavedTrend, WhatIsToldGoesWithTheNextDeed) {
  open();
  const auto fail = [this] { page->save(TrendPageWidget::Format::Csv, "/nowhere/at/all.csv"); };
  fail();
  key(Qt::Key_Plus);
  EXPECT_EQ(page->remark().text(), "");
  fail();
  page->refresh();  // that nobody asked for
  EXPECT_NE(page->remark().text(), "");
  QTest::mouseClick(view().viewport(), Qt::LeftButton, {}, QPoint(100, 100));
  EXPECT_EQ(page->remark().text(), "");
  fail();
  saved(TrendPageWidget::Format::Csv);
  EXPECT_THAT(page->remark().text().toStdString(), Not(HasSubstr("was not written")));
}

}  // namespace
}  // namespace varnel
