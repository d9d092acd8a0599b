#include "widgets/PaintedScrollContainer.h"

#include <QLinearGradient>
#include <algorithm>

#include "widgets/QtValues.h"

namespace varnel {

namespace {

constexpr double barThickness = 2;
constexpr double barInset = 10;  // at both ends
constexpr double barBottom = 4;  // between the bar and the container's edge
constexpr double shortestBar = 24;

// For a text that goes on past an edge.
constexpr double fadeWidth = 14;
constexpr double dotsWidth = 24;
constexpr double dotRadius = 1.5;
constexpr double firstDot = 6;  // from the edge to its middle, and from there to the middle of the next dot
constexpr int dots = 3;

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

double PaintedScrollContainer::endOfTexts() const {
  double end = 0;
  for (const auto& label : _labels) end = std::max(end, label->endOfText());
  return end;
}

bool PaintedScrollContainer::hasMoreThanFits() const { return range() > 0 && endOfTexts() > _frame.width; }

bool PaintedScrollContainer::goesOnPast(Edge edge) const {
  if (edge == Edge::Right) return endOfTexts() - _position > _frame.width;
  return std::ranges::any_of(_labels, [this](const auto& label) {
    return !label->shownText().isEmpty() && label->frame().left() < _position;
  });
}

double PaintedScrollContainer::range() const { return std::max(0.0, _contentSize.width - _frame.width); }

void PaintedScrollContainer::scrollTo(double position) {
  const double reached = std::clamp(position, 0.0, range());
  if (reached == _position) return;
  _position = reached;
  _row.update();
}

void PaintedScrollContainer::paint(QPainter& painter, const Colors& colors) const {
  painter.save();
  painter.setClipRect(qtRect(_frame));
  painter.translate(_frame.x - _position, _frame.y);
  for (const auto& label : _labels) {
    painter.setPen(label == _labels.front() ? colors.name : colors.value);
    label->paint(painter);
  }
  painter.restore();
  if (range() <= 0) return;
  for (const Edge edge : {Edge::Left, Edge::Right}) {
    if (goesOnPast(edge)) paintMore(painter, edge, colors);
  }
  paintBar(painter, colors.bar);
}

void PaintedScrollContainer::paintMore(QPainter& painter, Edge edge, const Colors& colors) const {
  painter.save();
  painter.setRenderHint(QPainter::Antialiasing);
  painter.setPen(Qt::NoPen);
  // From here on, x is the distance from the edge.
  painter.translate(edge == Edge::Left ? _frame.x : _frame.x + _frame.width, _frame.y);
  if (edge == Edge::Right) painter.scale(-1, 1);
  QLinearGradient fade(dotsWidth, 0, dotsWidth + fadeWidth, 0);
  QColor transparent = colors.ground;
  transparent.setAlpha(0);
  fade.setColorAt(0, colors.ground);
  fade.setColorAt(1, transparent);
  painter.fillRect(QRectF(0, 0, dotsWidth + fadeWidth, _frame.height), fade);
  painter.setBrush(colors.mark);
  for (int dot = 1; dot <= dots; ++dot)
    painter.drawEllipse(QPointF(dot * firstDot, _frame.height / 2), dotRadius, dotRadius);
  painter.restore();
}

void PaintedScrollContainer::paintBar(QPainter& painter, const QColor& color) const {
  const double track = _frame.width - 2 * barInset;
  const double length = std::min(track, std::max(shortestBar, track * _frame.width / _contentSize.width));
  const double left = _frame.x + barInset + (track - length) * _position / range();
  const double top = _frame.y + _frame.height - barBottom - barThickness;
  painter.save();
  painter.setRenderHint(QPainter::Antialiasing);
  painter.setPen(Qt::NoPen);
  painter.setBrush(color);
  painter.drawRoundedRect(QRectF(left, top, length, barThickness), barThickness / 2, barThickness / 2);
  painter.restore();
}

}  // namespace varnel
