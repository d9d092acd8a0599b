#include "widgets/SpinnerWidget.h"

#include <QPainter>
#include <QTimerEvent>

#include "widgets/Motion.h"

namespace varnel {

namespace {

constexpr int side = 20;
constexpr int spokes = 12;
constexpr std::chrono::milliseconds fastStep(83);  // one turn per second
// After this, the notice says why it takes so long, and the wheel need not wake the machine so often.
constexpr int stepsAtFullSpeed = 3 * spokes;
constexpr std::chrono::milliseconds slowStep(2000);

}  // namespace

SpinnerWidget::SpinnerWidget(QWidget* parent) : QWidget(parent) {
  setSizePolicy(QSizePolicy::Fixed, QSizePolicy::Fixed);
  setAccessibleName(QStringLiteral("Busy"));
}

void SpinnerWidget::setAnimating(bool isAnimating) { setVisible(isAnimating); }

QSize SpinnerWidget::sizeHint() const { return {side, side}; }

std::chrono::milliseconds SpinnerWidget::timeOfPicture() const {
  return _step < stepsAtFullSpeed ? fastStep : slowStep;
}

void SpinnerWidget::turn() { _timer.start(static_cast<int>(timeOfPicture().count()), this); }

void SpinnerWidget::paintEvent(QPaintEvent*) {
  QPainter painter(this);
  painter.setRenderHint(QPainter::Antialiasing);
  painter.translate(width() / 2.0, height() / 2.0);
  painter.rotate(360.0 / spokes * _step);
  QColor color = palette().color(QPalette::WindowText);
  for (int spoke = 0; spoke < spokes; ++spoke) {
    // The foremost spoke is the darkest gray.
    color.setAlphaF(0.15F + 0.5F * static_cast<float>(spoke) / (spokes - 1));
    painter.setPen(QPen(color, 2, Qt::SolidLine, Qt::RoundCap));
    painter.rotate(360.0 / spokes);
    painter.drawLine(QPointF(0, -4.5), QPointF(0, -8.5));
  }
}

void SpinnerWidget::timerEvent(QTimerEvent* event) {
  if (event->timerId() != _timer.timerId()) return QWidget::timerEvent(event);
  if (++_step == stepsAtFullSpeed) turn();
  update();
}

void SpinnerWidget::showEvent(QShowEvent* event) {
  QWidget::showEvent(event);
  _step = 0;
  if (desktopWantsMotion()) turn();
}

void SpinnerWidget::hideEvent(QHideEvent* event) {
  _timer.stop();
  QWidget::hideEvent(event);
}

}  // namespace varnel
