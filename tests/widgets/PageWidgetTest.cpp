#include "widgets/PageWidget.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <QApplication>
#include <QLineEdit>
#include <QTest>

#include "platform/ui/UserInterface.h"
#include "tests/support/TestWidgets.h"
#include "widgets/WidgetUserInterface.h"

namespace varnel {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

/// A pane with rows that have only names.
class NamesPane final : public PaneController, public TableViewDelegate {
 public:
  NamesPane(UserInterface& userInterface, std::string_view title, std::vector<std::string> names)
      : _pane(userInterface.makeTablePane()), _names(std::move(names)) {
    _pane->setTitle(title);
    _pane->table().setDelegate(this);
  }

  TablePane& pane() override { return *_pane; }
  std::size_t tableView_numberOfRowsInSection(TableView&, std::size_t) override { return _names.size(); }
  std::unique_ptr<TableCell> tableView_cellForRowAtIndexPath(TableView& table,
                                                             const IndexPath& path) override {
    auto cell = std::make_unique<TableCell>(table.makeCellView(CellStyle::Default), "name");
    cell->cellView().addLabel().setText(_names[path.row]);
    return cell;
  }
  void tableView_didSelectRowAtIndexPath(TableView&, const std::optional<IndexPath>&) override {}

 private:
  std::unique_ptr<TablePane> _pane;
  std::vector<std::string> _names;
};

class PageWidgetTest : public testing::Test {
 protected:
  PageWidgetTest() {
    root = std::make_shared<NamesPane>(userInterface, "Varnel", std::vector<std::string>{"LTE", "NR"});
    stack = userInterface.makeNavigationStack(root);
    window = userInterface.makeWindow({0, 0, 360, 640});
    window->setRoot(*stack);
    window->makeKeyAndVisible();
    EXPECT_TRUE(QTest::qWaitForWindowActive(&widget()));
  }
  WindowWidget& widget() { return static_cast<WindowWidget&>(*window); }
  NavigationWidget& navigation() { return static_cast<NavigationWidget&>(*stack); }
  TableWidget& table() { return navigation().topPane().tableWidget(); }
  QLineEdit& showField() {
    widget().showPage("Find", std::make_unique<QLineEdit>());
    return static_cast<QLineEdit&>(*widget().page());
  }

