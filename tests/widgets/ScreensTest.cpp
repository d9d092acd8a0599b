#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <QLabel>
#include <QScrollBar>

#include "app/VarnelApp.h"
#include "base/PropertyList.h"
#include "host/FileResources.h"
#include "tests/support/DictionaryOf.h"
#include "tests/support/FakeDeviceFiles.h"
#include "tests/support/FakeQueue.h"
#include "tests/support/FakeTelephony.h"
#include "tests/support/MemoryPorts.h"
#include "tests/support/PacketBuilder.h"
#include "tests/support/RecordingLog.h"
#include "tests/support/RecordingPreferences.h"
#include "tests/support/TestServices.h"
#include "tests/support/TestWidgets.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;
using testing::SizeIs;

constexpr std::string_view channel = "com.orvane.BasebandStateReport.LogChannel";
constexpr const char* marker = "/OrvaneInternal/Library/PreferenceBundles/Carrier Settings.bundle";

// The whole application on real widgets, with a telephony service that the test controls.
class ScreensTest : public testing::TestWithParam<std::pair<int, int>> {
 protected:
  ScreensTest() {
    host.resources.add(
        "LTE", dictionaryOf({{"PDP Context Info", Value::ofArray()},
                             {"Connected Mode Intra-Frequency Measurement Results", Value::ofDictionary()}}));
    const FileResources resources(resourceFolder());
    host.resources.add("VarnelSaveViewController", resources.propertyList("VarnelSaveViewController"));
    host.clock.set({1709294709, 0});
    files.existing.insert(marker);
    ports.answer = [](const MemoryPorts::Request&) {
      return RemotePort::SendResult{0, writeXmlPropertyList(dictionaryOf({{"GetTechnology", "kalvi-lte"}}))};
    };
    userInterface.setRecordSource({[this](const NamePath& list) { return app.hasRecordsAt(list); },
                                   [this](const NamePath& list) { return app.recordsAt(list); }});
    app.applicationDidFinishLaunching();
    window().setGeometry(0, 0, GetParam().first, GetParam().second);
    EXPECT_TRUE(QTest::qWaitForWindowActive(&window(), patience_ms));
    queue.run();
    receive("internet");
  }
  void receive(const std::string& apn) { receiveAll({apn}); }
  void receiveAll(const std::vector<std::string>& apns) {
    const Value list = Value::ofArray();
    for (const std::string& apn : apns)
      list.array()->push_back(dictionaryOf({{"APN", apn}, {"State", "Active"}}));
    ports.deliver(channel, 0, serverMessage(0xFF0002, list));
    queue.advance(2s);
    QCoreApplication::processEvents();
  }
  void press(Qt::Key key, Qt::KeyboardModifiers modifiers = Qt::NoModifier) {
    QTest::keyClick(QApplication::focusWidget(), key, modifiers);
    QCoreApplication::processEvents();
  }
  WindowWidget& window() { return static_cast<WindowWidget&>(*app.window()); }
  NavigationWidget& stack() { return *window().stack(); }
  PaneWidget& pane() { return stack().topPane(); }
  std::vector<std::string> descriptions() {
    std::vector<std::string> all;
    for (const RowWidget* row : pane().tableWidget().visibleRows())
      all.push_back(row->description().toStdString());
    return all;
  }
  // Whether something is painted in the last column of the row's content.
  static bool touchesItsEdge(RowWidget& row) {
    const QImage picture = row.grab().toImage();
    const int x = static_cast<int>(row.contentBounds().width) - 1;
    for (int y = 5; y < 45; ++y) {
      if (picture.pixelColor(x, y) != picture.pixelColor(2, 2)) return true;
    }
    return false;
  }

  RecordingLog log;
  TestServices host;
  FakeQueue queue;
  MemoryPorts ports;
  FakeTelephony telephony;
  FakeDeviceFiles files;
  RecordingPreferences preferences;
  WidgetUserInterface userInterface{{.startOver = [this] { app.startOver(); }}};
  VarnelApp app{
      {{ports, telephony, queue, host.services, writeXmlPropertyList}, files, preferences, userInterface}};
};

TEST_P(ScreensTest, ThePaneFillsTheWindowAndNothingIsCut) {
  EXPECT_EQ(pane().size(), window().size());
  for (RowWidget* row : pane().tableWidget().visibleRows())
    EXPECT_TRUE(row->sidewaysRange() > 0 || !touchesItsEdge(*row)) << row->description().toStdString();
  for (const QLabel* label : pane().findChildren<QLabel*>())
    EXPECT_GE(label->width(), label->fontMetrics().horizontalAdvance(label->text()))
        << label->text().toStdString();
}

