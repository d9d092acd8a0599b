#include "widgets/FontMetrics.h"

#include <gtest/gtest.h>

#include <QImage>
#include <QPainter>
#include <QWidget>

#include "widgets/PaintedLabel.h"
#include "widgets/QtValues.h"

namespace varnel {
namespace {

// The number of dark pixels of a label that is larger than its text by this much on the right and below.
int inkOf(std::string_view text, const Font& font, double more) {
  const Size size = FontMetrics().sizeOfText(text, font);
  QWidget row;
  PaintedLabel label(row);
  label.setFont(font);
  label.setText(text);
  label.setFrame({10, 10, size.width + more, size.height});
  QImage image(800, 60, QImage::Format_RGB32);
  image.fill(Qt::white);
  QPainter painter(&image);
  painter.setPen(Qt::black);
  label.paint(painter);
  painter.end();
  int ink = 0;
  for (int y = 0; y < image.height(); ++y) {
    for (int x = 0; x < image.width(); ++x) ink += qGray(image.pixel(x, y)) < 128 ? 1 : 0;
  }
  return ink;
}

TEST(FontMetrics, ALabelOfThatSizeShowsTheTextWhole) {
  for (const char* text : {"RSRP", "-97.25 dBm", "MM_WAIT_FOR_ADDITIONAL_OUTGOING_MM_ CONNECTION", "Größe"}) {
    const Font font = Font::boldSystem(15);
    EXPECT_GT(inkOf(text, font, 0), 20);
    EXPECT_EQ(inkOf(text, font, 0), inkOf(text, font, 200)) << text;
  }
}

TEST(FontMetrics, WidthsAreWholePixelsAndGrowWithTheText) {
  const FontMetrics metrics;
  const Size one = metrics.sizeOfText("M", Font::system(15));
  const Size two = metrics.sizeOfText("MM", Font::system(15));
  EXPECT_EQ(one.width, std::floor(one.width));
  EXPECT_GT(two.width, one.width);
  EXPECT_EQ(two.height, one.height);
  EXPECT_EQ(metrics.sizeOfText("", Font::system(15)).width, 0);
}

TEST(FontMetrics, LineEndsAndTabsAreBlanks) {
  const FontMetrics metrics;
  const Font font = Font::system(15);
  EXPECT_EQ(metrics.sizeOfText("a\nb\tc", font), metrics.sizeOfText("a b c", font));
  EXPECT_EQ(singleLine("a\nb\tc\xE2\x80\xA8"
                       "d"),
            "a b c d");
}

TEST(FontMetrics, BytesThatAreNoTextAreReplaced) { EXPECT_EQ(singleLine("a\xFF"), QString("a\uFFFD")); }

TEST(FontMetrics, AFontHasTheSizeAndWeightAskedForAndTheFamilyWhenThereIsOne) {
  EXPECT_EQ(qtFont(Font::boldSystem(15)).pixelSize(), 15);
  EXPECT_TRUE(qtFont(Font::boldSystem(15)).bold());
  EXPECT_FALSE(qtFont(Font::system(14)).bold());
  EXPECT_EQ(qtFont(Font::named("Helvetica", 13)).family(), "Helvetica");
}

}  // namespace
}  // namespace varnel
