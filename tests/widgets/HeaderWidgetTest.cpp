#include "widgets/HeaderWidget.h"

#include <gtest/gtest.h>

#include <QTest>

namespace varnel {
namespace {

class HeaderWidgetTest : public testing::Test {
 protected:
  void show(const QString& title, const QString& parentTitle, int width) {
    header.setTitle(title);
    if (!parentTitle.isEmpty()) header.showBackButton(parentTitle);
    header.resize(width, 48);
    header.show();
    QCoreApplication::processEvents();
  }
  QLabel& label() { return *header.findChild<QLabel*>(); }
  TextButton& back() { return *header.findChild<TextButton*>(); }
  bool titleIsWhole() { return label().fontMetrics().horizontalAdvance(label().text()) <= label().width(); }

  HeaderWidget header;
};

TEST_F(HeaderWidgetTest, ATitleStandsInTheMiddle) {
  show("Varnel", "", 360);
  EXPECT_NEAR(label().geometry().center().x(), 180, 1);
  EXPECT_FALSE(back().isVisible());
}

TEST_F(HeaderWidgetTest, AShortTitleHasTheWholeWayBackBesideIt) {
  show("SIM", "Varnel", 360);
  EXPECT_EQ(back().width(), back().sizeHint().width());
  EXPECT_NEAR(label().geometry().center().x(), 180, 1);
}

TEST_F(HeaderWidgetTest, ALongTitleIsNotCut) {
  show("UTRAN Neighbhor Measurements", "Serving Cell Info", 360);
  EXPECT_TRUE(titleIsWhole());
  EXPECT_FALSE(label().geometry().intersects(back().geometry()));
  EXPECT_GE(label().font().pixelSize(), 13);
  EXPECT_LE(label().geometry().right(), 350);
}

TEST_F(HeaderWidgetTest, TheWayBackIsAtLeastAsLargeAsAFinger) {
  show("A title so long that no letters of it are small enough for the bar", "Varnel", 360);
  EXPECT_GE(back().width(), 40);
  EXPECT_GE(back().height(), 44);
}

TEST_F(HeaderWidgetTest, ATitleThatDoesNotFitIsCutAtItsEndAndWholeInItsTooltip) {
  const QString title = "A title so long that no letters of it are <small> enough for the bar";
  show(title, "Varnel", 360);
  EXPECT_TRUE(titleIsWhole()) << "what is shown is not cut again";
  EXPECT_TRUE(label().text().startsWith("A title so long")) << label().text().toStdString();
  EXPECT_TRUE(label().text().endsWith(QChar(0x2026))) << label().text().toStdString();
  EXPECT_EQ(header.title(), title);
  EXPECT_EQ(label().accessibleName(), title);
  EXPECT_TRUE(label().toolTip().contains("A title so long that no letters of it are &lt;small&gt; enough"));
  header.resize(900, 48);
  QCoreApplication::processEvents();
  EXPECT_EQ(label().text(), title);
  EXPECT_EQ(label().toolTip(), "");
}

TEST_F(HeaderWidgetTest, AWayBackWithoutItsTextHasATooltip) {
  show("SIM", "Varnel", 360);
  EXPECT_EQ(back().toolTip(), "");
  show("A title so long that no letters of it are small enough for the bar", "Varnel", 360);
  EXPECT_TRUE(back().toolTip().contains("Varnel"));
}

TEST_F(HeaderWidgetTest, AButtonOnTheRightLeavesTheTitleWhole) {
  unsigned presses = 0;
  header.setSideAction([&] { ++presses; });
  header.showSideButton(HeaderWidget::SideButton{"Table", "Show a table"});
  show("Reselection Candidates", "Reselection", 360);
  auto& side = *header.findChildren<TextButton*>().last();
  EXPECT_TRUE(titleIsWhole());
  EXPECT_EQ(side.geometry().right(), 359);
  EXPECT_FALSE(label().geometry().intersects(side.geometry()));
  EXPECT_FALSE(label().geometry().intersects(back().geometry()));
  QTest::mouseClick(&side, Qt::LeftButton);
  EXPECT_EQ(presses, 1u);
  header.showSideButton(std::nullopt);
  EXPECT_FALSE(side.isVisible());
}

TEST_F(HeaderWidgetTest, TitlesAreNoMarkUp) {
  show("<b>A</b> & B", "<i>C</i> & D", 360);
  EXPECT_EQ(label().textFormat(), Qt::PlainText);
  EXPECT_TRUE(back().shortcut().isEmpty());
}

TEST_F(HeaderWidgetTest, TheMenuIsAtTheEndAndCoversNothing) {
  header.showMenuButton(true);
  header.showSideButton(HeaderWidget::SideButton{"Table", "Show a table"});
  show("Neighbor Cells", "Varnel", 360);
  const auto& menu = *header.findChild<GlyphButton*>();
  EXPECT_EQ(menu.geometry(), QRect(320, 2, 40, 44));
  EXPECT_TRUE(titleIsWhole());
  EXPECT_EQ(header.title(), label().text());
  EXPECT_FALSE(label().geometry().intersects(menu.geometry()));
  EXPECT_FALSE(label().geometry().intersects(back().geometry()));
  EXPECT_FALSE(menu.toolTip().isEmpty());
}

}  // namespace
}  // namespace varnel
