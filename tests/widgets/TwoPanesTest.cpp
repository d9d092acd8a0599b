#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <QScrollBar>

#include "tests/support/TestWidgets.h"
#include "widgets/NavigationWidget.h"
#include "widgets/PanePlaces.h"
#include "widgets/RowMenu.h"

namespace varnel {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testing::SizeIs;

TEST(PanePlaces, From900PixelsOnTheLastTwoPanesAreSideBySide) {
  const PanePlaces narrow = PanePlaces::in({0, 0, 899, 700}, 3);
  EXPECT_FALSE(narrow.left);
  EXPECT_EQ(narrow.top, QRect(0, 0, 899, 700));
  const PanePlaces wide = PanePlaces::in({0, 0, 900, 700}, 3);
  EXPECT_EQ(wide.left, QRect(0, 0, 359, 700)) << "two fifths without the line";
  EXPECT_EQ(wide.top, QRect(360, 0, 540, 700));
}

TEST(PanePlaces, TheRootAloneIsOnePaneAtAnyWidth) {
  const PanePlaces places = PanePlaces::in({0, 0, 1920, 1080}, 1);
  EXPECT_FALSE(places.left);
  EXPECT_EQ(places.top, QRect(0, 0, 1920, 1080));
}

// A controller with a table of sections and one leaf. Choosing a section pushes its pane.
class SectionsController : public PaneController, public TableViewDelegate, public NavigationStackDelegate {
 public:
  SectionsController(std::string name, std::vector<std::string>& events)
      : _controller(std::move(name), events), _events(events) {
    pane().table().setDelegate(this);
  }
  TablePane& pane() override { return _controller.pane(); }
  PaneWidget& widget() { return _controller.widget(); }
  TableWidget& table() { return widget().tableWidget(); }
  const std::string& name() const { return _controller.name(); }
  void viewWillAppear(Animation animation) override { _controller.viewWillAppear(animation); }
  void viewWillDisappear(Animation animation) override { _controller.viewWillDisappear(animation); }

  std::size_t tableView_numberOfRowsInSection(TableView& table, std::size_t section) override {
    return _rows.tableView_numberOfRowsInSection(table, section);
  }
  std::unique_ptr<TableCell> tableView_cellForRowAtIndexPath(TableView& table,
                                                             const IndexPath& path) override {
    return _rows.tableView_cellForRowAtIndexPath(table, path);
  }
  void tableView_didSelectRowAtIndexPath(TableView& table, const std::optional<IndexPath>& path) override {
    const TestRow& row = rows().at(path->row);
    _events.push_back(name() + " chooses " + row.name);
    if (row.value) return table.deselectRow(*path, Animation::None);
    navigationController()->push(std::make_shared<SectionsController>(row.name, _events),
                                 Animation::Animated);
  }
  void navigationController_willShowViewController_animated(NavigationStack&, PaneController& controller,
                                                            Animation) override {
    _events.push_back("delegate told of " + static_cast<SectionsController&>(controller).name());
  }
  std::vector<TestRow>& rows() { return _rows.rows; }

 private:
  TestController _controller;
  std::vector<std::string>& _events;
  TestRows _rows{{{"A"}, {"B"}, {"C"}, {"Leaf", "1"}}};
};

class TwoPanesTest : public testing::Test {
 protected:
  void show(int width, int height) {
    window.setGeometry(0, 0, width, height);
    stack.setDelegate(root.get());
    window.setRoot(stack);
    window.makeKeyAndVisible();
    ASSERT_TRUE(QTest::qWaitForWindowActive(&window, patience_ms));
    stack.showToolbar();
    QCoreApplication::processEvents();
  }
  void resize(int width) {
    window.resize(width, window.height());
    QCoreApplication::processEvents();
  }
  SectionsController& at(std::size_t index) {
    return static_cast<SectionsController&>(*stack.controllers().at(index));
  }
  std::vector<std::string> names() {
    std::vector<std::string> all;
    for (std::size_t i = 0; i < stack.controllers().size(); ++i) all.push_back(at(i).name());
    return all;
  }
  void click(SectionsController& controller, std::size_t row) {
    RowWidget& widget = *controller.table().visibleRows().at(row);
    QTest::mouseClick(controller.table().viewport(), Qt::LeftButton, {}, widget.geometry().center());
  }
  void press(Qt::Key key, Qt::KeyboardModifiers modifiers = Qt::NoModifier) {
    QTest::keyClick(QApplication::focusWidget(), key, modifiers);
    QCoreApplication::processEvents();
  }
  // The names of the rows that are marked as open.
  static std::vector<std::string> openRows(SectionsController& controller) {
    std::vector<std::string> names;
    for (const RowWidget* row : controller.table().visibleRows()) {
      if (row->emphasis().isOpen) names.push_back(row->name().toStdString());
    }
    return names;
  }
  bool hasKeyboard(SectionsController& controller) { return controller.table().hasFocus(); }

