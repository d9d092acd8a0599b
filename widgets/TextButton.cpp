#include "widgets/TextButton.h"

#include <QKeyEvent>
#include <QPainter>
#include <QPainterPath>
#include <cmath>

#include "widgets/Colors.h"
#include "widgets/QtValues.h"

namespace varnel {

namespace {

constexpr int buttonHeight = 44;
constexpr int padding = 12;
constexpr int backMarkWidth = 16;
constexpr double textSize = 16;

}  // namespace

TextButton::TextButton(Mark mark, QWidget* parent) : QAbstractButton(parent), _mark(mark) {
  setSizePolicy(QSizePolicy::Fixed, QSizePolicy::Fixed);
  setFocusPolicy(Qt::StrongFocus);
}

QFont TextButton::textFont() const { return qtFont(Font::system(textSize)); }

int TextButton::markWidth() const { return _mark == Mark::Back ? backMarkWidth : 0; }

QSize TextButton::sizeHint() const {
  const double textWidth = std::ceil(QFontMetricsF(textFont()).horizontalAdvance(text())) + 1;
  return {static_cast<int>(textWidth) + markWidth() + 2 * padding, buttonHeight};
}

QSize TextButton::minimumSizeHint() const { return {markWidth() + 2 * padding, buttonHeight}; }

void TextButton::paintEvent(QPaintEvent*) {
  QPainter painter(this);
  painter.setRenderHint(QPainter::Antialiasing);
  const QColor color = accentColor(palette(), palette().color(QPalette::Window));
  painter.setOpacity(isDown() ? 0.4 : 1);
  painter.setPen(QPen(color, 2, Qt::SolidLine, Qt::RoundCap, Qt::RoundJoin));
  if (_mark == Mark::Back) paintMark(painter);
  const QRect room = rect().adjusted(padding + markWidth(), 0, -padding, 0);
  painter.setFont(textFont());
  painter.drawText(room, Qt::AlignLeft | Qt::AlignAbsolute | Qt::AlignVCenter | Qt::TextSingleLine,
                   QFontMetricsF(textFont()).elidedText(text(), Qt::ElideRight, room.width()));
  if (hasFocus()) painter.drawRoundedRect(QRectF(rect()).adjusted(3, 5, -3, -5), 6, 6);
}

void TextButton::paintMark(QPainter& painter) const {
  const double middle = rect().height() / 2.0;
  QPainterPath path(QPointF(padding + 8, middle - 8));
  path.lineTo(padding, middle);
  path.lineTo(padding + 8, middle + 8);
  painter.drawPath(path);
}

void TextButton::keyPressEvent(QKeyEvent* event) {
  if (event->key() == Qt::Key_Return || event->key() == Qt::Key_Enter) return click();
  // By default, arrow keys would move to other buttons. Here they have another meaning.
  if (event->key() == Qt::Key_Space) return QAbstractButton::keyPressEvent(event);
  event->ignore();
}

}  // namespace varnel
