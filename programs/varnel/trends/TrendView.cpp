#include "programs/varnel/trends/TrendView.h"

#include <QApplication>
#include <QGestureEvent>
#include <QHelpEvent>
#include <QKeyEvent>
#include <QPinchGesture>
#include <QScrollBar>
#include <QToolTip>
#include <QWheelEvent>
#include <algorithm>
#include <cmath>

namespace varnel {

namespace {

constexpr double zoomOfAKey = 0.5;
constexpr double panOfAKey = 0.2;
constexpr double wheelStep = 120;  // of a mouse with notches
constexpr double zoomOfANotch = 0.8;
constexpr qsizetype mostEventsInATooltip = 10;
constexpr qsizetype mostCursorTexts = 12;

}  // namespace

TrendView::TrendView(TrendSource& source, QWidget* parent)
    : QGraphicsView(parent), _source(source), _chart(new TrendChart) {
  _scene.addItem(_chart);
  setScene(&_scene);
  setFrameShape(QFrame::NoFrame);
  setHorizontalScrollBarPolicy(Qt::ScrollBarAlwaysOff);
  setVerticalScrollBarPolicy(Qt::ScrollBarAlwaysOff);
  setFocusPolicy(Qt::StrongFocus);
  setMouseTracking(true);
  viewport()->grabGesture(Qt::PinchGesture);
  setAccessibleName(tr("Course of values over time"));
  takeLook();
}

void TrendView::takeLook() { _chart->setLook(TrendLook::of(palette(), font())); }

void TrendView::setRows(std::vector<std::string> keys) {
  _keys = std::move(keys);
  refresh();
}

void TrendView::refresh() {
  const auto columns = static_cast<std::size_t>(std::max(1.0, std::round(_chart->lines().area().width())));
  _data = trendData(_source, _keys, _stretch.of(_source.whole()), {columns, _chart->mostTicks()});
  if (_cursor && *_cursor >= columns) _cursor.reset();
  _chart->show(_data);
  _chart->lines().showCursor(_cursor, cursorTexts());
  if (_observer) _observer();
}

QStringList TrendView::cursorTexts() const {
  if (!_cursor) return {};
  const auto length = _data.stretch.end - _data.stretch.begin;
  const std::size_t count =
      _data.lines.empty() ? 1 : std::max<std::size_t>(1, _data.lines.front().columns.size());
  const auto point =
      _data.stretch.begin + length * static_cast<std::int64_t>(*_cursor) / static_cast<std::int64_t>(count);
  QStringList texts{momentText(_source, point)};
  for (const TrendData::Line& line : _data.lines) {
    QString text = QString::fromStdString(line.row.name) + QLatin1Char(' ');
    const bool isThere = *_cursor < line.columns.size() && !line.columns[*_cursor].isEmpty;
    if (isThere) {
      const auto& column = line.columns[*_cursor];
      text += QString::fromStdString(numberText(column.last, line.summary.decimals));
      if (column.lowest < column.highest)
        text += tr(" (%1 to %2)")
                    .arg(QString::fromStdString(numberText(column.lowest, line.summary.decimals)),
                         QString::fromStdString(numberText(column.highest, line.summary.decimals)));
      if (!line.row.unit.empty()) text += QLatin1Char(' ') + QString::fromStdString(line.row.unit);
    } else {
      text += tr("no value");
    }
    texts.append(text);
  }
  // A finger has no tooltips.
  for (const TrendSource::Event& event : _chart->lines().eventsAtColumn(*_cursor)) {
    if (texts.size() == mostCursorTexts) break;
    texts.append(QString::fromStdString(event.text));
  }
  return texts;
}

void TrendView::resizeEvent(QResizeEvent* event) {
  QGraphicsView::resizeEvent(event);
  const QSizeF size = viewport()->size();
  _scene.setSceneRect(QRectF(QPointF(), size));
  _chart->resize(size);
  refresh();
}

void TrendView::changeEvent(QEvent* event) {
  QGraphicsView::changeEvent(event);
  if (event->type() != QEvent::PaletteChange && event->type() != QEvent::FontChange) return;
  takeLook();
  refresh();
}

double TrendView::shareAt(double x) const {
  const QRectF& area = _chart->lines().area();
  return area.width() > 0 ? std::clamp((x - area.left()) / area.width(), 0.0, 1.0) : 1;
}

void TrendView::wheelEvent(QWheelEvent* event) {
  const QPoint delta = event->angleDelta();
  const auto whole = _source.whole();
  if (std::abs(delta.x()) > std::abs(delta.y())) {
    _stretch.pan(-delta.x() / wheelStep * panOfAKey / 2, whole);
  } else if (delta.y() != 0) {
    const double share = shareAt(event->position().x());
    _stretch.zoom(std::pow(zoomOfANotch, delta.y() / wheelStep), share, whole);
  }
  event->accept();
  refresh();
}

bool TrendView::viewportEvent(QEvent* event) {
  if (event->type() == QEvent::ToolTip) {
    showTooltip(static_cast<const QHelpEvent&>(*event));
    return true;
  }
  if (event->type() == QEvent::Gesture) {
    pinch(static_cast<const QGestureEvent&>(*event));
    return true;
  }
  return QGraphicsView::viewportEvent(event);
}

void TrendView::pinch(const QGestureEvent& event) {
  const auto* const gesture = static_cast<const QPinchGesture*>(event.gesture(Qt::PinchGesture));
  if (!gesture || gesture->scaleFactor() <= 0) return;
  _drag.reset();
  const double x = viewport()->mapFromGlobal(gesture->centerPoint().toPoint()).x();
  _stretch.zoom(1 / gesture->scaleFactor(), shareAt(x), _source.whole());
  refresh();
}

void TrendView::showTooltip(const QHelpEvent& event) {
  const auto events = _chart->lines().eventsAt(event.pos().x());
  QStringList lines;
  for (const TrendSource::Event& found : events) {
    if (lines.size() == mostEventsInATooltip) {
      lines.append(tr("and %1 more").arg(static_cast<qsizetype>(events.size()) - lines.size()));
      break;
    }
    lines.append(momentText(_source, found.at) + QStringLiteral("  ") +
                 QString::fromStdString(found.text).toHtmlEscaped());
  }
  QToolTip::showText(event.globalPos(),
                     lines.isEmpty()
                         ? QString()
                         : QStringLiteral("<p style='white-space:pre'>") + lines.join(QStringLiteral("<br>")),
                     viewport());
}

void TrendView::mousePressEvent(QMouseEvent* event) {
  if (event->button() == Qt::LeftButton) _drag = Drag{event->position().x(), false};
  setFocus(Qt::MouseFocusReason);
}

void TrendView::mouseMoveEvent(QMouseEvent* event) {
  const double x = event->position().x();
  if (!_drag) return moveCursorTo(x);
  const double distance = x - _drag->x;
  if (!_drag->hasMoved && std::abs(distance) < QApplication::startDragDistance()) return;
  const double width = std::max(_chart->lines().area().width(), 1.0);
  _drag->hasMoved = true;
  _drag->x = x;
  setCursorColumn(std::nullopt);
  _stretch.pan(-distance / width, _source.whole());
  refresh();
}

void TrendView::mouseReleaseEvent(QMouseEvent* event) {
  const bool isTap = _drag && !_drag->hasMoved;
  _drag.reset();
  if (isTap) moveCursorTo(event->position().x());
}

void TrendView::leaveEvent(QEvent* event) {
  QGraphicsView::leaveEvent(event);
  setCursorColumn(std::nullopt);
}

void TrendView::moveCursorTo(double x) {
  const QRectF& area = _chart->lines().area();
  if (_data.lines.empty() || x < area.left() || x > area.right()) return setCursorColumn(std::nullopt);
  const auto count = static_cast<double>(_data.lines.front().columns.size());
  setCursorColumn(static_cast<std::size_t>(std::min(shareAt(x) * count, std::max(count - 1, 0.0))));
}

void TrendView::setCursorColumn(std::optional<std::size_t> column) {
  if (column == _cursor) return;
  _cursor = column;
  _chart->lines().showCursor(_cursor, cursorTexts());
  if (_observer) _observer();
}

void TrendView::stepCursor(int columns) {
  if (_data.lines.empty() || _data.lines.front().columns.empty()) return;
  const auto last = static_cast<std::int64_t>(_data.lines.front().columns.size()) - 1;
  const std::int64_t now = _cursor ? static_cast<std::int64_t>(*_cursor) : last;
  setCursorColumn(static_cast<std::size_t>(std::clamp<std::int64_t>(now + columns, 0, last)));
}

void TrendView::keyPressEvent(QKeyEvent* event) {
  const auto whole = _source.whole();
  const bool movesCursor = event->modifiers() & Qt::ShiftModifier;
  switch (event->key()) {
    case Qt::Key_Plus:
    case Qt::Key_Equal:
      _stretch.zoom(zoomOfAKey, whole);
      break;
    case Qt::Key_Minus:
      _stretch.zoom(1 / zoomOfAKey, whole);
      break;
    case Qt::Key_Left:
      if (movesCursor) return stepCursor(-1);
      _stretch.pan(-panOfAKey, whole);
      break;
    case Qt::Key_Right:
      if (movesCursor) return stepCursor(1);
      _stretch.pan(panOfAKey, whole);
      break;
    case Qt::Key_Home:
      _stretch.goToBegin(whole);
      break;
    case Qt::Key_End:
      _stretch.goToEnd(whole);
      break;
    default:
      event->ignore();
      return;
  }
  event->accept();
  refresh();
}

}  // namespace varnel
