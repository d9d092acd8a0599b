#include "programs/varnel/trends/TrendLines.h"

#include <QFontMetricsF>
#include <QPainter>
#include <QPainterPath>
#include <algorithm>
#include <cmath>

#include "programs/varnel/trends/EventLegend.h"

namespace varnel {

namespace {

constexpr double thinWidth = 1;  // of a value that no packet has renewed
constexpr double dotRadius = 2.5;
constexpr int bandOpacity = 70;  // of 255
constexpr double markSize = eventMarkSize;
constexpr double reachOfMarks = 7;
constexpr std::size_t mostDashes = 40;  // more of them would hide the lines
constexpr double boxPadding = 5;

bool isWeighty(EventKind kind) { return kind != EventKind::Connection && kind != EventKind::UnknownVersion; }

// The steps of a line as bars of whole points. They are upright or level, so they need no smoothing, and such
// bars are painted several times as fast as lines with pens.
class Steps {
 public:
  explicit Steps(double width) : _width(std::max(1, qRound(width))) {}

  void addLevel(double from, double to, double y) {
    const int left = near(from), right = near(to) + _width, top = near(y);
    const bool goesOn =
        _isLevel && _bars.last().top() == top && _bars.last().x() + _bars.last().width() >= left;
    if (goesOn) {
      _bars.last().setWidth(right - _bars.last().x());
    } else {
      _bars.append({left, top, right - left, _width});
    }
    _isLevel = true;
  }
  void addUpright(double x, double from, double to) {
    const auto [top, bottom] = std::minmax({near(from), near(to)});
    if (top == bottom) return;
    _bars.append({near(x), top, _width, bottom - top + _width});
    _isLevel = false;
  }
  void paint(QPainter& painter) const { painter.drawRects(_bars); }

 private:
  // Where a bar in whose middle this place is begins.
  int near(double place) const { return qRound(place - _width / 2.0); }

