#include "widgets/GlyphButton.h"

#include <QKeyEvent>
#include <QPainter>
#include <QPainterPath>

#include "widgets/Colors.h"

namespace varnel {

namespace {

constexpr int side = 44;

// Signs are painted in a square from -8 to 8.
QPainterPath triangle() {
  QPainterPath path(QPointF(-5, -8));
  path.lineTo(8, 0);
  path.lineTo(-5, 8);
  path.closeSubpath();
  return path;
}

QPainterPath bars() {
  QPainterPath path;
  path.addRect(-6, -7, 4, 14);
  path.addRect(2, -7, 4, 14);
  return path;
}

QPainterPath cross() {
  QPainterPath path(QPointF(-5, -5));
  path.lineTo(5, 5);
  path.moveTo(-5, 5);
  path.lineTo(5, -5);
  return path;
}

QPainterPath dots() {
  QPainterPath path;
  for (const double middle : {-7, 0, 7}) path.addEllipse(QPointF(middle, 0), 2, 2);
  return path;
}

// Most of a circle; its end has an arrowhead.
QPainterPath turn() {
  constexpr double radius = 7;
  QPainterPath path;
  path.arcMoveTo(-radius, -radius, 2 * radius, 2 * radius, 30);
  path.arcTo(-radius, -radius, 2 * radius, 2 * radius, 30, 290);
  const QPointF end = path.currentPosition();
  path.moveTo(end + QPointF(-6, 0));
  path.lineTo(end);
  path.lineTo(end + QPointF(1, 6));
  return path;
}

}  // namespace

GlyphButton::GlyphButton(QWidget* parent) : QAbstractButton(parent) {
  setSizePolicy(QSizePolicy::Fixed, QSizePolicy::Fixed);
  setFocusPolicy(Qt::StrongFocus);
}

QSize GlyphButton::sizeHint() const { return {side, side}; }

void GlyphButton::setGlyph(Glyph glyph, const QString& text) {
  _glyph = glyph;
  setText(text);
  setToolTip(text);
  setAccessibleName(text);
  update();
}

void GlyphButton::paintEvent(QPaintEvent*) {
  QPainter painter(this);
  painter.setRenderHint(QPainter::Antialiasing);
  const QColor color = accentColor(palette(), palette().color(QPalette::Window));
  painter.setOpacity(isDown() ? 0.4 : 1);
  painter.setPen(QPen(color, 2, Qt::SolidLine, Qt::RoundCap, Qt::RoundJoin));
  if (hasFocus()) painter.drawRoundedRect(QRectF(rect()).adjusted(3, 5, -3, -5), 6, 6);
  painter.translate(QRectF(rect()).center());
  switch (_glyph) {
    case Glyph::Play:
      return painter.fillPath(triangle(), color);
    case Glyph::Pause:
      return painter.fillPath(bars(), color);
    case Glyph::Again:
      return painter.drawPath(turn());
    case Glyph::Close:
      return painter.drawPath(cross());
    case Glyph::Menu:
      return painter.fillPath(dots(), color);
  }
}

void GlyphButton::keyPressEvent(QKeyEvent* event) {
  if (event->key() == Qt::Key_Return || event->key() == Qt::Key_Enter) return click();
  // By default, arrow keys would move to other buttons.
  if (event->key() == Qt::Key_Space) return QAbstractButton::keyPressEvent(event);
  event->ignore();
}

}  // namespace varnel
