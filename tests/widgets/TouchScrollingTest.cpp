#include "widgets/TouchScrolling.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <QContextMenuEvent>
#include <QScrollBar>
#include <chrono>

#include "tests/support/Finger.h"
#include "tests/support/TestWidgets.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::IsEmpty;

// The wishes for a menu that reach the widget, and their places in it.
class MenuWishes : public QObject {
 public:
  bool eventFilter(QObject*, QEvent* event) override {
    if (event->type() == QEvent::ContextMenu) places.push_back(static_cast<QContextMenuEvent&>(*event).pos());
    return false;
  }
  std::vector<QPoint> places;
};

class TouchScrollingTest : public testing::Test {
 protected:
  TouchScrollingTest() {
    table.resize(360, 400);
    table.setDelegate(&delegate);
    table.show();
    EXPECT_TRUE(QTest::qWaitForWindowExposed(&table, patience_ms));
  }
  TestRows delegate{leaves(100, std::string(200, 'x'))};
  TableWidget table;
  Finger finger{*table.viewport()};
};

TEST_F(TouchScrollingTest, AFingerUpScrollsTheTableDown) {
  finger.drag({100, 350}, {100, 150});
  EXPECT_GT(table.verticalScrollBar()->value(), 100);
  EXPECT_THAT(delegate.chosen, IsEmpty());
  for (const RowWidget* row : table.visibleRows()) EXPECT_EQ(row->sidewaysPosition(), 0);
}

TEST_F(TouchScrollingTest, AFingerSidewaysScrollsItsRowOnly) {
  finger.drag({300, 75}, {100, 80});
  EXPECT_GT(table.visibleRows().at(1)->sidewaysPosition(), 100);
  EXPECT_EQ(table.visibleRows().at(0)->sidewaysPosition(), 0);
  EXPECT_EQ(table.verticalScrollBar()->value(), 0);
  EXPECT_THAT(delegate.chosen, IsEmpty());
}

TEST_F(TouchScrollingTest, AFingerThatRestsAsksForTheMenuOfItsRow) {
  MenuWishes wishes;
  table.installEventFilter(&wishes);
  Finger::restAfter(100ms);
  finger.press({100, 125});
  EXPECT_TRUE(QTest::qWaitFor([&] { return !wishes.places.empty(); }, patience_ms));
  EXPECT_THAT(wishes.places, ElementsAre(QPoint(100, 125)));
  EXPECT_EQ(table.currentRow()->row(), 2u);
  EXPECT_TRUE(table.currentRow()->emphasis().hasFocusFrame);
  finger.release({100, 125});
  QTest::qWait(20);
  EXPECT_THAT(delegate.chosen, IsEmpty()) << "it was no tap";
}

TEST_F(TouchScrollingTest, AFingerThatMovesAsksForNoMenu) {
  MenuWishes wishes;
  table.installEventFilter(&wishes);
  Finger::restAfter(50ms);
  finger.press({100, 125});
  finger.move({100, 325});
  QTest::qWait(200);
  EXPECT_THAT(wishes.places, IsEmpty());
}

TEST_F(TouchScrollingTest, ATapChoosesItsRowOnce) {
  finger.press({100, 125});
  finger.release({101, 126});
  EXPECT_TRUE(QTest::qWaitFor([&] { return !delegate.chosen.empty(); }, patience_ms));
  QTest::qWait(20);
  EXPECT_THAT(delegate.chosen, ElementsAre(2));
}

}  // namespace
}  // namespace varnel
