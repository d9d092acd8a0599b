#include "programs/shared/Legend.h"

#include <QFont>
#include <QFontMetricsF>
#include <QGraphicsLineItem>
#include <QGraphicsSimpleTextItem>

namespace varnel {

namespace {

constexpr double markWidth = 36, markThickness = 3;
constexpr double markGap = 6, entryGap = 24, margin = 16;

}  // namespace

Legend::Legend(const std::vector<LegendEntry>& entries, double width) {
  const QFont font = QGraphicsSimpleTextItem().font();
  const QFontMetricsF metrics(font);
  const double rowHeight = metrics.height() * 1.3;
  const double widestText = width - 2 * margin - markWidth - markGap;
  double x = margin, y = 0;
  for (const LegendEntry& entry : entries) {
    const QString text = metrics.elidedText(entry.text, Qt::ElideMiddle, widestText);
    const double entryWidth = markWidth + markGap + metrics.horizontalAdvance(text);
    if (x > margin && x + entryWidth > width - margin) {
      x = margin;
      y += rowHeight;
    }
    auto* mark = new QGraphicsLineItem(x, y + metrics.height() / 2, x + markWidth, y + metrics.height() / 2);
    QPen pen = entry.pen;
    pen.setWidthF(markThickness);
    mark->setPen(pen);
    addToGroup(mark);
    auto* label = new QGraphicsSimpleTextItem(text);
    label->setFont(font);
    label->setPos(x + markWidth + markGap, y);
    addToGroup(label);
    x += entryWidth + entryGap;
  }
  _height = y + rowHeight + margin / 2;
}

}  // namespace varnel
