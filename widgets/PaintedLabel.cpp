#include "widgets/PaintedLabel.h"

#include <QFontMetricsF>
#include <algorithm>

#include "widgets/QtValues.h"

namespace varnel {

void PaintedLabel::setFont(const Font& font) {
  QFont wanted = qtFont(font);
  if (wanted == _font) return;
  _font = std::move(wanted);
  _textWidth.reset();
  _row.update();
}

void PaintedLabel::setText(std::string_view text) {
  if (text == _text) return;
  _text = text;
  _shownText = singleLine(text);
  _textWidth.reset();
  _row.update();
}

void PaintedLabel::setFrame(const Rect& frame) {
  const QRectF wanted = qtRect(frame);
  if (wanted == _frame) return;
  _frame = wanted;
  _row.update();
}

double PaintedLabel::endOfText() const {
  if (!_textWidth) _textWidth = QFontMetricsF(_font).horizontalAdvance(_shownText);
  return std::min(_frame.right(), _frame.left() + *_textWidth);
}

void PaintedLabel::paint(QPainter& painter) const {
  painter.setFont(_font);
  painter.drawText(_frame, Qt::AlignLeft | Qt::AlignAbsolute | Qt::AlignVCenter | Qt::TextSingleLine,
                   _shownText);
}

}  // namespace varnel
