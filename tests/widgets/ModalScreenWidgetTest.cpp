#include "widgets/ModalScreenWidget.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "base/PropertyList.h"
#include "host/FileResources.h"
#include "tests/support/TestWidgets.h"

namespace varnel {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

class TestModal : public ModalController, public TextFieldDelegate {
 public:
  TestModal() : _screen(layout(), [this](std::string_view action) { events.emplace_back(action); }) {
    _screen.table("saveContentTable")->setDelegate(&rows);
  }
  static ScreenLayout layout() {
    using Kind = ScreenElement::Kind;
    return {.rows = {{{Kind::Button, "", "Cancel", "cancelPressed:"},
                      {Kind::Space},
                      {Kind::Button, "", "Save", "savePressed:"}},
                     {{Kind::TextField, "saveDescription", "Description"}},
                     {{Kind::Table, "saveContentTable"}}},
            .margin = 10,
            .spacing = 10,
            .backgroundAction = "backgroundTouched:"};
  }
  ModalScreenWidget& screen() override { return _screen; }
  void viewDidLoad() override {
    events.emplace_back("did load");
    _screen.textField("saveDescription")->setDelegate(this);
    _screen.table("saveContentTable")->sizeToFit();
  }
  void viewWillAppear(Animation) override {
    events.emplace_back("will appear");
    _screen.setFrame({0, 0, 360, 640});
  }
  bool textFieldShouldReturn(TextField& field) override {
    events.emplace_back("return");
    field.resignFirstResponder();
    return true;
  }

  std::vector<std::string> events;
  TestRows rows{{{"Display 1", ""}, {"Display 2", ""}}};

 private:
  ModalScreenWidget _screen;
};

class ModalScreenWidgetTest : public testing::Test {
 protected:
  ModalScreenWidgetTest() {
    window.setRoot(stack);
    window.makeKeyAndVisible();
    EXPECT_TRUE(QTest::qWaitForWindowActive(&window, patience_ms));
    stack.present(modal, Animation::Animated);
    QCoreApplication::processEvents();
  }
  TextFieldWidget& field() {
    return *static_cast<TextFieldWidget*>(modal->screen().textField("saveDescription"));
  }
  TableWidget& table() { return *static_cast<TableWidget*>(modal->screen().table("saveContentTable")); }
  TextButton& button(const QString& title) {
    for (auto* each : modal->screen().findChildren<QAbstractButton*>()) {
      if (each->text() == title) return *static_cast<TextButton*>(each);
    }
    throw std::logic_error("no such button");
  }
  void press(Qt::Key key, Qt::KeyboardModifiers modifiers = Qt::NoModifier) {
    QTest::keyClick(QApplication::focusWidget(), key, modifiers);
  }

  std::vector<std::string> events;
  std::shared_ptr<TestController> root = std::make_shared<TestController>("Root", events);
  std::shared_ptr<TestModal> modal = std::make_shared<TestModal>();
  NavigationWidget stack{root};
  WindowWidget window{{0, 0, 360, 640}, {}};
};

TEST_F(ModalScreenWidgetTest, ItLoadsThenAppearsAndCoversTheStack) {
  EXPECT_THAT(modal->events, ElementsAre("did load", "will appear"));
  EXPECT_TRUE(modal->screen().isVisible());
  EXPECT_EQ(modal->screen().geometry(), QRect(0, 0, 360, 640));
}

TEST_F(ModalScreenWidgetTest, RowsStandInTheirOrder) {
  EXPECT_LT(button("Cancel").x(), button("Save").x());
  EXPECT_EQ(button("Cancel").y(), button("Save").y());
  EXPECT_EQ(field().y(), button("Save").geometry().bottom() + 11);
  EXPECT_EQ(field().width(), 340);
  EXPECT_EQ(table().width(), 340);
  EXPECT_EQ(table().height(), 100) << "sized to its two rows";
}

TEST_F(ModalScreenWidgetTest, OnALargeScreenRowsKeepAWidthThatReadsWell) {
  window.resize(1920, 1080);
  QCoreApplication::processEvents();
  EXPECT_EQ(modal->screen().size(), QSize(1920, 1080));
  EXPECT_EQ(field().width(), 640);
  EXPECT_EQ(field().mapTo(&window, QPoint()).x(), 640);
}

TEST_F(ModalScreenWidgetTest, ButtonsAndBackgroundCallTheirOperations) {
  modal->events.clear();
  QTest::mouseClick(&button("Save"), Qt::LeftButton);
  QTest::mouseClick(&button("Cancel"), Qt::LeftButton);
  QTest::mouseClick(&modal->screen(), Qt::LeftButton, {}, {180, 600});
  EXPECT_THAT(modal->events, ElementsAre("savePressed:", "cancelPressed:", "backgroundTouched:"));
}

TEST_F(ModalScreenWidgetTest, TheFieldHasTheKeyboardAndItsTextIsThere) {
  EXPECT_EQ(QApplication::focusWidget(), &field());
  EXPECT_EQ(field().text(), "");
  QTest::keyClicks(&field(), "in the lift");
  EXPECT_EQ(field().text(), "in the lift");
  EXPECT_EQ(field().placeholderText(), "Description");
}

TEST_F(ModalScreenWidgetTest, ReturnGivesTheKeyboardAway) {
  press(Qt::Key_Return);
  EXPECT_EQ(modal->events.back(), "return");
  EXPECT_FALSE(field().hasFocus());
}

TEST_F(ModalScreenWidgetTest, ControlSSavesAndEscapeCancelsAlsoWithoutTheField) {
  modal->events.clear();
  press(Qt::Key_S, Qt::ControlModifier);
  press(Qt::Key_Escape);
  EXPECT_THAT(modal->events, ElementsAre("savePressed:", "cancelPressed:"));
  field().resignFirstResponder();
  press(Qt::Key_S, Qt::ControlModifier);
  EXPECT_EQ(modal->events.back(), "savePressed:");
}

TEST_F(ModalScreenWidgetTest, TabStaysOnTheScreen) {
  std::vector<QWidget*> visited;
  for (int i = 0; i < 4; ++i) {
    press(Qt::Key_Tab);
    visited.push_back(QApplication::focusWidget());
  }
  EXPECT_THAT(visited, ElementsAre(&table(), &button("Cancel"), &button("Save"), &field()));
}

TEST_F(ModalScreenWidgetTest, DismissedItCallsNothingAndTheStackHasTheKeyboard) {
  stack.dismiss(Animation::Animated);
  modal->events.clear();
  button("Save").click();
  EXPECT_THAT(modal->events, IsEmpty());
  EXPECT_FALSE(modal->screen().isVisible());
  EXPECT_EQ(QApplication::focusWidget(), &root->widget().tableWidget());
  stack.dismiss(Animation::Animated);
}

TEST_F(ModalScreenWidgetTest, TheStackKeepsTheControllerUntilItIsOff) {
  const std::weak_ptr<TestModal> weak = modal;
  modal.reset();
  EXPECT_FALSE(weak.expired());
  stack.dismiss(Animation::None);
  EXPECT_TRUE(QTest::qWaitFor([&] { return weak.expired(); }, patience_ms));
}

TEST_F(ModalScreenWidgetTest, UnknownOutletsAreNull) {
  EXPECT_EQ(modal->screen().table("saveDescription"), nullptr);
  EXPECT_EQ(modal->screen().textField("nothing"), nullptr);
}

}  // namespace
}  // namespace varnel
