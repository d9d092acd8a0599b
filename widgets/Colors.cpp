#include "widgets/Colors.h"

#include <algorithm>
#include <cmath>

namespace varnel {

namespace {

// The lowest contrast at which small text is easy to read (WCAG 2.1, level AA).
constexpr double readable = 4.5;
// The lowest contrast at which a mark is easy to see (WCAG 2.1, 1.4.11).
constexpr double visible = 3;

// The color, or one so near to the text's color that it has this contrast to the ground.
QColor withContrast(double least, const QColor& color, const QColor& text, const QColor& ground) {
  double share = 0;
  while (share < 1 && contrast(blend(color, text, share), ground) < least) share += 0.05;
  return blend(color, text, std::min(share, 1.0));
}

double linear(double channel) {
  return channel <= 0.04045 ? channel / 12.92 : std::pow((channel + 0.055) / 1.055, 2.4);
}

double luminance(const QColor& color) {
  return 0.2126 * linear(color.redF()) + 0.7152 * linear(color.greenF()) + 0.0722 * linear(color.blueF());
}

}  // namespace

QColor blend(const QColor& from, const QColor& to, double share) {
  const auto mixed = [share](float a, float b) {
    return static_cast<float>((1 - share) * static_cast<double>(a) + share * static_cast<double>(b));
  };
  return QColor::fromRgbF(mixed(from.redF(), to.redF()), mixed(from.greenF(), to.greenF()),
                          mixed(from.blueF(), to.blueF()));
}

double contrast(const QColor& one, const QColor& other) {
  const auto [dark, light] = std::minmax({luminance(one), luminance(other)});
  return (light + 0.05) / (dark + 0.05);
}

QColor separatorColor(const QPalette& palette) {
  return blend(palette.color(QPalette::Base), palette.color(QPalette::Text), 0.16);
}

QColor barColor(const QPalette& palette) {
  return blend(palette.color(QPalette::Base), palette.color(QPalette::Text), 0.3);
}

QColor markColor(const QPalette& palette) {
  return blend(palette.color(QPalette::Base), palette.color(QPalette::Text), 0.5);
}

QColor quietTextColor(const QPalette& palette) {
  const QColor ground = selectionColor(palette);
  const QColor text = palette.color(QPalette::Text);
  double share = 0.6;
  while (share < 1 && contrast(blend(ground, text, share), ground) < readable) share += 0.05;
  return blend(ground, text, std::min(share, 1.0));
}

QColor selectionColor(const QPalette& palette) {
  return blend(palette.color(QPalette::Base), palette.color(QPalette::Highlight), 0.3);
}

QColor paleSelectionColor(const QPalette& palette) {
  return blend(palette.color(QPalette::Base), palette.color(QPalette::Highlight), 0.1);
}

QColor accentColor(const QPalette& palette, const QColor& ground) {
  return withContrast(readable, palette.color(QPalette::Highlight), palette.color(QPalette::WindowText),
                      ground);
}

QColor dimmedTextColor(const QPalette& palette, const QColor& ground) {
  return withContrast(readable, markColor(palette), palette.color(QPalette::Text), ground);
}

QColor seenOn(const QColor& ground, const QColor& color, const QColor& text) {
  return withContrast(visible, color, text, ground);
}

}  // namespace varnel
