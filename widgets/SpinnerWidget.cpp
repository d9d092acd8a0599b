#include "widgets/SpinnerWidget.h"

#include <QPainter>
#include <QTimerEvent>

#include "widgets/Motion.h"

namespace varnel {

namespace {

constexpr int side = 20;
constexpr int spokes = 12;
constexpr int stepTime_ms = 83;  // a turn a second

}  // namespace

SpinnerWidget::SpinnerWidget(QWidget* parent) : QWidget(parent) {
  setSizePolicy(QSizePolicy::Fixed, QSizePolicy::Fixed);
  setAccessibleName(QStringLiteral("Busy"));
}

void SpinnerWidget::setAnimating(bool isAnimating) { setVisible(isAnimating); }

QSize SpinnerWidget::sizeHint() const { return {side, side}; }

void SpinnerWidget::paintEvent(QPaintEvent*) {
  QPainter painter(this);
  painter.setRenderHint(QPainter::Antialiasing);
  painter.translate(width() / 2.0, height() / 2.0);
  painter.rotate(360.0 / spokes * _step);
  QColor colour = palette().color(QPalette::WindowText);
  for (int spoke = 0; spoke < spokes; ++spoke) {
    // The foremost spoke is the darkest of the greys.
    colour.setAlphaF(0.15F + 0.5F * static_cast<float>(spoke) / (spokes - 1));
    painter.setPen(QPen(colour, 2, Qt::SolidLine, Qt::RoundCap));
    painter.rotate(360.0 / spokes);
    painter.drawLine(QPointF(0, -4.5), QPointF(0, -8.5));
  }
}

void SpinnerWidget::timerEvent(QTimerEvent* event) {
  if (event->timerId() != _timer.timerId()) return QWidget::timerEvent(event);
  _step = (_step + 1) % spokes;
  update();
}

void SpinnerWidget::showEvent(QShowEvent* event) {
  QWidget::showEvent(event);
  if (desktopWantsMotion()) _timer.start(stepTime_ms, this);
}

void SpinnerWidget::hideEvent(QHideEvent* event) {
  _timer.stop();
  QWidget::hideEvent(event);
}

}  // namespace varnel
