#include "programs/varnel/trends/EventLegend.h"

#include <QFontMetricsF>
#include <QPainter>
#include <algorithm>
#include <cmath>

namespace varnel {

namespace {

constexpr double margin = 12, markGap = 5, entryGap = 18;

QString textOf(std::string_view name) {
  return QString::fromUtf8(name.data(), static_cast<qsizetype>(name.size()));
}

double lineHeight(const QFont& font) { return std::ceil(QFontMetricsF(font).height() * 1.2); }

}  // namespace

// A shape for each kind, since colors alone do not tell everybody.
QPainterPath eventMark(EventKind kind, QPointF center) {
  const double r = eventMarkSize / 2;
  QPainterPath path;
  const auto polygon = [&](std::initializer_list<QPointF> points) {
    QPolygonF shape;
    for (const QPointF& point : points) shape << center + point * r;
    path.addPolygon(shape);
    path.closeSubpath();
  };
  switch (kind) {
    case EventKind::CellChange:
      polygon({{-1, -0.8}, {1, -0.8}, {0, 1}});
      break;
    case EventKind::Handover:
      polygon({{0, -1.1}, {1.1, 0}, {0, 1.1}, {-1.1, 0}});
      break;
    case EventKind::LossOfService:
      polygon({{-1, -0.6},
               {-0.6, -1},
               {0, -0.4},
               {0.6, -1},
               {1, -0.6},
               {0.4, 0},
               {1, 0.6},
               {0.6, 1},
               {0, 0.4},
               {-0.6, 1},
               {-1, 0.6},
               {-0.4, 0}});
      break;
    case EventKind::ReturnOfService:
      path.addEllipse(center, r, r);
      break;
    case EventKind::Registration:
      path.addRect(QRectF(center - QPointF(r, r) * 0.85, QSizeF(r, r) * 1.7));
      break;
    case EventKind::Connection:
      path.addRect(QRectF(center.x() - 1, center.y() - r, 2, 2 * r));
      break;
    case EventKind::UnknownVersion:
      path.addEllipse(center, r, r);
      path.addEllipse(center, r * 0.5, r * 0.5);
      break;
  }
  return path;
}

EventLegend::EventLegend(const std::vector<TrendSource::Event>& events, const TrendLook& look) : _look(look) {
  for (const TrendSource::Event& event : events) {
    if (std::ranges::find(_entries, event.kind, &Entry::kind) == _entries.end())
      _entries.push_back({event.kind, event.kindName});
  }
  std::ranges::sort(_entries, {}, &Entry::kind);
}

QString EventLegend::text() const {
  QStringList names;
  for (const Entry& entry : _entries) names.append(textOf(entry.name));
  return names.join(QStringLiteral(", "));
}

std::vector<EventLegend::Place> EventLegend::placesFor(double width) const {
  const QFontMetricsF metrics(_look.font);
  std::vector<Place> places;
  double x = margin, y = lineHeight(_look.font) / 2;
  for (const Entry& entry : _entries) {
    const double entryWidth = eventMarkSize + markGap + metrics.horizontalAdvance(textOf(entry.name));
    if (x > margin && x + entryWidth > width - margin) {
      x = margin;
      y += lineHeight(_look.font);
    }
    places.push_back({{x, y}, entry});
    x += entryWidth + entryGap;
  }
  return places;
}

double EventLegend::heightFor(double width) const {
  if (isEmpty()) return 0;
  return placesFor(width).back().at.y() + lineHeight(_look.font) / 2;
}

void EventLegend::paint(QPainter& painter, QPointF from, double width) const {
  const QFontMetricsF metrics(_look.font);
  painter.setRenderHint(QPainter::Antialiasing);
  painter.setFont(_look.font);
  for (const Place& place : placesFor(width)) {
    const QPointF left = from + place.at;
    painter.setPen(Qt::NoPen);
    painter.setBrush(_look.text);
    painter.drawPath(eventMark(place.entry.kind, left + QPointF(eventMarkSize / 2, 0)));
    painter.setPen(_look.text);
    const double baseline = (metrics.ascent() - metrics.descent()) / 2;
    painter.drawText(left + QPointF(eventMarkSize + markGap, baseline), textOf(place.entry.name));
  }
}

void EventLegendItem::paint(QPainter* painter, const QStyleOptionGraphicsItem*, QWidget*) {
  _legend.paint(*painter, {}, _width);
}

EventLegendWidget::EventLegendWidget(QWidget* parent) : QWidget(parent) { hide(); }

void EventLegendWidget::setLegend(const EventLegend& legend) {
  if (legend == _legend) return;
  _legend = legend;
  setAccessibleName(_legend.isEmpty() ? QString() : tr("Marks of events: %1").arg(_legend.text()));
  setVisible(!_legend.isEmpty());
  fit();
  update();
}

void EventLegendWidget::fit() {
  const int height = static_cast<int>(std::ceil(_legend.heightFor(width())));
  if (height != minimumHeight()) setFixedHeight(height);
}

void EventLegendWidget::resizeEvent(QResizeEvent* event) {
  QWidget::resizeEvent(event);
  fit();
}

void EventLegendWidget::paintEvent(QPaintEvent*) {
  QPainter painter(this);
  _legend.paint(painter, {}, width());
}

}  // namespace varnel