  int _width;
  QList<QRect> _bars;
  bool _isLevel = false;  // the last one, which may go on
};

}  // namespace

void TrendLines::show(const TrendData& data, std::vector<TrendScale> scales, const TrendLook& look) {
  _data = &data;
  _scales = std::move(scales);
  _look = look;
  update();
}

void TrendLines::setArea(const QRectF& area) {
  if (area == _area) return;
  prepareGeometryChange();
  _area = area;
}

void TrendLines::showCursor(std::optional<std::size_t> column, const QStringList& texts) {
  if (_cursor == column && _cursorTexts == texts) return;
  _cursor = column;
  _cursorTexts = texts;
  update();
}

double TrendLines::xOf(TrendSource::Duration at) const {
  const double length = millisecondsOf(_data->stretch.end - _data->stretch.begin);
  const double share = millisecondsOf(at - _data->stretch.begin) / std::max(length, 1.0);
  return _area.left() + share * _area.width();
}

double TrendLines::xOfColumn(std::size_t column) const {
  const std::size_t count =
      _data->lines.empty() ? 1 : std::max<std::size_t>(1, _data->lines.front().columns.size());
  return _area.left() + (static_cast<double>(column) + 0.5) / static_cast<double>(count) * _area.width();
}

double TrendLines::yOf(std::size_t line, double value) const {
  const TrendScale& scale = _scales[line];
  const double share = (value - scale.lowest) / (scale.highest - scale.lowest);
  return _area.bottom() - share * _area.height();
}

std::vector<TrendSource::Event> TrendLines::eventsAt(double x) const {
  std::vector<TrendSource::Event> found;
  if (!_data) return found;
  std::ranges::copy_if(_data->events, std::back_inserter(found), [&](const TrendSource::Event& event) {
    return std::abs(xOf(event.at) - x) <= reachOfMarks;
  });
  return found;
}

std::vector<TrendSource::Event> TrendLines::eventsAtColumn(std::size_t column) const {
  return _data ? eventsAt(xOfColumn(column)) : std::vector<TrendSource::Event>();
}

void TrendLines::paint(QPainter* painter, const QStyleOptionGraphicsItem*, QWidget*) {
  if (!_data || _area.isEmpty()) return;
  painter->setRenderHint(QPainter::Antialiasing);
  paintClockSets(*painter);
  paintEvents(*painter);
  painter->save();
  painter->setClipRect(_area.adjusted(-dotRadius, -dotRadius, dotRadius, dotRadius));
  for (std::size_t line = 0; line < _data->lines.size(); ++line) paintLine(*painter, line);
  painter->restore();
  paintPlaying(*painter);
  paintCursor(*painter);
}

void TrendLines::paintClockSets(QPainter& painter) const {
  QPen pen(_look.text, 1, Qt::DotLine);
  painter.setPen(pen);
  for (const double at : _data->clockSets) {
    const double x = xOf(std::chrono::nanoseconds(static_cast<std::int64_t>(at * 1e6)));
    painter.drawLine(QPointF(x, _area.top()), QPointF(x, _area.bottom()));
  }
}

void TrendLines::paintEvents(QPainter& painter) const {
  const bool isCrowded = _data->events.size() > mostDashes;
  QColor faint = _look.text;
  faint.setAlpha(110);
  double lastX = -2 * markSize;
  for (const TrendSource::Event& event : _data->events) {
    const double x = xOf(event.at);
    if (!isCrowded && isWeighty(event.kind)) {
      painter.setPen(QPen(faint, 1, Qt::DashLine));
      painter.drawLine(QPointF(x, _area.top() + markSize), QPointF(x, _area.bottom()));
    }
    // Of marks in one place, the first one is shown. Its tooltip tells of all.
    if (x - lastX < markSize / 2) continue;
    lastX = x;
    painter.setPen(QPen(_look.ground, 1));
    painter.setBrush(_look.text);
    painter.drawPath(eventMark(event.kind, {x, _area.top() + markSize / 2}));
  }
}

void TrendLines::paintLine(QPainter& painter, std::size_t line) const {
  const auto& columns = _data->lines[line].columns;
  const QPen pen = _look.penOf(line);
  QColor band = pen.color();
  band.setAlpha(bandOpacity);
  Steps renewed(pen.widthF()), stale(thinWidth),
      bands(_area.width() / static_cast<double>(std::max<std::size_t>(1, columns.size())));
  std::vector<QPointF> dots;
  for (std::size_t i = 0; i < columns.size(); ++i) {
    const auto& column = columns[i];
    if (column.isEmpty) continue;
    const double x = xOfColumn(i), y = yOf(line, column.mean);
    if (column.lowest < column.highest)
      bands.addUpright(x, yOf(line, column.lowest), yOf(line, column.highest));
    const bool isJoined = i > 0 && !columns[i - 1].isEmpty && !column.followsGap;
    if (isJoined) {
      const double beforeY = yOf(line, columns[i - 1].mean);
      (columns[i - 1].isRenewed ? renewed : stale).addLevel(xOfColumn(i - 1), x, beforeY);
      (column.isRenewed ? renewed : stale).addUpright(x, beforeY, y);
      continue;
    }
    const bool isAlone = i + 1 == columns.size() || columns[i + 1].isEmpty || columns[i + 1].followsGap;
    if (isAlone) dots.emplace_back(x, y);
  }
  painter.setPen(Qt::NoPen);
  painter.setRenderHint(QPainter::Antialiasing, false);
  painter.setBrush(band);
  bands.paint(painter);
  painter.setBrush(pen.color());
  stale.paint(painter);
  renewed.paint(painter);
  painter.setRenderHint(QPainter::Antialiasing);
  for (const QPointF& dot : dots) painter.drawEllipse(dot, dotRadius, dotRadius);
}

void TrendLines::paintPlaying(QPainter& painter) const {
  if (!_data->playing || *_data->playing < _data->stretch.begin || *_data->playing > _data->stretch.end)
    return;
  const double x = xOf(*_data->playing);
  painter.setPen(QPen(_look.text, 2));
  painter.drawLine(QPointF(x, _area.top()), QPointF(x, _area.bottom()));
  painter.setPen(Qt::NoPen);
  painter.setBrush(_look.text);
  painter.drawPolygon(QPolygonF(
      QList<QPointF>{{x - 5, _area.bottom() + 6}, {x + 5, _area.bottom() + 6}, {x, _area.bottom() - 2}}));
}

void TrendLines::paintCursor(QPainter& painter) const {
  if (!_cursor) return;
  const double x = xOfColumn(*_cursor);
  painter.setPen(QPen(_look.text, 1));
  painter.drawLine(QPointF(x, _area.top()), QPointF(x, _area.bottom()));
  for (std::size_t line = 0; line < _data->lines.size(); ++line) {
    const auto& columns = _data->lines[line].columns;
    if (*_cursor >= columns.size() || columns[*_cursor].isEmpty) continue;
    painter.setPen(QPen(_look.ground, 1));
    painter.setBrush(_look.penOf(line).color());
    painter.drawEllipse(QPointF(x, yOf(line, columns[*_cursor].last)), dotRadius + 2, dotRadius + 2);
  }
  if (_cursorTexts.isEmpty()) return;
  const QFontMetricsF metrics(_look.font);
  double width = 0;
  for (const QString& text : _cursorTexts) width = std::max(width, metrics.horizontalAdvance(text));
  const QSizeF size(std::min(width + 2 * boxPadding, _area.width()),
                    metrics.height() * static_cast<double>(_cursorTexts.size()) + 2 * boxPadding);
  // Beside the cursor, where there is more room.
  const bool isLeft = x > _area.center().x();
  double left = isLeft ? x - boxPadding - size.width() : x + boxPadding;
  left = std::clamp(left, _area.left(), std::max(_area.left(), _area.right() - size.width()));
  const QRectF box(QPointF(left, _area.top() + markSize + 2), size);
  QColor ground = _look.ground;
  ground.setAlpha(235);
  painter.setPen(QPen(_look.grid, 1));
  painter.setBrush(ground);
  painter.drawRoundedRect(box, 3, 3);
  painter.setFont(_look.font);
  double y = box.top() + boxPadding;
  for (qsizetype i = 0; i < _cursorTexts.size(); ++i) {
    const auto line = static_cast<std::size_t>(i) - 1;
    const bool isOfLine = i > 0 && line < _data->lines.size();
    painter.setPen(isOfLine ? _look.penOf(line).color() : _look.text);
    const QRectF row(box.left() + boxPadding, y, size.width() - 2 * boxPadding, metrics.height());
    painter.drawText(row, Qt::AlignLeft | Qt::AlignVCenter,
                     metrics.elidedText(_cursorTexts[i], Qt::ElideRight, row.width() + 1));
    y += metrics.height();
  }
}

}  // namespace varnel
