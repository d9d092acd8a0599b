#include "widgets/SlideOverlay.h"

#include <QPainter>

namespace varnel {

namespace {

constexpr int duration_ms = 180;
// How far the lower picture moves, as a share of the upper one's way.
constexpr double lowerShare = 0.3;

bool bringsNewOneAbove(SlideOverlay::Movement movement) {
  return movement == SlideOverlay::Movement::Forth || movement == SlideOverlay::Movement::Rise;
}

bool isSideways(SlideOverlay::Movement movement) {
  return movement == SlideOverlay::Movement::Forth || movement == SlideOverlay::Movement::Back;
}

}  // namespace

SlideOverlay::SlideOverlay(const QPixmap& former, const QPixmap& next, Movement movement, const QRect& part,
                           QWidget& parent)
    : QWidget(&parent),
      _below(bringsNewOneAbove(movement) ? former : next),
      _above(bringsNewOneAbove(movement) ? next : former),
      _movement(movement) {
  setAttribute(Qt::WA_TransparentForMouseEvents);
  setAttribute(Qt::WA_OpaquePaintEvent);
  setGeometry(part);
  connect(&_animation, &QVariantAnimation::valueChanged, this, [this] { update(); });
  connect(&_animation, &QVariantAnimation::finished, this, &QObject::deleteLater);
  // Where the upper picture starts and where it ends, as shares of its way.
  _animation.setStartValue(bringsNewOneAbove(movement) ? 1.0 : 0.0);
  _animation.setEndValue(bringsNewOneAbove(movement) ? 0.0 : 1.0);
  _animation.setEasingCurve(QEasingCurve::OutCubic);
  _animation.setDuration(duration_ms);
  _animation.start();
}

void SlideOverlay::paintEvent(QPaintEvent*) {
  const double share = _animation.currentValue().toDouble();
  QPainter painter(this);
  painter.fillRect(rect(), palette().color(QPalette::Window));
  if (isSideways(_movement)) {
    painter.drawPixmap(QPointF(-lowerShare * (1 - share) * width(), 0), _below);
    painter.drawPixmap(QPointF(share * width(), 0), _above);
  } else {
    painter.drawPixmap(QPointF(0, 0), _below);
    painter.drawPixmap(QPointF(0, share * height()), _above);
  }
}

}  // namespace varnel
