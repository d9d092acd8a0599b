#include "widgets/TextFieldWidget.h"

#include "widgets/QtValues.h"

namespace varnel {

namespace {

constexpr int fieldHeight = 44;
constexpr double textSize = 16;

}  // namespace

TextFieldWidget::TextFieldWidget(const QString& title) {
  setPlaceholderText(title);
  setAccessibleName(title);
  setFont(qtFont(Font::system(textSize)));
  setFixedHeight(fieldHeight);
  setTextMargins(6, 0, 6, 0);
  connect(this, &QLineEdit::returnPressed, this, [this] {
    if (_delegate) _delegate->textFieldShouldReturn(*this);
  });
}

std::optional<std::string> TextFieldWidget::text() const { return utf8(QLineEdit::text()); }

void TextFieldWidget::resignFirstResponder() {
  // The screen around the field keeps getting keys.
  if (hasFocus()) parentWidget()->setFocus(Qt::OtherFocusReason);
}

}  // namespace varnel
