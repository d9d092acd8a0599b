#include "widgets/StartPage.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <QMenu>
#include <QSignalSpy>
#include <QTest>

#include "platform/ui/Font.h"
#include "tests/support/TestWidgets.h"
#include "widgets/QtValues.h"

namespace varnel {
namespace {

class StartPageTest : public testing::Test {
 protected:
  StartPageTest() {
    table.resize(360, 500);
    page.setModems({{"a", "First"}, {"b", "Second & last"}});
    page.setPortsSource([] { return std::vector<StartPage::Choice>{{"auto", "Look for a modem"}}; });
    table.show();
    page.show();
    EXPECT_TRUE(QTest::qWaitForWindowExposed(&table, patience_ms));
  }
  QAbstractButton* offer(const QString& title) {
    for (auto* button : page.findChildren<QAbstractButton*>())
      if (button->text() == title) return button;
    return nullptr;
  }

  QWidget table;
  StartPage page{table};
};

TEST_F(StartPageTest, CoversTheTableAndFollowsItsSize) {
  EXPECT_EQ(page.geometry(), QRect(0, 0, 360, 500));
  table.resize(800, 600);
  EXPECT_EQ(page.geometry(), QRect(0, 0, 800, 600));
  EXPECT_EQ(offer("Simulated modem")->width(), 420);
}

TEST_F(StartPageTest, OffersFitIntoASmallWindow) {
  table.resize(320, 240);
  QCoreApplication::processEvents();
  for (const QString title : {"Simulated modem", "Open a file…", "Connect to a port"}) {
    const QAbstractButton* const button = offer(title);
    ASSERT_NE(button, nullptr) << title.toStdString();
    const QRect place(button->mapTo(&page, QPoint()), button->size());
    EXPECT_TRUE(page.rect().contains(place)) << title.toStdString();
  }
}

// An offer is 64 high with one line of explanation.
TEST_F(StartPageTest, AnExplanationHasAsManyLinesAsItNeeds) {
  QAbstractButton& file = *offer("Open a file…");
  const QFontMetrics metrics(qtFont(Font::system(14)));
  const int whole = metrics.horizontalAdvance(file.accessibleDescription());
  table.resize(whole + 100, 600);
  QCoreApplication::processEvents();
  EXPECT_EQ(file.height(), 64);
  table.resize(whole, 600);
  QCoreApplication::processEvents();
  EXPECT_GE(file.height(), 64 + metrics.height());
  EXPECT_LT(file.height(), 64 + 2 * metrics.height());
}

TEST_F(StartPageTest, AModemIsChosenFromAMenu) {
  QSignalSpy chosen(&page, &StartPage::modemWanted);
  page.takeKeyboard();
  QTest::keyClick(offer("Simulated modem"), Qt::Key_Return);
  const auto* const menu = page.findChild<QMenu*>();
  ASSERT_NE(menu, nullptr);
  ASSERT_EQ(menu->actions().size(), 2);
  EXPECT_EQ(menu->actions()[1]->text(), "Second && last");
  menu->actions()[1]->trigger();
  ASSERT_EQ(chosen.size(), 1);
  EXPECT_EQ(chosen[0][0].toString(), "b");
}

TEST_F(StartPageTest, AFileIsWanted) {
  QSignalSpy wanted(&page, &StartPage::fileWanted);
  QTest::mouseClick(offer("Open a file…"), Qt::LeftButton);
  EXPECT_EQ(wanted.size(), 1);
}

TEST_F(StartPageTest, APortIsChosenFromThoseThatAreThereThen) {
  QSignalSpy chosen(&page, &StartPage::portWanted);
  QTest::mouseClick(offer("Connect to a port"), Qt::LeftButton);
  page.findChild<QMenu*>()->actions()[0]->trigger();
  ASSERT_EQ(chosen.size(), 1);
  EXPECT_EQ(chosen[0][0].toString(), "auto");
}

}  // namespace
}  // namespace varnel