  std::vector<std::string> events;
  std::shared_ptr<SectionsController> root = std::make_shared<SectionsController>("Root", events);
  NavigationWidget stack{root};
  WindowWidget window{{0, 0, 360, 640}, {}};
};

class LifeCycleTest : public TwoPanesTest, public testing::WithParamInterface<std::pair<int, int>> {};

TEST_P(LifeCycleTest, IsThatOfAStackThatShowsOnePane) {
  show(GetParam().first, GetParam().second);
  EXPECT_THAT(events, ElementsAre("Root will appear"));
  events.clear();
  click(*root, 0);
  EXPECT_THAT(events,
              ElementsAre("Root chooses A", "Root will disappear", "A will appear", "delegate told of A"));
  events.clear();
  click(at(1), 1);
  EXPECT_THAT(events, ElementsAre("A chooses B", "A will disappear", "B will appear", "delegate told of B"));
  events.clear();
  press(Qt::Key_Escape);
  EXPECT_THAT(events, ElementsAre("B will disappear", "A will appear", "delegate told of A"));
  events.clear();
  stack.popTo(*root, Animation::Animated);
  EXPECT_THAT(events, ElementsAre("A will disappear", "Root will appear", "delegate told of Root"));
}

INSTANTIATE_TEST_SUITE_P(, LifeCycleTest,
                         testing::Values(std::pair(360, 640), std::pair(1366, 768), std::pair(1920, 1080)),
                         [](const auto& info) { return "Width" + std::to_string(info.param.first); });

TEST_F(TwoPanesTest, TheLastTwoPanesAreVisibleAndTheTopOneIsOnTheRight) {
  show(1000, 700);
  EXPECT_EQ(root->widget().geometry(), QRect(0, 0, 1000, 700));
  click(*root, 0);
  EXPECT_EQ(root->widget().geometry(), QRect(0, 0, 399, 700));
  EXPECT_EQ(at(1).widget().geometry(), QRect(400, 0, 600, 700));
  EXPECT_TRUE(root->widget().isVisible());
  click(at(1), 0);
  EXPECT_FALSE(root->widget().isVisible());
  EXPECT_EQ(at(1).widget().geometry(), QRect(0, 0, 399, 700));
  EXPECT_EQ(at(2).widget().geometry(), QRect(400, 0, 600, 700));
}

TEST_F(TwoPanesTest, OnlyTheTopPaneHasAToolbarAndANotice) {
  show(1000, 700);
  stack.setNotice("No server");
  click(*root, 0);
  EXPECT_FALSE(root->widget().toolbar().isVisible());
  EXPECT_FALSE(root->widget().notice().isVisible());
  EXPECT_TRUE(at(1).widget().toolbar().isVisible());
  EXPECT_TRUE(at(1).widget().notice().isVisible());
  stack.setNotice("Still no server");
  EXPECT_FALSE(root->widget().notice().isVisible());
  press(Qt::Key_Escape);
  EXPECT_TRUE(root->widget().toolbar().isVisible());
  EXPECT_TRUE(root->widget().notice().isVisible());
}

TEST_F(TwoPanesTest, AChoiceOnTheLeftGoesBackFirstAndThenReachesTheDelegate) {
  show(1366, 768);
  click(*root, 0);
  events.clear();
  click(*root, 1);
  EXPECT_THAT(names(), ElementsAre("Root", "B"));
  EXPECT_THAT(events,
              ElementsAre("A will disappear", "Root will appear", "delegate told of Root", "Root chooses B",
                          "Root will disappear", "B will appear", "delegate told of B"));
  EXPECT_TRUE(hasKeyboard(at(1)));
}

TEST_F(TwoPanesTest, ALeafOnTheLeftMakesItsPaneTheTopOne) {
  show(1366, 768);
  click(*root, 0);
  click(at(1), 1);
  ASSERT_THAT(names(), ElementsAre("Root", "A", "B"));
  click(at(1), 3);
  EXPECT_THAT(names(), ElementsAre("Root", "A"));
  EXPECT_TRUE(root->widget().isVisible());
  EXPECT_GT(at(1).widget().x(), 0);
  EXPECT_TRUE(hasKeyboard(at(1)));
}

TEST_F(TwoPanesTest, APoppedPaneIsSilentAfterAChoiceOnTheLeft) {
  show(1366, 768);
  click(*root, 0);
  const auto popped = std::static_pointer_cast<SectionsController>(stack.topController());
  click(*root, 1);
  events.clear();
  popped->table().chooseRow(0);
  EXPECT_THAT(events, IsEmpty());
  EXPECT_FALSE(popped->widget().isVisible());
  EXPECT_EQ(popped->navigationController(), nullptr);
}

TEST_F(TwoPanesTest, TheLeftPaneMarksTheRowThatIsOpenOnTheRight) {
  show(1366, 768);
  EXPECT_THAT(openRows(*root), IsEmpty());
  click(*root, 1);
  EXPECT_THAT(openRows(*root), ElementsAre("B"));
  EXPECT_THAT(openRows(at(1)), IsEmpty());
  press(Qt::Key_Left);
  press(Qt::Key_Down);
  EXPECT_THAT(openRows(*root), ElementsAre("B")) << "the row that is open does not follow the keys";
  root->rows().insert(root->rows().begin(), {"New"});
  root->table().reloadData();
  EXPECT_THAT(openRows(*root), ElementsAre("B")) << "it is found by its name";
  press(Qt::Key_Escape);
  EXPECT_THAT(openRows(*root), IsEmpty());
}

TEST_F(TwoPanesTest, ResizingAcross900PixelsShowsAndHidesTheLeftPaneWithoutACall) {
  show(1000, 700);
  click(*root, 0);
  click(at(1), 0);
  events.clear();
  press(Qt::Key_Left);
  ASSERT_TRUE(hasKeyboard(at(1)));
  resize(899);
  EXPECT_FALSE(at(1).widget().isVisible());
  EXPECT_EQ(at(2).widget().geometry(), QRect(0, 0, 899, 700));
  EXPECT_TRUE(hasKeyboard(at(2)));
  EXPECT_THAT(openRows(at(1)), IsEmpty());
  resize(900);
  EXPECT_TRUE(at(1).widget().isVisible());
  EXPECT_THAT(openRows(at(1)), ElementsAre("A"));
  EXPECT_EQ(at(2).widget().x(), 360);
  EXPECT_THAT(events, IsEmpty());
}

TEST_F(TwoPanesTest, TheLeftPaneScrollsAndIsRefreshed) {
  root->rows() = leaves(100);
  root->rows().front() = {"A"};
  show(1000, 700);
  click(*root, 0);
  turnWheel(*root->table().viewport(), {50, 100}, {0, -200});
  EXPECT_GT(root->table().verticalScrollBar()->value(), 0);
  EXPECT_THAT(names(), SizeIs(2));
  root->rows().at(20).value = "new";
  root->table().verticalScrollBar()->setValue(20 * 50);
  root->table().reloadData();
  EXPECT_EQ(root->table().visibleRows().front()->description(), "Row 20: new");
}

TEST_F(TwoPanesTest, LeftAndRightLeadFromOnePaneToTheOther) {
  show(1366, 768);
  click(*root, 1);
  press(Qt::Key_Left);
  EXPECT_TRUE(hasKeyboard(*root));
  EXPECT_THAT(names(), SizeIs(2)) << "it is not the way back";
  press(Qt::Key_Right);
  EXPECT_TRUE(hasKeyboard(at(1))) << "the pane of this row is open";
  press(Qt::Key_Left);
  press(Qt::Key_Up);
  press(Qt::Key_Right);
  EXPECT_THAT(names(), ElementsAre("Root", "A")) << "another row opens its own pane";
  press(Qt::Key_Left);
  press(Qt::Key_End);
  press(Qt::Key_Right);
  EXPECT_THAT(names(), ElementsAre("Root", "A")) << "a leaf leads nowhere";
  EXPECT_TRUE(hasKeyboard(at(1)));
}

TEST_F(TwoPanesTest, LeftInTheLeftPaneGoesBack) {
  show(1366, 768);
  click(*root, 0);
  click(at(1), 0);
  press(Qt::Key_Left);
  press(Qt::Key_Left);
  EXPECT_THAT(names(), ElementsAre("Root", "A"));
  EXPECT_TRUE(hasKeyboard(at(1)));
}

TEST_F(TwoPanesTest, TabGoesThroughBothPanes) {
  show(1366, 768);
  click(*root, 0);
  press(Qt::Key_Tab);
  EXPECT_TRUE(hasKeyboard(*root)) << "the root has no way back";
  press(Qt::Key_Tab);
  EXPECT_EQ(QApplication::focusWidget(), at(1).widget().header().findChild<TextButton*>());
  press(Qt::Key_Tab);
  EXPECT_TRUE(hasKeyboard(at(1)));
}

TEST_F(TwoPanesTest, EscapeGoesBackFromBothPanes) {
  show(1366, 768);
  click(*root, 0);
  press(Qt::Key_Escape);
  EXPECT_THAT(names(), ElementsAre("Root"));
  click(*root, 0);
  press(Qt::Key_Left);
  press(Qt::Key_Escape);
  EXPECT_THAT(names(), ElementsAre("Root"));
  EXPECT_TRUE(hasKeyboard(*root));
}

TEST_F(TwoPanesTest, EachBackButtonLeadsToThePaneThatItNames) {
  show(1366, 768);
  click(*root, 0);
  click(at(1), 1);
  QTest::mouseClick(at(2).widget().header().findChild<TextButton*>(), Qt::LeftButton);
  EXPECT_THAT(names(), ElementsAre("Root", "A"));
  click(at(1), 1);
  QTest::mouseClick(at(1).widget().header().findChild<TextButton*>(), Qt::LeftButton);
  EXPECT_THAT(names(), ElementsAre("Root"));
}

TEST_F(TwoPanesTest, ThePathOfTheFocusIsThatOfThePaneWithTheKeyboard) {
  show(1366, 768);
  click(*root, 0);
  click(at(1), 1);
  EXPECT_THAT(stack.pathOfFocus(), ElementsAre("A", "B"));
  press(Qt::Key_Left);
  press(Qt::Key_Down);
  EXPECT_THAT(stack.pathOfFocus(), ElementsAre("A", "C"));
}

TEST_F(TwoPanesTest, RowsAreAtMost800WideAndStandInTheMiddle) {
  show(1920, 1080);
  EXPECT_EQ(root->table().visibleRows().front()->geometry(), QRect(560, 0, 800, 50));
  EXPECT_EQ(root->table().visibleRows().front()->contentBounds().width, 770) << "without the mark's room";
  QTest::mouseClick(root->table().viewport(), Qt::LeftButton, {}, {500, 25});
  EXPECT_THAT(names(), SizeIs(1)) << "beside the rows there is nothing to choose";
  click(*root, 0);
  EXPECT_EQ(root->table().visibleRows().front()->geometry(), QRect(0, 0, 767, 50));
  EXPECT_EQ(at(1).table().visibleRows().front()->geometry(), QRect(176, 0, 800, 50));
}

// The right pane has the keyboard, so its row is the one that commands apply to.
TEST_F(TwoPanesTest, TheRowsOfThePaneWithoutTheKeyboardArePale) {
  show(1200, 700);
  click(*root, 0);
  ASSERT_TRUE(hasKeyboard(at(1)));
  EXPECT_TRUE(root->table().visibleRows().at(0)->emphasis().isPale);
  EXPECT_FALSE(at(1).table().visibleRows().at(0)->emphasis().isPale);
  press(Qt::Key_Left);
  ASSERT_TRUE(hasKeyboard(*root));
  EXPECT_FALSE(root->table().visibleRows().at(0)->emphasis().isPale);
  EXPECT_TRUE(at(1).table().visibleRows().at(0)->emphasis().isPale);
  resize(600);
  EXPECT_FALSE(at(1).table().visibleRows().at(0)->emphasis().isPale) << "it is alone";
}

TEST_F(TwoPanesTest, WhenNoPaneHasTheKeyboardCommandsAreForTheOneOnTheRight) {
  auto bar = std::make_unique<QWidget>();
  bar->setFocusPolicy(Qt::StrongFocus);
  QWidget& beneath = *bar;
  window.setBar(std::move(bar));
  show(1200, 700);
  click(*root, 0);
  press(Qt::Key_Left);
  beneath.setFocus();
  ASSERT_TRUE(beneath.hasFocus());
  EXPECT_THAT(window.pathOfFocus(), ElementsAre("A"));
  EXPECT_TRUE(root->table().visibleRows().at(0)->emphasis().isPale);
  EXPECT_FALSE(at(1).table().visibleRows().at(0)->emphasis().isPale);
}

// A click on a leaf selects nothing, but commands apply to its row from then on.
TEST_F(TwoPanesTest, ALeafThatWasClickedHasTheFrame) {
  show(360, 640);
  click(*root, 3);
  const RowWidget::Emphasis& leaf = root->table().visibleRows().at(3)->emphasis();
  EXPECT_FALSE(leaf.isSelected);
  EXPECT_TRUE(leaf.hasFocusFrame);
}

TEST_F(TwoPanesTest, TheButtonOfTheTopPaneOpensTheMenu) {
  const RowMenu menu(window);
  show(1200, 700);
  click(*root, 0);
  const auto button = [](PaneWidget& pane) {
    const auto buttons = pane.header().findChildren<GlyphButton*>();
    return buttons.size() == 1 ? buttons.front() : nullptr;
  };
  ASSERT_TRUE(button(root->widget()) && button(at(1).widget()));
  EXPECT_FALSE(button(root->widget())->isVisible()) << "one menu for both panes";
  GlyphButton& shown = *button(at(1).widget());
  ASSERT_TRUE(shown.isVisible());
  QTest::mouseClick(&shown, Qt::LeftButton);
  ASSERT_TRUE(menu.menu());
  EXPECT_TRUE(hasKeyboard(at(1))) << "the menu belongs to its row";
  menu.menu()->close();
}

TEST_F(TwoPanesTest, WithoutAMenuThereIsNoButtonForIt) {
  show(360, 640);
  for (const GlyphButton* button : root->widget().header().findChildren<GlyphButton*>())
    EXPECT_FALSE(button->isVisible());
}

TEST_F(TwoPanesTest, TheMenuOffersWhatAppliesAndKeysActAllTheSame) {
  bool applies = false;
  RowMenu menu(window);
  QAction& action = window.addCommand("Trend", {Qt::Key_T}, [] {});
  window.offerOnlyIf(action, [&applies] { return applies; });
  show(360, 640);
  menu.open();
  EXPECT_FALSE(action.isEnabled());
  menu.menu()->close();
  EXPECT_TRUE(action.isEnabled());
  QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
  ASSERT_FALSE(menu.menu());
  applies = true;
  menu.open();
  EXPECT_TRUE(action.isEnabled());
  menu.menu()->close();
}

TEST_F(TwoPanesTest, TheMenuLeavesKeysOutThatDoNotFitOnTheScreen) {
  RowMenu menu(window);
  QAction& action = window.addCommand("Trend", {Qt::Key_T}, [] {});
  show(360, 640);
  menu.open();
  EXPECT_TRUE(action.isShortcutVisibleInContextMenu());
  menu.menu()->close();
  QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
  window.addCommand(QString(400, u'W'), {}, [] {});
  menu.open();
  EXPECT_FALSE(action.isShortcutVisibleInContextMenu());
  menu.menu()->close();
}

}  // namespace
}  // namespace varnel
