#include "widgets/ToolbarWidget.h"

#include <gtest/gtest.h>

#include <QApplication>
#include <QHelpEvent>
#include <QLabel>
#include <QTest>
#include <QToolTip>

#include "widgets/SpinnerWidget.h"
#include "widgets/TextButton.h"

namespace varnel {
namespace {

class ToolbarWidgetTest : public testing::Test {
 protected:
  void show(bool isLoading, const std::string& status, std::function<void()> save) {
    toolbar.setItems({ActivityIndicator{isLoading}, ToolbarLabel{status, Font::system(14)}, FlexibleSpace{},
                      BarButton{BarButton::SystemItem::Save, std::move(save)}});
    toolbar.resize(360, 48);
    toolbar.show();
    QCoreApplication::processEvents();
  }
  SpinnerWidget& spinner() { return *dynamic_cast<SpinnerWidget*>(toolbar.layout()->itemAt(0)->widget()); }
  QLabel& label() { return *toolbar.findChild<QLabel*>(); }
  TextButton& button() { return *toolbar.findChild<TextButton*>(); }

  ToolbarWidget toolbar;
};

TEST_F(ToolbarWidgetTest, ItemsStandFromLeftToRight) {
  show(true, "Connecting...", [] {});
  EXPECT_TRUE(spinner().isVisible());
  EXPECT_EQ(label().text(), "Connecting...");
  EXPECT_EQ(label().font().pixelSize(), 14);
  EXPECT_LT(spinner().geometry().right(), label().geometry().left());
  EXPECT_EQ(button().geometry().right(), 359) << "the space takes what is left";
  EXPECT_EQ(button().text(), "Save");
}

TEST_F(ToolbarWidgetTest, AnIndicatorThatStandsStillTakesNoRoom) {
  show(false, "Updated 2024-03-01 at 14:05:09", [] {});
  EXPECT_FALSE(spinner().isVisible());
  EXPECT_EQ(label().geometry().left(), 10);
}

TEST_F(ToolbarWidgetTest, TheStatusIsNotCutAt360) {
  show(false, "Updated 2024-03-01 at 14:05:09", [] {});
  EXPECT_LE(label().sizeHint().width(), label().width());
}

TEST_F(ToolbarWidgetTest, AStatusThatIsCutHasATooltip) {
  const auto ask = [this] {
    QHelpEvent question(QEvent::ToolTip, QPoint(5, 5), label().mapToGlobal(QPoint(5, 5)));
    QApplication::sendEvent(&label(), &question);
    return QToolTip::text();
  };
  show(false, "Updated", [] {});
  EXPECT_EQ(ask(), "");
  show(false, std::string(30, 'a') + " <b>" + std::string(30, 'b'), [] {});
  ASSERT_GT(label().sizeHint().width(), label().width());
  EXPECT_TRUE(ask().contains(QString(30, 'a') + " &lt;b&gt;")) << ask().toStdString();
  QToolTip::hideText();
}

TEST_F(ToolbarWidgetTest, ItemsOfTheSameKindsMakeNoWidgets) {
  show(true, "Connecting...", [] {});
  const QLabel* before = &label();
  unsigned presses = 0;
  show(false, "Updated", [&] { ++presses; });
  EXPECT_EQ(&label(), before);
  EXPECT_EQ(label().text(), "Updated");
  QTest::mouseClick(&button(), Qt::LeftButton);
  EXPECT_EQ(presses, 1u) << "the action is the new one";
}

TEST_F(ToolbarWidgetTest, AnActionMaySetOtherItems) {
  show(true, "Before", [this] { toolbar.setItems({ToolbarLabel{"After", Font::system(14)}}); });
  QTest::mouseClick(&button(), Qt::LeftButton);
  QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
  EXPECT_EQ(label().text(), "After");
  EXPECT_EQ(toolbar.findChildren<QAbstractButton*>().size(), 0);
}

TEST_F(ToolbarWidgetTest, TextsAreNoMarkUp) {
  show(false, "<b>&bold</b>", [] {});
  EXPECT_EQ(label().textFormat(), Qt::PlainText);
}

TEST_F(ToolbarWidgetTest, TheKeyboardPressesTheButton) {
  unsigned presses = 0;
  show(false, "", [&] { ++presses; });
  QTest::keyClick(&button(), Qt::Key_Return);
  QTest::keyClick(&button(), Qt::Key_Space);
  EXPECT_EQ(presses, 2u);
}

}  // namespace
}  // namespace varnel
