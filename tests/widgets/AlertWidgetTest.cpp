#include "widgets/AlertWidget.h"

#include <gtest/gtest.h>

#include <QLabel>

#include "tests/support/TestWidgets.h"

namespace varnel {
namespace {

class AlertWidgetTest : public testing::Test {
 protected:
  AlertWidgetTest() {
    window = userInterface.makeWindow({0, 0, 360, 640});
    window->setRoot(stack);
    window->makeKeyAndVisible();
    EXPECT_TRUE(QTest::qWaitForWindowActive(&widget(), patience_ms));
  }
  WindowWidget& widget() { return static_cast<WindowWidget&>(*window); }
  void show(const std::string& title = "File Error") {
    userInterface.showAlert({title, "Unable to write file to disk", "Close"});
    QCoreApplication::processEvents();
  }
  // The newest alert; null when there is none.
  AlertWidget* alert() { return dynamic_cast<AlertWidget*>(widget().children().last()); }

  std::vector<std::string> events;
  std::shared_ptr<TestController> root = std::make_shared<TestController>("Root", events);
  WidgetUserInterface userInterface{{}};
  NavigationWidget stack{root};
  std::unique_ptr<Window> window;
};

TEST_F(AlertWidgetTest, ItShowsItsTextsWholeAndItsButton) {
  show();
  const auto labels = alert()->findChildren<QLabel*>();
  ASSERT_EQ(labels.size(), 2);
  EXPECT_EQ(labels[0]->text(), "File Error");
  EXPECT_EQ(labels[1]->text(), "Unable to write file to disk");
  for (const QLabel* label : labels) EXPECT_GE(label->height(), label->heightForWidth(label->width()));
  EXPECT_EQ(alert()->button().text(), "Close");
}

TEST_F(AlertWidgetTest, ItCoversTheWindowAlsoWhenThatGrows) {
  show();
  EXPECT_EQ(alert()->size(), QSize(360, 640));
  widget().resize(800, 600);
  QCoreApplication::processEvents();
  EXPECT_EQ(alert()->size(), QSize(800, 600));
}

TEST_F(AlertWidgetTest, ButtonReturnAndEscapeCloseIt) {
  show();
  QTest::mouseClick(&alert()->button(), Qt::LeftButton);
  EXPECT_EQ(alert(), nullptr);
  for (const Qt::Key key : {Qt::Key_Return, Qt::Key_Escape}) {
    show();
    QTest::keyClick(QApplication::focusWidget(), key);
    EXPECT_EQ(alert(), nullptr);
  }
  EXPECT_EQ(QApplication::focusWidget(), &root->widget().tableWidget());
}

TEST_F(AlertWidgetTest, ItStaysOnTopAndKeepsTheKeyboardWhateverHappensBelow) {
  show();
  stack.push(std::make_shared<TestController>("Next", events), Animation::None);
  EXPECT_EQ(QApplication::focusWidget(), &alert()->button());
  QTest::keyClick(QApplication::focusWidget(), Qt::Key_Backspace);
  EXPECT_EQ(stack.controllers().size(), 2u) << "keys do not go through";
  QTest::mouseClick(alert(), Qt::LeftButton, {}, {10, 10});
  ASSERT_NE(alert(), nullptr);
  QTest::keyClick(QApplication::focusWidget(), Qt::Key_Tab);
  EXPECT_EQ(QApplication::focusWidget(), &alert()->button());
}

TEST_F(AlertWidgetTest, OfSeveralTheLastIsOnTop) {
  show("First");
  show("Second");
  EXPECT_EQ(alert()->accessibleName(), "Second");
  EXPECT_EQ(QApplication::focusWidget(), &alert()->button());
  QTest::keyClick(QApplication::focusWidget(), Qt::Key_Escape);
  ASSERT_NE(alert(), nullptr);
  EXPECT_EQ(alert()->accessibleName(), "First");
  EXPECT_EQ(QApplication::focusWidget(), &alert()->button());
}

}  // namespace
}  // namespace varnel
