#include "widgets/NavigationWidget.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tests/support/TestWidgets.h"

namespace varnel {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testing::SizeIs;

class RecordingDelegate : public NavigationStackDelegate {
 public:
  explicit RecordingDelegate(std::vector<std::string>& events) : _events(events) {}
  void navigationController_willShowViewController_animated(NavigationStack& stack,
                                                            PaneController& controller, Animation) override {
    EXPECT_EQ(stack.topController().get(), &controller);
    _events.push_back("delegate told of " + static_cast<TestController&>(controller).name());
  }

 private:
  std::vector<std::string>& _events;
};

class NavigationWidgetTest : public testing::Test {
 protected:
  NavigationWidgetTest() {
    stack.setDelegate(&delegate);
    window.setRoot(stack);
    window.makeKeyAndVisible();
    EXPECT_TRUE(QTest::qWaitForWindowActive(&window, patience_ms));
  }
  std::shared_ptr<TestController> push(const std::string& name) {
    auto controller = std::make_shared<TestController>(name, events);
    stack.push(controller, Animation::Animated);
    return controller;
  }
  void press(Qt::Key key, Qt::KeyboardModifiers modifiers = Qt::NoModifier) {
    QTest::keyClick(QApplication::focusWidget(), key, modifiers);
  }
  TextButton& backButton(TestController& controller) {
    return *controller.widget().header().findChild<TextButton*>();
  }

