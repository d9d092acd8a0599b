#include "widgets/SearchPage.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <QScrollBar>

#include "tests/support/Finger.h"
#include "tests/support/TestWidgets.h"

namespace varnel {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

class SearchPageTest : public testing::Test {
 protected:
  SearchPageTest() {
    for (int i = 0; i < 40; ++i)
      display.push_back({{"Cells", std::to_string(i), "RSRP"}, std::to_string(-60 - i) + ".0 dBm"});
    display.push_back({{"SIM Info"}, ""});
    page.resize(360, 640);
    page.show();
    page.searchAgain();
    page.activateWindow();
    EXPECT_TRUE(QTest::qWaitForWindowActive(&page, patience_ms));
    words().setFocus();
  }

  // A word may stand in the last name or in the value, as they are written.
  std::vector<SearchResult> found(const std::string& word) const {
    std::vector<SearchResult> rows;
    for (const SearchResult& row : display) {
      if (row.path.back().find(word) != std::string::npos || row.value.find(word) != std::string::npos)
        rows.push_back(row);
    }
    return rows;
  }
  QLineEdit& words() { return *page.findChild<QLineEdit*>(); }
  SearchResultsView& list() { return static_cast<SearchResultsView&>(*page.findChild<QListView*>()); }
  std::string count() { return page.findChild<QLabel*>()->text().toStdString(); }
  std::string current() { return page.currentRow() ? page.currentRow()->value : "(none)"; }
  int topOfCurrent() { return list().visualRect(list().currentIndex()).top(); }
  static void press(Qt::Key key) { QTest::keyClick(QApplication::focusWidget(), key); }
  QString data(int row, int role) { return list().model()->index(row, 0).data(role).toString(); }

  std::vector<SearchResult> display;
  std::vector<std::string> chosen;
  SearchPage page{[this](const std::string& word) { return found(word); },
                  [this](const SearchResult& row) { chosen.push_back(row.path[1]); }};
};

TEST_F(SearchPageTest, ShowsAllRowsUntilTheUserTypes) {
  EXPECT_EQ(count(), "41 rows");
  QTest::keyClicks(&words(), "-7");
  EXPECT_EQ(count(), "10 rows");
  EXPECT_EQ(current(), "-70.0 dBm");
  QTest::keyClicks(&words(), "3.");
  EXPECT_EQ(count(), "1 row");
  QTest::keyClicks(&words(), "x");
  EXPECT_EQ(count(), "No row has all of these words");
  EXPECT_EQ(current(), "(none)");
}

TEST_F(SearchPageTest, AResultTellsNameValueAndSections) {
  EXPECT_EQ(data(2, Qt::DisplayRole), "RSRP");
  EXPECT_EQ(data(2, SearchResults::ValueRole), "-62.0 dBm");
  EXPECT_EQ(data(2, SearchResults::SectionsRole), "Cells › 2");
  EXPECT_EQ(data(2, Qt::AccessibleTextRole), "RSRP: -62.0 dBm, in Cells, 2");
  EXPECT_EQ(data(40, SearchResults::SectionsRole), "");
  EXPECT_EQ(data(40, Qt::AccessibleTextRole), "SIM Info");
}

TEST_F(SearchPageTest, ReturnGoesToTheRowThatTheArrowKeysChose) {
  QTest::keyClicks(&words(), "-7");
  press(Qt::Key_Down);
  press(Qt::Key_Down);
  press(Qt::Key_Up);
  EXPECT_TRUE(words().hasFocus()) << "the user can go on typing";
  press(Qt::Key_Return);
  EXPECT_THAT(chosen, ElementsAre("11"));
}

TEST_F(SearchPageTest, ReturnWithoutAResultDoesNothing) {
  QTest::keyClicks(&words(), "nothing like it");
  press(Qt::Key_Return);
  EXPECT_THAT(chosen, IsEmpty());
}

TEST_F(SearchPageTest, InTheListReturnGoesThereAndLettersGoToTheWords) {
  press(Qt::Key_Tab);
  ASSERT_TRUE(list().hasFocus());
  press(Qt::Key_Down);
  press(Qt::Key_Return);
  EXPECT_THAT(chosen, ElementsAre("1"));
  QTest::keyClicks(&list(), "-99");
  EXPECT_TRUE(words().hasFocus());
  EXPECT_EQ(words().text(), "-99");
  EXPECT_EQ(current(), "-99.0 dBm");
}

TEST_F(SearchPageTest, AClickGoesThere) {
  const QModelIndex third = list().model()->index(2, 0);
  QTest::mouseClick(list().viewport(), Qt::LeftButton, {}, list().visualRect(third).center());
  EXPECT_THAT(chosen, ElementsAre("2"));
}

TEST_F(SearchPageTest, ATapGoesThereAndAFingerScrolls) {
  Finger finger(*list().viewport());
  const QPoint middle = list().viewport()->rect().center();
  finger.drag(middle, middle - QPoint(0, 200));
  EXPECT_TRUE(QTest::qWaitFor([this] { return list().verticalScrollBar()->value() > 100; }, patience_ms));
  EXPECT_THAT(chosen, IsEmpty());
  ASSERT_TRUE(finger.waitForRest());
  const auto aimed = list().indexAt(middle);
  finger.tap(middle);
  EXPECT_THAT(chosen, ElementsAre(std::to_string(aimed.row())));
}

TEST_F(SearchPageTest, ARefreshChangesValuesAndKeepsTheCurrentRow) {
  press(Qt::Key_Down);
  display[1].value = "-44.0 dBm";
  page.searchAgain();
  EXPECT_EQ(current(), "-44.0 dBm");
  EXPECT_EQ(list().currentIndex().row(), 1);
}

TEST_F(SearchPageTest, TheCurrentRowStaysAtItsPlaceWhenRowsComeAndGo) {
  for (int i = 0; i < 25; ++i) press(Qt::Key_Down);
  ASSERT_EQ(current(), "-85.0 dBm");
  const int place = topOfCurrent();
  display.erase(display.begin() + 3, display.begin() + 6);
  page.searchAgain();
  EXPECT_EQ(current(), "-85.0 dBm");
  EXPECT_EQ(list().currentIndex().row(), 22);
  EXPECT_EQ(topOfCurrent(), place);
}

TEST_F(SearchPageTest, WhereTheCurrentRowIsGoneItsNeighborIsCurrent) {
  for (int i = 0; i < 5; ++i) press(Qt::Key_Down);
  display.erase(display.begin() + 5);
  page.searchAgain();
  EXPECT_EQ(current(), "-66.0 dBm");
  display.clear();
  page.searchAgain();
  EXPECT_EQ(current(), "(none)");
}

TEST_F(SearchPageTest, NothingIsWiderThanThePage) {
  display = {{{std::string(200, 'S'), std::string(200, 'N')}, std::string(200, 'V')}};
  page.searchAgain();
  EXPECT_EQ(list().horizontalScrollBar()->maximum(), 0);
  EXPECT_EQ(list().visualRect(list().currentIndex()).width(), list().viewport()->width());
}

}  // namespace
}  // namespace varnel
