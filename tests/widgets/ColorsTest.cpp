#include "widgets/Colors.h"

#include <gtest/gtest.h>

#include "tests/support/TestWidgets.h"

namespace varnel {
namespace {

TEST(Colors, ContrastOfBlackAndWhiteIs21) {
  EXPECT_NEAR(contrast(Qt::black, Qt::white), 21.0, 0.001);
  EXPECT_NEAR(contrast(Qt::white, Qt::white), 1.0, 0.001);
  EXPECT_NEAR(contrast(QColor(0x77, 0x77, 0x77), Qt::white), 4.48, 0.01);
}

TEST(Colors, ABlendGoesPartOfTheWay) {
  EXPECT_EQ(blend(QColor(0, 100, 200), QColor(100, 100, 0), 0.5).rgb(), qRgb(50, 100, 100));
}

QPalette palette(const QColor& ground, const QColor& text) {
  QPalette made;
  for (const auto role : {QPalette::Window, QPalette::Base}) made.setColor(role, ground);
  for (const auto role : {QPalette::WindowText, QPalette::Text}) made.setColor(role, text);
  made.setColor(QPalette::Highlight, QColor(0x30, 0x8c, 0xc6));
  return made;
}

TEST(Colors, QuietTextIsReadableOnEachGroundAndLessThanText) {
  for (const auto& [ground, text] : {std::pair(QColor(Qt::white), QColor(Qt::black)),
                                     std::pair(QColor(30, 30, 30), QColor(240, 240, 240))}) {
    const QPalette desktop = palette(ground, text);
    EXPECT_GE(contrast(quietTextColor(desktop), ground), 4.5);
    EXPECT_GE(contrast(quietTextColor(desktop), selectionColor(desktop)), 4.5);
    EXPECT_LT(contrast(quietTextColor(desktop), ground), 0.75 * contrast(text, ground));
  }
}

// A pane of 360 × 640 in the desktop's palette.
class InPalette : public testing::TestWithParam<std::pair<QColor, QColor>> {
 protected:
  InPalette() {
    QApplication::setPalette(palette(GetParam().first, GetParam().second));
    pane.resize(360, 640);
    pane.setTitle("Varnel");
    pane.header().showBackButton("Back");
    pane.setToolbarItems({ToolbarLabel{"Updated", Font::system(14)}, FlexibleSpace{}, BarButton{}},
                         Animation::None);
    pane.toolbar().show();
    pane.table().setDelegate(&rows);
    pane.show();
    QCoreApplication::processEvents();
    picture = pane.grab().toImage();
  }
  ~InPalette() override { QApplication::setPalette(QPalette()); }

  // The highest contrast in the area to the ground, which is the area's first pixel.
  double bestContrast(const QRect& area) const {
    const QColor ground = picture.pixelColor(area.topLeft());
    double best = 0;
    for (int y = area.top(); y <= area.bottom(); ++y) {
      for (int x = area.left(); x <= area.right(); ++x)
        best = std::max(best, contrast(ground, picture.pixelColor(x, y)));
    }
    return best;
  }

  TestRows rows{{{"Serving Cell"}, {"RSRP", "-97 dBm"}}};
  PaneWidget pane;
  QImage picture;
};

TEST_P(InPalette, TextsAndMarksStandOutFromTheirGround) {
  EXPECT_EQ(picture.pixelColor(200, 400), GetParam().first) << "the ground is the desktop's";
  EXPECT_GT(bestContrast({120, 4, 120, 40}), 7) << "title";
  EXPECT_GT(bestContrast({2, 4, 100, 40}), 4) << "way back";
  EXPECT_GT(bestContrast({5, 50, 150, 45}), 7) << "name of an inner node";
  EXPECT_GT(bestContrast({335, 55, 24, 40}), 3) << "disclosure indicator";
  EXPECT_GT(bestContrast({280, 105, 78, 40}), 7) << "value";
  EXPECT_GT(bestContrast({5, 598, 150, 40}), 7) << "status";
  EXPECT_GT(bestContrast({300, 598, 58, 40}), 4) << "Save";
}

TEST_P(InPalette, TheSelectedRowIsTintedAndItsTextStandsOut) {
  pane.tableWidget().chooseRow(0);
  const QColor before = picture.pixelColor(200, 60);
  picture = pane.grab().toImage();
  EXPECT_NE(picture.pixelColor(200, 60), before);
  EXPECT_GT(bestContrast({8, 54, 150, 40}), 7);
}

INSTANTIATE_TEST_SUITE_P(, InPalette,
                         testing::Values(std::pair(QColor(Qt::white), QColor(Qt::black)),
                                         std::pair(QColor(30, 30, 30), QColor(240, 240, 240))),
                         [](const auto& info) { return info.param.first == Qt::white ? "Light" : "Dark"; });

}  // namespace
}  // namespace varnel
