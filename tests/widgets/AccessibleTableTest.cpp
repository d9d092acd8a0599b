#include "widgets/AccessibleTable.h"

#include <gtest/gtest.h>

#include "tests/support/TestWidgets.h"

namespace varnel {
namespace {

class AccessibleTableTest : public testing::Test {
 protected:
  AccessibleTableTest() {
    describeTablesToScreenReaders();
    table.resize(360, 400);
    table.setDelegate(&delegate);
    table.show();
    table.activateWindow();
    table.setFocus();
    EXPECT_TRUE(QTest::qWaitForWindowActive(&table, patience_ms));
  }
  QAccessibleInterface& list() { return *QAccessible::queryAccessibleInterface(&table); }
  QAccessibleInterface& row(int index) { return *list().child(index); }

  TestRows delegate{{{"Serving Cell"}, {"RSRP", "-97.25 dBm"}, {"Empty", ""}}};
  TableWidget table;
};

TEST_F(AccessibleTableTest, ATableIsAListOfItsRows) {
  EXPECT_EQ(list().role(), QAccessible::List);
  EXPECT_EQ(list().childCount(), 3);
  EXPECT_EQ(row(1).role(), QAccessible::ListItem);
  EXPECT_EQ(row(1).parent(), &list());
  EXPECT_EQ(list().indexOfChild(&row(2)), 2);
  EXPECT_EQ(list().child(3), nullptr);
}

TEST_F(AccessibleTableTest, RowsAreNamedNameAndValue) {
  EXPECT_EQ(row(0).text(QAccessible::Name), "Serving Cell");
  EXPECT_EQ(row(1).text(QAccessible::Name), "RSRP: -97.25 dBm");
  EXPECT_EQ(row(2).text(QAccessible::Name), "Empty");
}

TEST_F(AccessibleTableTest, ARowThatIsTooShortForItsValueIsDescribedByAllOfIt) {
  delegate.rows[1].value = std::string(80, 'x');
  table.reloadData();
  EXPECT_EQ(row(1).text(QAccessible::Description).toStdString(), "RSRP: " + std::string(80, 'x'));
  EXPECT_EQ(row(0).text(QAccessible::Description), "");
  delegate.rows.at(0).explanation = "It is a row.";
  EXPECT_EQ(row(0).text(QAccessible::Description), "It is a row.");
}

TEST(AccessibleWindow, AWindowIsAWindowNamedByItsTitle) {
  describeTablesToScreenReaders();
  WindowWidget window({0, 0, 360, 640}, {});
  QAccessibleInterface& accessible = *QAccessible::queryAccessibleInterface(&window);
  EXPECT_EQ(accessible.role(), QAccessible::Window);
  EXPECT_EQ(accessible.text(QAccessible::Name), window.windowTitle());
  window.show();
  ASSERT_TRUE(QTest::qWaitForWindowActive(&window));
  EXPECT_TRUE(accessible.state().active);
}

TEST_F(AccessibleTableTest, TheCurrentRowHasFocusAndSelection) {
  QTest::keyClick(&table, Qt::Key_Down);
  QTest::keyClick(&table, Qt::Key_Down);
  EXPECT_TRUE(row(1).state().focused);
  EXPECT_TRUE(row(1).state().selected);
  EXPECT_FALSE(row(0).state().focused);
  EXPECT_TRUE(row(0).state().selectable);
}

TEST_F(AccessibleTableTest, ARowCanBePressed) {
  QAccessibleActionInterface& actions = *row(0).actionInterface();
  ASSERT_EQ(actions.actionNames(), QStringList{QAccessibleActionInterface::pressAction()});
  actions.doAction(QAccessibleActionInterface::pressAction());
  EXPECT_EQ(delegate.chosen, std::vector<std::size_t>{0});
}

}  // namespace
}  // namespace varnel
