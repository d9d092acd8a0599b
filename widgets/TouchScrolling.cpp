#include "widgets/TouchScrolling.h"

#include <QApplication>
#include <QContextMenuEvent>
#include <QScrollBar>
#include <QScrollEvent>
#include <QScrollPrepareEvent>
#include <QScroller>
#include <QStyleHints>
#include <QTouchEvent>
#include <utility>

namespace varnel {

namespace {

// A finger that moves mostly along one axis scrolls only along that axis.
constexpr double axisLock = 0.75;

// Passes touches to the scroller directly. The toolkit would set up a gesture recognizer per table, and never
// free it.
void tell(QWidget& viewport, QScroller::Input input, const QTouchEvent& event) {
  if (event.points().isEmpty()) return;
  const auto time_ms = static_cast<qint64>(event.timestamp());
  QScroller::scroller(&viewport)->handleInput(input, event.points().front().position(), time_ms);
}

bool isNear(const QPointF& place, const QPointF& began) {
  return (place - began).manhattanLength() < QApplication::startDragDistance();
}

void setUp(QScroller& scroller) {
  QScrollerProperties properties = scroller.scrollerProperties();
  properties.setScrollMetric(QScrollerProperties::AxisLockThreshold, axisLock);
  const auto never = QVariant::fromValue(QScrollerProperties::OvershootAlwaysOff);
  properties.setScrollMetric(QScrollerProperties::HorizontalOvershootPolicy, never);
  properties.setScrollMetric(QScrollerProperties::VerticalOvershootPolicy, never);
  scroller.setScrollerProperties(properties);
}

}  // namespace

TouchScrolling::TouchScrolling(QAbstractScrollArea& area, RowAt rowAt, Tapped tapped)
    : _area(area), _rowAt(std::move(rowAt)), _tapped(std::move(tapped)) {
  _area.viewport()->setAttribute(Qt::WA_AcceptTouchEvents);
  setUp(*QScroller::scroller(_area.viewport()));
  _rest.setSingleShot(true);
  QObject::connect(&_rest, &QTimer::timeout, &_rest, [this] { askForMenu(); });
}

bool TouchScrolling::take(QEvent& event) {
  switch (event.type()) {
    case QEvent::ScrollPrepare:
      prepare(static_cast<QScrollPrepareEvent&>(event));
      return true;
    case QEvent::Scroll:
      scroll(static_cast<QScrollEvent&>(event));
      return true;
    case QEvent::TouchBegin:
      begin(static_cast<QTouchEvent&>(event));
      return true;
    case QEvent::TouchEnd:
      end(static_cast<QTouchEvent&>(event));
      return true;
    case QEvent::TouchUpdate:
      move(static_cast<QTouchEvent&>(event));
      return true;
    case QEvent::TouchCancel:
      event.accept();
      _tapBegan.reset();
      _rest.stop();
      QScroller::scroller(_area.viewport())->stop();
      return true;
    default:
      return false;
  }
}

void TouchScrolling::prepare(QScrollPrepareEvent& event) {
  if (_rowAt) _row = _rowAt(event.startPos().toPoint());
  const QScrollBar& bar = *_area.verticalScrollBar();
  event.setViewportSize(_area.viewport()->size());
  event.setContentPosRange({0, 0, sidewaysRange(), static_cast<double>(bar.maximum())});
  event.setContentPos({sidewaysPosition(), static_cast<double>(bar.value())});
  event.accept();
}

double TouchScrolling::sidewaysRange() const {
  if (!_rowAt) return _area.horizontalScrollBar()->maximum();
  return _row ? _row->sidewaysRange() : 0;
}

double TouchScrolling::sidewaysPosition() const {
  if (!_rowAt) return _area.horizontalScrollBar()->value();
  return _row ? _row->sidewaysPosition() : 0;
}

void TouchScrolling::scroll(QScrollEvent& event) {
  _area.verticalScrollBar()->setValue(qRound(event.contentPos().y()));
  if (!_rowAt) _area.horizontalScrollBar()->setValue(qRound(event.contentPos().x()));
  if (_row) _row->scrollSidewaysTo(event.contentPos().x());
  event.accept();
}

void TouchScrolling::begin(QTouchEvent& event) {
  // Accepted, so that the toolkit makes no mouse event from it.
  event.accept();
  const bool stopsMovement = QScroller::scroller(_area.viewport())->state() == QScroller::Scrolling;
  _tapBegan.reset();
  _rest.stop();
  if (!stopsMovement && event.points().size() == 1) {
    _tapBegan = event.points().front().position();
    _rest.start(QGuiApplication::styleHints()->mousePressAndHoldInterval());
  }
  tell(*_area.viewport(), QScroller::InputPress, event);
}

void TouchScrolling::move(QTouchEvent& event) {
  event.accept();
  if (_tapBegan && !event.points().isEmpty() && !isNear(event.points().front().position(), *_tapBegan))
    _rest.stop();
  tell(*_area.viewport(), QScroller::InputMove, event);
}

void TouchScrolling::end(QTouchEvent& event) {
  event.accept();
  _rest.stop();
  tell(*_area.viewport(), QScroller::InputRelease, event);
  const auto began = std::exchange(_tapBegan, std::nullopt);
  if (!began || event.points().isEmpty()) return;
  if (isNear(event.points().front().position(), *began)) _tapped(began->toPoint());
}

void TouchScrolling::askForMenu() {
  const auto place = std::exchange(_tapBegan, std::nullopt);
  if (!place) return;
  // The menu takes the end of the touch.
  QScroller::scroller(_area.viewport())->stop();
  QContextMenuEvent wish(QContextMenuEvent::Other, place->toPoint(),
                         _area.viewport()->mapToGlobal(place->toPoint()));
  QCoreApplication::sendEvent(_area.viewport(), &wish);
}

}  // namespace varnel
