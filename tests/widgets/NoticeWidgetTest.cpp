#include "widgets/NoticeWidget.h"

#include <gtest/gtest.h>

#include <QHelpEvent>
#include <QTimerEvent>
#include <QToolTip>

#include "tests/support/TestWidgets.h"
#include "widgets/SpinnerWidget.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;

class NoticeWidgetTest : public testing::Test {
 protected:
  NoticeWidgetTest() {
    window.setRoot(stack);
    window.makeKeyAndVisible();
    stack.showToolbar();
    EXPECT_TRUE(QTest::qWaitForWindowActive(&window));
  }
  void tell(std::string_view text) {
    stack.setNotice(text);
    QCoreApplication::processEvents();
  }
  static NoticeWidget& noticeOf(TestController& controller) { return controller.widget().notice(); }

  std::vector<std::string> events;
  std::shared_ptr<TestController> root = std::make_shared<TestController>("Root", events);
  NavigationWidget stack{root};
  WindowWidget window{{0, 0, 360, 640}, {}};
};

TEST_F(NoticeWidgetTest, TakesNoRoomWhileThereIsNothingToTell) {
  PaneWidget& pane = root->widget();
  EXPECT_FALSE(noticeOf(*root).isVisible());
  EXPECT_EQ(pane.tableWidget().y(), pane.header().height());
  tell("No server");
  tell("");
  EXPECT_FALSE(noticeOf(*root).isVisible());
  EXPECT_EQ(pane.tableWidget().y(), pane.header().height());
}

TEST_F(NoticeWidgetTest, StandsBetweenTitleAndTableAndLeavesTheRestWhereItIs) {
  PaneWidget& pane = root->widget();
  const QRect header = pane.header().geometry(), toolbar = pane.toolbar().geometry();
  tell("No server");
  const QRect notice = noticeOf(*root).geometry();
  EXPECT_EQ(pane.geometry(), QRect(0, 0, 360, 640));
  EXPECT_EQ(pane.header().geometry(), header);
  EXPECT_EQ(pane.toolbar().geometry(), toolbar);
  EXPECT_EQ(notice.topLeft(), QPoint(0, header.height()));
  EXPECT_EQ(notice.width(), 360);
  EXPECT_EQ(pane.tableWidget().y(), notice.bottom() + 1);
}

TEST_F(NoticeWidgetTest, ALongFirstNoticeHasAllItsLines) {
  tell(
      "No telephony server serves in /run/user/1000/varnel; start varnel-telephonyd, or name its folder with "
      "--runtime-dir");
  const NoticeWidget& notice = noticeOf(*root);
  EXPECT_EQ(notice.height(), notice.heightForWidth(360));
  EXPECT_EQ(notice.y(), root->widget().header().height());
}

TEST_F(NoticeWidgetTest, IsAsHighAsItsTextEvenWithoutBlanks) {
  tell("Saved: /a");
  const int oneLine = noticeOf(*root).height();
  tell("Saved: /" + std::string(200, 'a'));
  EXPECT_GT(noticeOf(*root).height(), 2 * oneLine);
  EXPECT_EQ(noticeOf(*root).width(), 360);
  tell("Saved: /a\nMessages too long: 1");
  EXPECT_GT(noticeOf(*root).height(), oneLine);
}

TEST_F(NoticeWidgetTest, IsDescribedToScreenReaders) {
  tell("No server");
  EXPECT_EQ(noticeOf(*root).accessibleName(), "Notice");
  EXPECT_EQ(noticeOf(*root).accessibleDescription(), "No server");
}

TEST_F(NoticeWidgetTest, StandsOnWhicheverPaneIsOnTop) {
  tell("No server");
  const auto next = std::make_shared<TestController>("Next", events);
  stack.push(next, Animation::None);
  EXPECT_EQ(noticeOf(*next).text(), "No server");
  EXPECT_TRUE(noticeOf(*next).isVisible());
  tell("");
  stack.popTo(*root, Animation::None);
  EXPECT_FALSE(noticeOf(*root).isVisible());
}

TEST_F(NoticeWidgetTest, ANoticeThatIsCutHasATooltip) {
  const auto ask = [this] {
    NoticeWidget& notice = noticeOf(*root);
    QHelpEvent question(QEvent::ToolTip, QPoint(5, 5), notice.mapToGlobal(QPoint(5, 5)));
    QApplication::sendEvent(&notice, &question);
    return QToolTip::text();
  };
  tell("No server");
  EXPECT_EQ(ask(), "");
  std::string lines = "No server";
  for (int i = 0; i < 60; ++i) lines += "\nMore";
  tell(lines);
  EXPECT_TRUE(ask().contains("No server"));
  QToolTip::hideText();
}

TEST_F(NoticeWidgetTest, OnlyTheTopOfTwoPanesShowsIt) {
  window.resize(1000, 640);
  tell("No server");
  const auto next = std::make_shared<TestController>("Next", events);
  stack.push(next, Animation::None);
  EXPECT_FALSE(noticeOf(*root).isVisible());
  EXPECT_TRUE(noticeOf(*next).isVisible());
}

TEST_F(NoticeWidgetTest, TheTitleOfTheWindowIsOneLine) {
  window.setTitle("Serving\nCell — kalvi-lte — Varnel");
  EXPECT_EQ(window.windowTitle(), "Serving Cell — kalvi-lte — Varnel");
}

// On an invisible screen the wheel's timer does not run, and its number is 0. The test sends the timer's
// events itself.
TEST(SpinnerWidget, AfterThreeTurnsItShowsOnePictureInTwoSeconds) {
  SpinnerWidget spinner;
  spinner.setAnimating(true);
  const auto showPictures = [&](int count) {
    for (int i = 0; i < count; ++i) {
      QTimerEvent picture(0);
      QCoreApplication::sendEvent(&spinner, &picture);
    }
  };
  showPictures(35);
  EXPECT_EQ(spinner.timeOfPicture(), 83ms);
  showPictures(1);
  EXPECT_EQ(spinner.timeOfPicture(), 2000ms);
  spinner.setAnimating(false);
  spinner.setAnimating(true);
  EXPECT_EQ(spinner.timeOfPicture(), 83ms);
}

}  // namespace
}  // namespace varnel