TEST_P(ScreensTest, WhatDoesNotFitCanBeScrolledIntoView) {
  RowWidget& row = *pane().tableWidget().visibleRows().at(1);
  ASSERT_EQ(row.description(), "Connected Mode Intra-Frequency Measurement Results");
  EXPECT_EQ(row.sidewaysRange() > 0, GetParam().first == 360);
  if (row.sidewaysRange() == 0) return;
  EXPECT_TRUE(row.reachesPastItsEdge());
  press(Qt::Key_End);
  for (int i = 0; i < 10; ++i) press(Qt::Key_Right, Qt::ShiftModifier);
  EXPECT_EQ(row.sidewaysPosition(), row.sidewaysRange());
}

TEST_P(ScreensTest, KeysOpenPanesAndComeBack) {
  press(Qt::Key_Down);
  press(Qt::Key_Return);
  EXPECT_THAT(stack().controllers(), SizeIs(2));
  EXPECT_EQ(pane().header().title(), "PDP Context Info");
  press(Qt::Key_Escape);
  EXPECT_THAT(stack().controllers(), SizeIs(1));
  press(Qt::Key_Right);
  EXPECT_THAT(stack().controllers(), SizeIs(2)) << "the row is still the current one";
}

TEST_P(ScreensTest, ARefreshOfAnOpenPaneShowsTheNewValueInTheSameRow) {
  press(Qt::Key_Down);
  press(Qt::Key_Return);
  press(Qt::Key_Down);
  press(Qt::Key_Return);
  const auto rows = pane().tableWidget().visibleRows();
  EXPECT_THAT(descriptions(), testing::Contains("APN: internet"));
  press(Qt::Key_Down);
  receive("ims");
  EXPECT_THAT(descriptions(), testing::Contains("APN: ims"));
  EXPECT_EQ(pane().tableWidget().visibleRows(), rows);
  EXPECT_TRUE(rows.front()->emphasis().isSelected);
}

TEST_P(ScreensTest, OnlyAListOfRecordsIsOfferedAsATable) {
  EXPECT_FALSE(stack().toggleRecordTable()) << "these rows are sections";
  press(Qt::Key_Down);
  press(Qt::Key_Return);
  EXPECT_TRUE(pane().offersRecords());
  press(Qt::Key_Down);
  press(Qt::Key_Return);
  EXPECT_FALSE(pane().offersRecords()) << "these rows are leaves";
}

TEST_P(ScreensTest, AListAsATableHasColumnsAndIsRefreshed) {
  press(Qt::Key_Down);
  press(Qt::Key_Return);
  auto* const button = pane().header().findChildren<TextButton*>().last();
  ASSERT_TRUE(button->isVisible());
  QTest::mouseClick(button, Qt::LeftButton);
  RecordTableWidget* const table = pane().recordTable();
  ASSERT_NE(table, nullptr);
  EXPECT_TRUE(table->isVisible());
  EXPECT_FALSE(pane().tableWidget().isVisible());
  EXPECT_EQ(table->model()->headerData(1, Qt::Horizontal), "APN");
  EXPECT_EQ(table->model()->index(0, 1).data(), "internet");
  receiveAll({"ims", "internet"});
  EXPECT_EQ(pane().recordTable(), table);
  EXPECT_EQ(table->model()->rowCount(), 2);
  EXPECT_EQ(table->model()->index(0, 1).data(), "ims");
  EXPECT_THAT(stack().controllers(), SizeIs(2)) << "the pane stays on the stack";
  QTest::mouseClick(button, Qt::LeftButton);
  EXPECT_EQ(pane().recordTable(), nullptr);
  EXPECT_THAT(descriptions(), testing::ElementsAre("0", "1"));
}

TEST_P(ScreensTest, EnterInTheTableOpensTheRecordAndEscapeComesBackToTheRows) {
  receiveAll({"ims", "internet"});
  press(Qt::Key_Down);
  press(Qt::Key_Return);
  ASSERT_TRUE(stack().toggleRecordTable());
  press(Qt::Key_End);
  EXPECT_THAT(stack().pathOfFocus(), testing::ElementsAre("PDP Context Info", "1"));
  press(Qt::Key_Return);
  EXPECT_THAT(stack().controllers(), SizeIs(3));
  EXPECT_THAT(descriptions(), testing::Contains("APN: internet"));
  press(Qt::Key_Escape);
  EXPECT_THAT(stack().controllers(), SizeIs(2));
  ASSERT_NE(pane().recordTable(), nullptr) << "the list is still a table";
  press(Qt::Key_Escape);
  EXPECT_EQ(pane().recordTable(), nullptr);
  EXPECT_THAT(stack().controllers(), SizeIs(2));
  EXPECT_TRUE(pane().tableWidget().visibleRows().at(1)->emphasis().isSelected);
  press(Qt::Key_Escape);
  EXPECT_THAT(stack().controllers(), SizeIs(1));
}

