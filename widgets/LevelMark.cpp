#include "widgets/LevelMark.h"

#include "widgets/Colors.h"

namespace varnel {

namespace {

constexpr int bars = 4;
// Whole points, so that no edge is blurred.
constexpr double barWidth = 3, gap = 2, lowestBar = 5, step = 3;

int filledBars(CellLevel level) {
  switch (level) {
    case CellLevel::None:
      return 0;
    case CellLevel::Poor:
      return 1;
    case CellLevel::Fair:
      return 2;
    case CellLevel::Good:
      return 3;
    case CellLevel::Excellent:
      return 4;
  }
  return 0;
}

}  // namespace

void paintLevelMark(QPainter& painter, const QPointF& topLeft, CellLevel level, const QColor& filled,
                    const QColor& empty) {
  if (level == CellLevel::None) return;
  for (int bar = 0; bar < bars; ++bar) {
    const double height = lowestBar + step * bar;
    const QRectF area(topLeft.x() + bar * (barWidth + gap), topLeft.y() + levelMarkSize.height() - height,
                      barWidth, height);
    painter.fillRect(area, bar < filledBars(level) ? filled : empty);
  }
}

QColor levelColor(CellLevel level, const QPalette& palette, const QColor& ground) {
  constexpr double quietness = 0.3;
  const QColor hue = level == CellLevel::Poor   ? QColor(0xD9, 0x48, 0x2B)
                     : level == CellLevel::Fair ? QColor(0xD0, 0x8A, 0x1D)
                                                : QColor(0x3B, 0x93, 0x5A);
  return seenOn(ground, blend(hue, markColor(palette), quietness), palette.color(QPalette::Text));
}

}  // namespace varnel
