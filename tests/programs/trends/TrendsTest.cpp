#include "programs/varnel/Trends.h"

#include <gmock/gmock.h>

#include <QTest>
#include <QTreeView>

#include "tests/programs/trends/TrendHarness.h"
#include "tests/support/DictionaryOf.h"
#include "tests/support/TestWidgets.h"
#include "widgets/NavigationWidget.h"
#include "widgets/WindowWidget.h"

namespace varnel {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

// The window without panes: the tests open courses by their paths. The module is the real one.
class TrendsTest : public TrendHarness {
 protected:
  TrendsTest() {
    for (int i = 0; i < 5; ++i) show(2 * i, "-85", "-9");
    trends.furnish(window);
    window.show();
    EXPECT_TRUE(QTest::qWaitForWindowExposed(&window, patience_ms));
  }

  WindowWidget window{{0, 0, 700, 500}, {}};
  std::string failure;
  Trends trends{{.live = source,
                 .keyOf = [](const NamePath& path) -> std::optional<std::string> {
                   if (path.back() == "RSRP") return level;
                   if (path.back() == "RSRQ") return quality;
                   return std::nullopt;
                 },
                 .tellFailure = [this](const std::string& why) { failure = why; }}};
};

TEST_F(TrendsTest, ARowHasItsPictureOnAPageOfTheWindow) {
  trends.show({"LTE", "Serving Cell", "RSRP"});
  EXPECT_EQ(failure, "");
  ASSERT_TRUE(trends.page());
  EXPECT_EQ(window.page(), trends.page());
  EXPECT_THAT(trends.page()->rows(), ElementsAre(level));
  window.closePage();
  EXPECT_FALSE(trends.page());
}

TEST_F(TrendsTest, ASecondRowIsAddedOrHasItsOwnPicture) {
  trends.show({"LTE", "Serving Cell", "RSRP"});
  window.closePage();
  trends.showAlso({"LTE", "Neighbors", "RSRQ"});
  EXPECT_THAT(trends.page()->rows(), ElementsAre(level, quality));
  window.closePage();
  trends.show({"LTE", "Neighbors", "RSRQ"});
  EXPECT_THAT(trends.page()->rows(), ElementsAre(quality));
}

TEST_F(TrendsTest, ARowThatShowsNoNumberAtPresentHasTheCourseThatItHad) {
  numbers.add(std::vector{reading("/LTE/Connection/Count", "", "3")}, {start + 20, 0});
  show(22, "-85");
  trends.show({"LTE", "Connection", "Count"});
  EXPECT_THAT(trends.page()->rows(), ElementsAre("/LTE/Connection/Count"));
}

TEST_F(TrendsTest, MenusOfferATrendOfARowWithNumbersOnly) {
  std::vector<std::string> calls;
  const auto pane = std::make_shared<TestController>("LTE", calls);
  TestRows rows({{"RSRP", "-85 dBm"}, {"Neighbors"}});
  pane->widget().tableWidget().setDelegate(&rows);
  NavigationWidget stack(pane);
  window.setRoot(stack);
  TableWidget& table = pane->widget().tableWidget();
  const QAction& trend = *window.findChild<QAction*>(QLatin1String(TableWidget::courseCommand));
  EXPECT_FALSE(window.offers(trend)) << "no row is chosen";
  QTest::keyClick(&table, Qt::Key_Down);
  EXPECT_TRUE(window.offers(trend));
  QTest::keyClick(&table, Qt::Key_Down);
  EXPECT_FALSE(window.offers(trend)) << "a section";
  pane->widget().tableWidget().setDelegate(nullptr);
}

TEST_F(TrendsTest, ARowWithoutACourseLetsTheUserChoose) {
  trends.show({"LTE", "Serving Cell"});
  ASSERT_TRUE(trends.page());
  EXPECT_THAT(trends.page()->rows(), IsEmpty());
  EXPECT_TRUE(trends.page()->findChild<QTreeView*>()->isVisible());
}

TEST_F(TrendsTest, AnOpenedFileTakesThePlaceOfTheDisplay) {
  trends.show({"LTE", "Serving Cell", "RSRP"});
  trends.openCapture({.path = "/nowhere/capture", .program = VARNEL_NUMBERS_PROGRAM});
  EXPECT_FALSE(trends.page());
  trends.closeFile();
  trends.show({"LTE", "Serving Cell", "RSRP"});
  EXPECT_THAT(trends.page()->rows(), ElementsAre(level));
}

TEST_F(TrendsTest, TheDisplaysOfASnapshotTakeThePlaceOfTheDisplay) {
  const auto saved = [](const char* text, std::int64_t second) {
    return Generation{.time = {start + second, 0},
                      .display = dictionaryOf({{"LTE", dictionaryOf({{"Cells", text}})}})};
  };
  trends.openSaved({.path = "walk.varnel", .displays = {saved("3", 0), saved("4", 5)}});
  trends.show({"LTE", "Cells"});
  ASSERT_TRUE(trends.page());
  EXPECT_THAT(trends.page()->rows(), ElementsAre("/LTE/Cells"));
  trends.openSaved({.path = "walk.varnel", .displays = {saved("3", 0)}});
  EXPECT_FALSE(trends.page());
  trends.show({"LTE", "Cells"});
  EXPECT_FALSE(trends.page());
  EXPECT_THAT(failure, testing::HasSubstr("walk.varnel has one display only"));
}

}  // namespace
}  // namespace varnel
