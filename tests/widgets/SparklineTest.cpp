#include "widgets/Sparkline.h"

#include <gtest/gtest.h>

#include <QImage>

namespace varnel {
namespace {

// The rows of pixels that a sparkline of 100 × 20 in black covers in a column of pixels; (-1, -1) for none.
struct Covered {
  int top = -1, bottom = -1;
  friend bool operator==(const Covered&, const Covered&) = default;
};

class SparklineTest : public testing::Test {
 protected:
  Sparkline::Look look{{100, 20}, Qt::black, Qt::black, 1};

  QImage paint(const Sparkline::Look& wanted) {
    QImage image((wanted.size * wanted.pixelRatio).toSize(), QImage::Format_RGB32);
    image.setDevicePixelRatio(wanted.pixelRatio);
    image.fill(Qt::white);
    QPainter painter(&image);
    line.paint(painter, {0, 0}, wanted);
    return image;
  }
  Covered coveredAt(int x) {
    const QImage image = paint(look);
    Covered covered;
    for (int y = 0; y < image.height(); ++y) {
      if (qGray(image.pixel(x, y)) > 160) continue;
      if (covered.top < 0) covered.top = y;
      covered.bottom = y;
    }
    return covered;
  }

  Sparkline line;
};

TEST_F(SparklineTest, TheLowestValueIsAtTheBottomAndTheHighestAtTheTop) {
  line.setCourse({-100, -80});
  EXPECT_GE(coveredAt(3).bottom, 16);
  EXPECT_LE(coveredAt(96).top, 3);
}

TEST_F(SparklineTest, AValueThatDoesNotChangeIsALineInTheMiddle) {
  line.setCourse({7, 7, 7});
  EXPECT_FALSE(line.changes());
  for (const int x : {10, 50, 90}) {
    EXPECT_NEAR(coveredAt(x).top, 9, 1) << x;
    EXPECT_NEAR(coveredAt(x).bottom, 10, 1) << x;
  }
}

TEST_F(SparklineTest, AGapIsLeftOpen) {
  line.setCourse({1, 1, std::nullopt, 1, 1});
  EXPECT_NE(coveredAt(10), Covered());
  EXPECT_EQ(coveredAt(50), Covered());
  EXPECT_NE(coveredAt(90), Covered());
}

TEST_F(SparklineTest, OneValueIsNoLine) {
  line.setCourse({});
  EXPECT_FALSE(line.hasLine());
  line.setCourse({std::nullopt, 5});
  EXPECT_FALSE(line.hasLine());
  line.setCourse({4, 5});
  EXPECT_TRUE(line.hasLine());
}

TEST_F(SparklineTest, IsDrawnAnewOnlyWhenSomethingOfItChanges) {
  line.setCourse({1, 2, 3});
  paint(look);
  paint(look);
  EXPECT_EQ(line.timesDrawn(), 1u);
  line.setCourse({1, 2, 3});
  paint(look);
  EXPECT_EQ(line.timesDrawn(), 1u);
  line.setCourse({1, 2, 4});
  paint(look);
  EXPECT_EQ(line.timesDrawn(), 2u);
  look.line = Qt::gray;
  paint(look);
  EXPECT_EQ(line.timesDrawn(), 3u);
}

TEST_F(SparklineTest, HasThePixelsOfTheScreen) {
  line.setCourse({7, 7});
  look.pixelRatio = 2;
  const QImage image = paint(look);
  EXPECT_EQ(image.size(), QSize(200, 40));
  // 1.25 points are 2.5 pixels: two of them are wholly black.
  int black = 0;
  for (int y = 0; y < 40; ++y) black += qGray(image.pixel(100, y)) < 10 ? 1 : 0;
  EXPECT_GE(black, 1);
  EXPECT_LE(black, 3);
}

}  // namespace
}  // namespace varnel
