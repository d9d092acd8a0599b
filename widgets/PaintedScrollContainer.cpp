#include "widgets/PaintedScrollContainer.h"

#include <algorithm>

#include "widgets/QtValues.h"

namespace varnel {

namespace {

constexpr double barThickness = 2;
constexpr double barInset = 10;  // at its ends
constexpr double barBottom = 4;  // between the bar and the container's edge
constexpr double shortestBar = 24;

}  // namespace

Label& PaintedScrollContainer::addLabel() {
  return *_labels.emplace_back(std::make_unique<PaintedLabel>(_row));
}

void PaintedScrollContainer::setFrame(const Rect& frame) {
  if (frame == _frame) return;
  _frame = frame;
  _row.update();
  scrollTo(_position);
}

void PaintedScrollContainer::setContentSize(const Size& size) {
  if (size == _contentSize) return;
  _contentSize = size;
  _row.update();
  scrollTo(_position);
}

double PaintedScrollContainer::endOfLabels() const {
  double end = 0;
  for (const auto& label : _labels) end = std::max(end, label->frame().right());
  return end;
}

double PaintedScrollContainer::range() const { return std::max(0.0, _contentSize.width - _frame.width); }

void PaintedScrollContainer::scrollTo(double position) {
  const double reached = std::clamp(position, 0.0, range());
  if (reached == _position) return;
  _position = reached;
  _row.update();
}

void PaintedScrollContainer::paint(QPainter& painter, const QColor& bar) const {
  painter.save();
  painter.setClipRect(qtRect(_frame));
  painter.translate(_frame.x - _position, _frame.y);
  for (const auto& label : _labels) label->paint(painter);
  painter.restore();
  if (range() > 0) paintBar(painter, bar);
}

void PaintedScrollContainer::paintBar(QPainter& painter, const QColor& colour) const {
  const double track = _frame.width - 2 * barInset;
  const double length = std::min(track, std::max(shortestBar, track * _frame.width / _contentSize.width));
  const double left = _frame.x + barInset + (track - length) * _position / range();
  const double top = _frame.y + _frame.height - barBottom - barThickness;
  painter.save();
  painter.setRenderHint(QPainter::Antialiasing);
  painter.setPen(Qt::NoPen);
  painter.setBrush(colour);
  painter.drawRoundedRect(QRectF(left, top, length, barThickness), barThickness / 2, barThickness / 2);
  painter.restore();
}

}  // namespace varnel