  std::vector<std::string> events;
  RecordingDelegate delegate{events};
  std::shared_ptr<TestController> root = std::make_shared<TestController>("Root", events);
  NavigationWidget stack{root};
  WindowWidget window{{0, 0, 360, 640}, {}};
};

TEST_F(NavigationWidgetTest, TheRootAppearsWithTheWindowWithoutTheDelegate) {
  EXPECT_THAT(events, ElementsAre("Root will appear"));
  EXPECT_EQ(root->navigationController(), &stack);
  EXPECT_TRUE(root->widget().isVisible());
  EXPECT_EQ(root->widget().size(), QSize(360, 640));
}

TEST_F(NavigationWidgetTest, APushCallsTheFormerTopThenTheNewOneThenTheDelegate) {
  events.clear();
  const auto next = push("Next");
  EXPECT_THAT(events, ElementsAre("Root will disappear", "Next will appear", "delegate told of Next"));
  EXPECT_THAT(stack.controllers(), SizeIs(2));
  EXPECT_EQ(next->navigationController(), &stack);
  EXPECT_TRUE(next->widget().isVisible());
  EXPECT_FALSE(root->widget().isVisible());
}

TEST_F(NavigationWidgetTest, APopOfSeveralCallsTheFormerTopAndTheNewOne) {
  push("A");
  const auto top = push("B");
  events.clear();
  stack.popTo(*root, Animation::Animated);
  EXPECT_THAT(events, ElementsAre("B will disappear", "Root will appear", "delegate told of Root"));
  EXPECT_EQ(top->navigationController(), nullptr);
  EXPECT_TRUE(root->widget().isVisible());
  stack.popTo(*root, Animation::Animated);
  EXPECT_THAT(events, SizeIs(3)) << "nothing happens when it is on top";
}

TEST_F(NavigationWidgetTest, APoppedPaneMakesNoMoreCalls) {
  const auto next = push("Next");
  TestRows rows(leaves(3));
  next->widget().table().setDelegate(&rows);
  unsigned presses = 0;
  next->widget().setToolbarItems({BarButton{BarButton::SystemItem::Save, [&] { ++presses; }}},
                                 Animation::None);
  stack.popTo(*root, Animation::None);
  next->widget().tableWidget().chooseRow(1);
  next->widget().toolbar().press(BarButton::SystemItem::Save);
  EXPECT_THAT(rows.chosen, IsEmpty());
  EXPECT_EQ(presses, 0u);
}

TEST_F(NavigationWidgetTest, TheBackButtonNamesTheParentAndLeadsToIt) {
  const auto next = push("Next");
  TextButton& back = backButton(*next);
  EXPECT_TRUE(back.isVisible());
  EXPECT_EQ(back.text(), "Root");
  EXPECT_EQ(back.accessibleName(), "Back to Root");
  QTest::mouseClick(&back, Qt::LeftButton);
  EXPECT_THAT(stack.controllers(), ElementsAre(root));
  EXPECT_FALSE(backButton(*root).isVisible()) << "there is no way back from the root";
}

TEST_F(NavigationWidgetTest, TheBackButtonFollowsTheParentsTitle) {
  const auto next = push("Next");
  root->pane().setTitle("Renamed & more");
  EXPECT_EQ(backButton(*next).text(), "Renamed & more");
}

TEST_F(NavigationWidgetTest, EscapeLeftAndBackspaceGoBack) {
  for (const Qt::Key key : {Qt::Key_Escape, Qt::Key_Left, Qt::Key_Backspace}) {
    push("Next");
    press(key);
    EXPECT_THAT(stack.controllers(), ElementsAre(root)) << key;
  }
  press(Qt::Key_Escape);
  EXPECT_THAT(stack.controllers(), ElementsAre(root));
}

TEST_F(NavigationWidgetTest, TheKeyboardIsWithTheTopPanesTable) {
  EXPECT_EQ(QApplication::focusWidget(), &root->widget().tableWidget());
  const auto next = push("Next");
  EXPECT_EQ(QApplication::focusWidget(), &next->widget().tableWidget());
  stack.popTo(*root, Animation::None);
  EXPECT_EQ(QApplication::focusWidget(), &root->widget().tableWidget());
}

TEST_F(NavigationWidgetTest, TabGoesFromTheTableToSaveToTheWayBack) {
  const auto next = push("Next");
  stack.showToolbar();
  next->widget().setToolbarItems({FlexibleSpace{}, BarButton{}}, Animation::None);
  QCoreApplication::processEvents();
  press(Qt::Key_Tab);
  EXPECT_EQ(QApplication::focusWidget(), next->widget().toolbar().findChild<TextButton*>());
  press(Qt::Key_Tab);
  EXPECT_EQ(QApplication::focusWidget(), &backButton(*next));
  press(Qt::Key_Tab);
  EXPECT_EQ(QApplication::focusWidget(), &next->widget().tableWidget());
}

TEST_F(NavigationWidgetTest, TheToolbarIsHiddenUntilItIsAskedFor) {
  EXPECT_FALSE(root->widget().toolbar().isVisible());
  stack.showToolbar();
  EXPECT_TRUE(root->widget().toolbar().isVisible());
  EXPECT_TRUE(push("Next")->widget().toolbar().isVisible());
}

TEST_F(NavigationWidgetTest, ControlSPressesSaveWhereItIsOffered) {
  press(Qt::Key_S, Qt::ControlModifier);
  unsigned presses = 0;
  root->widget().setToolbarItems({BarButton{BarButton::SystemItem::Save, [&] { ++presses; }}},
                                 Animation::None);
  press(Qt::Key_S, Qt::ControlModifier);
  EXPECT_EQ(presses, 1u);
}

TEST_F(NavigationWidgetTest, WindowAndStackMayGoInEitherOrder) {
  auto inner = std::make_shared<TestController>("Inner", events);
  auto other = std::make_unique<NavigationWidget>(inner);
  auto first = std::make_unique<WindowWidget>(Rect{0, 0, 100, 100}, WindowWidget::Wishes{});
  first->setRoot(*other);
  first->makeKeyAndVisible();
  first.reset();
  auto second = std::make_unique<WindowWidget>(Rect{0, 0, 100, 100}, WindowWidget::Wishes{});
  second->setRoot(*other);
  second->makeKeyAndVisible();
  other.reset();
  EXPECT_EQ(inner->navigationController(), nullptr);
  EXPECT_EQ(inner->widget().parentWidget(), nullptr);
}

TEST_F(NavigationWidgetTest, ControlRStartsOver) {
  unsigned starts = 0;
  WindowWidget other({0, 0, 360, 640}, {.startOver = [&] { ++starts; }});
  other.setRoot(stack);
  other.makeKeyAndVisible();
  ASSERT_TRUE(QTest::qWaitForWindowActive(&other, patience_ms));
  press(Qt::Key_R, Qt::ControlModifier);
  EXPECT_EQ(starts, 1u);
}

TEST_F(NavigationWidgetTest, ClosingTheWindowIsTold) {
  unsigned closings = 0;
  WindowWidget other({0, 0, 360, 640}, {.close = [&] { ++closings; }});
  other.makeKeyAndVisible();
  other.hide();
  EXPECT_EQ(closings, 0u) << "taking it off the screen is no wish of the user";
  other.makeKeyAndVisible();
  other.close();
  EXPECT_EQ(closings, 1u);
}

}  // namespace
}  // namespace varnel