TEST_P(ScreensTest, ATableBesideTheTopPaneIsRefreshedAndOpensOtherRecords) {
  receiveAll({"ims", "internet"});
  press(Qt::Key_Down);
  press(Qt::Key_Return);
  stack().toggleRecordTable();
  press(Qt::Key_Home);
  press(Qt::Key_Return);
  PaneWidget* const beside = stack().paneBeside();
  EXPECT_EQ(beside != nullptr, GetParam().first >= 900);
  if (!beside) return;
  RecordTableWidget& table = *beside->recordTable();
  receiveAll({"ims", "internet", "mms"});
  EXPECT_EQ(table.model()->rowCount(), 3);
  const QModelIndex third = table.model()->index(2, 1);
  QTest::mouseClick(table.viewport(), Qt::LeftButton, {}, table.visualRect(third).center());
  EXPECT_THAT(stack().controllers(), SizeIs(3));
  EXPECT_THAT(descriptions(), testing::Contains("APN: mms"));
  EXPECT_TRUE(third.data(Qt::FontRole).value<QFont>().bold());
}

TEST_P(ScreensTest, ControlSOpensTheSaveScreenAndSavesOnIt) {
  press(Qt::Key_S, Qt::ControlModifier);
  ASSERT_NE(stack().modalScreen(), nullptr);
  EXPECT_EQ(stack().modalScreen()->size(), window().size());
  QTest::keyClicks(QApplication::focusWidget(), "in the lift");
  press(Qt::Key_S, Qt::ControlModifier);
  queue.run();
  EXPECT_EQ(stack().modalScreen(), nullptr);
  ASSERT_THAT(files.writes, SizeIs(1));
}

TEST_P(ScreensTest, ControlRStartsOverAtTheEmptyRoot) {
  press(Qt::Key_Down);
  press(Qt::Key_Return);
  press(Qt::Key_R, Qt::ControlModifier);
  EXPECT_THAT(stack().controllers(), SizeIs(1));
  EXPECT_TRUE(descriptions().empty());
  queue.run();
  receive("again");
  EXPECT_FALSE(descriptions().empty());
}

TEST_P(ScreensTest, AnotherSectionOnTheLeftTakesThePlaceOfTheOneOnTheRight) {
  press(Qt::Key_Down);
  press(Qt::Key_Return);
  PaneWidget* const beside = stack().paneBeside();
  ASSERT_EQ(beside != nullptr, GetParam().first >= 900);
  if (!beside) return;
  RowWidget& other = *beside->tableWidget().visibleRows().at(1);
  QTest::mouseClick(beside->tableWidget().viewport(), Qt::LeftButton, {}, other.geometry().center());
  EXPECT_THAT(stack().controllers(), SizeIs(2));
  EXPECT_EQ(pane().header().title(), "Connected Mode Intra-Frequency Measurement Results");
  EXPECT_TRUE(other.emphasis().isOpen);
  EXPECT_TRUE(pane().toolbar().isVisible());
  EXPECT_FALSE(pane().toolbar().findChild<QLabel*>()->text().isEmpty()) << "the pane has got the status";
  receive("ims");
  EXPECT_TRUE(other.emphasis().isOpen);
}

TEST_P(ScreensTest, ASectionThatGoesIsLeftForTheOneBelow) {
  receiveAll({"ims", "internet"});
  press(Qt::Key_Down);
  press(Qt::Key_Return);
  press(Qt::Key_End);
  press(Qt::Key_Return);
  ASSERT_THAT(stack().controllers(), SizeIs(3));
  receive("ims");
  EXPECT_THAT(stack().controllers(), SizeIs(2));
  EXPECT_EQ(pane().header().title(), "PDP Context Info");
  EXPECT_THAT(descriptions(), testing::ElementsAre("0"));
}

TEST_P(ScreensTest, TheSaveScreenCoversBothPanes) {
  press(Qt::Key_Down);
  press(Qt::Key_Return);
  press(Qt::Key_S, Qt::ControlModifier);
  ASSERT_NE(stack().modalScreen(), nullptr);
  EXPECT_EQ(stack().modalScreen()->size(), window().size());
  EXPECT_TRUE(stack().modalScreen()->isAncestorOf(stack().childAt(200, 300)) ||
              stack().childAt(200, 300) == stack().modalScreen());
  window().resize(1000, 700);
  QCoreApplication::processEvents();
  EXPECT_EQ(stack().modalScreen()->size(), window().size());
  EXPECT_TRUE(stack().modalScreen()->isAncestorOf(QApplication::focusWidget()));
  press(Qt::Key_Escape);
  queue.run();
  EXPECT_EQ(stack().modalScreen(), nullptr);
  EXPECT_NE(stack().paneBeside(), nullptr);
}

INSTANTIATE_TEST_SUITE_P(, ScreensTest,
                         testing::Values(std::pair(360, 640), std::pair(1366, 768), std::pair(1920, 1080)),
                         [](const auto& info) { return "Width" + std::to_string(info.param.first); });

}  // namespace
}  // namespace varnel