  WidgetUserInterface userInterface{{}};
  std::shared_ptr<NamesPane> root;
  std::unique_ptr<NavigationStack> stack;
  std::unique_ptr<Window> window;
};

TEST_F(PageWidgetTest, APageCoversTheStackAndTakesTheKeyboard) {
  const QLineEdit& field = showField();
  EXPECT_TRUE(field.isVisible());
  EXPECT_TRUE(field.hasFocus());
  EXPECT_FALSE(navigation().isVisible());
}

TEST_F(PageWidgetTest, EscapeGoesBackToTheStack) {
  QTest::keyClick(&showField(), Qt::Key_Escape);
  EXPECT_EQ(widget().page(), nullptr);
  EXPECT_TRUE(navigation().isVisible());
  EXPECT_TRUE(table().hasFocus());
}

TEST_F(PageWidgetTest, APaneThatComesToTheTopMeanwhileDoesNotTakeTheKeyboard) {
  const QLineEdit& field = showField();
  stack->push(std::make_shared<NamesPane>(userInterface, "LTE", std::vector<std::string>{"Bearers"}),
              Animation::Animated);
  EXPECT_TRUE(field.hasFocus());
  EXPECT_EQ(widget().focusWidget(), &field);
}

TEST_F(PageWidgetTest, ASecondPageComesInPlaceOfTheFirst) {
  showField().setText("first");
  EXPECT_EQ(showField().text(), "");
  widget().closePage();
  EXPECT_TRUE(navigation().isVisible());
}

TEST_F(PageWidgetTest, TabStaysOnThePage) {
  QLineEdit& field = showField();
  for (int i = 0; i < 5; ++i) QTest::keyClick(QApplication::focusWidget(), Qt::Key_Tab);
  EXPECT_TRUE(field.parentWidget()->isAncestorOf(QApplication::focusWidget()) ||
              QApplication::focusWidget() == field.parentWidget());
}

TEST_F(PageWidgetTest, AKeyCausesItsCommand) {
  int calls = 0;
  widget().addCommand("Find", {Qt::CTRL | Qt::Key_F, Qt::Key_Slash}, [&] { ++calls; });
  QTest::keyClick(&table(), Qt::Key_F, Qt::ControlModifier);
  QTest::keyClick(&table(), Qt::Key_Slash);
  EXPECT_EQ(calls, 2);
}

TEST_F(PageWidgetTest, ALetterForATextFieldCausesNoCommand) {
  int calls = 0;
  widget().addCommand("Find", {Qt::Key_Slash}, [&] { ++calls; });
  QLineEdit& field = showField();
  QTest::keyClick(&field, Qt::Key_Slash);
  EXPECT_EQ(field.text(), "/");
  EXPECT_EQ(calls, 0);
}

TEST_F(PageWidgetTest, AnAlertKeepsTheKeysOfCommands) {
  int calls = 0;
  widget().addCommand("Find", {Qt::CTRL | Qt::Key_F}, [&] { ++calls; });
  userInterface.showAlert({"Title", "Message", "Close"});
  QTest::keyClick(QApplication::focusWidget(), Qt::Key_F, Qt::ControlModifier);
  EXPECT_EQ(calls, 0);
  QTest::keyClick(QApplication::focusWidget(), Qt::Key_Escape);
  QTest::keyClick(&table(), Qt::Key_F, Qt::ControlModifier);
  EXPECT_EQ(calls, 1);
}

TEST_F(PageWidgetTest, ABarTakesItsRoomFromTheStack) {
  auto bar = std::make_unique<QWidget>();
  bar->setFixedHeight(40);
  auto* const column = new QVBoxLayout(bar.get());
  column->setContentsMargins(0, 0, 0, 0);
  auto* const field = new QLineEdit;
  field->setFixedHeight(40);
  column->addWidget(field);
  widget().setBar(std::move(bar));
  EXPECT_EQ(navigation().geometry(), QRect(0, 0, 360, 600));
  EXPECT_EQ(widget().bar()->geometry(), QRect(0, 600, 360, 40));
  widget().setBar(nullptr);
  EXPECT_EQ(navigation().geometry(), QRect(0, 0, 360, 640));
}

TEST_F(PageWidgetTest, ThePathOfTheFocusEndsWithTheCurrentRow) {
  EXPECT_THAT(widget().pathOfFocus(), IsEmpty());
  QTest::keyClick(&table(), Qt::Key_Down);
  EXPECT_THAT(widget().pathOfFocus(), ElementsAre("LTE"));
  stack->push(std::make_shared<NamesPane>(userInterface, "LTE", std::vector<std::string>{"Bearers"}),
              Animation::None);
  EXPECT_THAT(widget().pathOfFocus(), ElementsAre("LTE"));
  QTest::keyClick(&table(), Qt::Key_Down);
  EXPECT_THAT(widget().pathOfFocus(), ElementsAre("LTE", "Bearers"));
}

TEST_F(PageWidgetTest, TheNoticeStandsAboveThePageToo) {
  stack->setNotice("The replay has ended");
  showField();
  auto* const page = dynamic_cast<PageWidget*>(widget().page()->parentWidget());
  ASSERT_TRUE(page);
  const NoticeWidget* const notice = &page->notice();
  EXPECT_TRUE(notice->isVisible());
  QTest::qWait(0);  // the page is arranged
  EXPECT_EQ(notice->text(), "The replay has ended");
  EXPECT_LT(notice->geometry().bottom(), widget().page()->geometry().top());
  stack->setNotice("");
  EXPECT_FALSE(notice->isVisible());
  stack->setNotice("The link is gone");
  EXPECT_EQ(notice->text(), "The link is gone");
}

}  // namespace
}  // namespace varnel
