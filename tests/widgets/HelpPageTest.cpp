#include "widgets/HelpPage.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <QScrollBar>

#include "tests/support/TestWidgets.h"

namespace varnel {
namespace {

using testing::HasSubstr;
using testing::Not;

TEST(HelpPage, TheMeaningOfTheRowComesBeforeTheKeys) {
  const HelpPage page([] { return "This row: A > B\nIts value: 5 <b> & so on\n"; },
                      {{"Ctrl+X", "end it all"}});
  const std::string text = page.toPlainText().toStdString();
  EXPECT_THAT(text, testing::StartsWith("What it means\nThis row: A > B\n"));
  EXPECT_THAT(text, HasSubstr("Its value: 5 <b> & so on\nKeys\n")) << "values are no markup";
  EXPECT_LT(text.find("Keys"), text.find("Ctrl+X"));
  EXPECT_LT(text.find("Ctrl+X"), text.find("end it all"));
}

TEST(HelpPage, WithoutARowThereAreOnlyKeys) {
  const HelpPage page([] { return ""; }, {{"Ctrl+X", "end it all"}});
  EXPECT_THAT(page.toPlainText().toStdString(), testing::StartsWith("Keys\n"));
  EXPECT_THAT(page.toPlainText().toStdString(), Not(HasSubstr("What it means")));
}

TEST(HelpPage, FollowsTheRowAndKeepsItsPlace) {
  std::string about = "Its value: 1\n";
  HelpPage page([&] { return about; }, std::vector<KeyHelp>(60, {"Ctrl+X", "end it all"}));
  page.resize(360, 300);
  page.show();
  EXPECT_TRUE(QTest::qWaitForWindowExposed(&page, patience_ms));
  page.verticalScrollBar()->setValue(200);
  about = "Its value: 2\n";
  page.updateAbout();
  EXPECT_THAT(page.toPlainText().toStdString(), HasSubstr("Its value: 2\n"));
  EXPECT_EQ(page.verticalScrollBar()->value(), 200);
}

TEST(HelpPage, NarrowPagesWrapTheirText) {
  HelpPage page([] { return std::string(60, 'm') + ' ' + std::string(200, ' ') + "\n"; }, keysOfPanes());
  page.resize(360, 640);
  page.show();
  EXPECT_TRUE(QTest::qWaitForWindowExposed(&page, patience_ms));
  EXPECT_EQ(page.horizontalScrollBar()->maximum(), 0);
}

TEST(HelpPage, EveryActionWithAKeyIsAmongTheKeys) {
  QAction both(QStringLiteral("Find")), none(QStringLiteral("No key")), nameless;
  both.setShortcuts({QKeySequence(Qt::CTRL | Qt::Key_F), QKeySequence(Qt::Key_Slash)});
  nameless.setShortcut(QKeySequence(Qt::Key_F5));
  const auto keys = keysOf({&both, &none, &nameless});
  ASSERT_EQ(keys.size(), 1u);
  EXPECT_EQ(keys[0].keys, "Ctrl+F, /");
  EXPECT_EQ(keys[0].deed, "Find");
}

}  // namespace
}  // namespace varnel
