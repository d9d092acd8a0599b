#include "widgets/PageWidget.h"

#include <QKeyEvent>
#include <QMouseEvent>
#include <utility>

#include "widgets/FocusCycle.h"

namespace varnel {

PageWidget::PageWidget(const Titles& titles, std::unique_ptr<QWidget> content, std::function<void()> close,
                       QWidget& window)
    : QWidget(&window), _column(this), _content(content.release()), _close(std::move(close)) {
  setAutoFillBackground(true);
  setFocusPolicy(Qt::StrongFocus);
  setAccessibleName(titles.page);
  _column.setContentsMargins(0, 0, 0, 0);
  _column.setSpacing(0);
  _column.addWidget(&_header);
  _column.addWidget(&_notice);
  _column.addWidget(_content, 1);
  _header.setTitle(titles.page);
  _header.showBackButton(titles.below);
  _header.setBackAction([this] { _close(); });
}

void PageWidget::takeKeyboard() {
  setFocus(Qt::OtherFocusReason);
  if (_content->focusPolicy() != Qt::NoFocus || _content->focusProxy()) {
    _content->setFocus(Qt::OtherFocusReason);
  } else {
    cycleFocusWithin(*_content, FocusDirection::Next);
  }
}

void PageWidget::keyPressEvent(QKeyEvent* event) {
  if (event->matches(QKeySequence::Cancel) || event->matches(QKeySequence::Back)) return _close();
  event->ignore();
}

void PageWidget::mousePressEvent(QMouseEvent* event) {
  if (event->button() == Qt::BackButton) return _close();
  event->accept();
}

bool PageWidget::focusNextPrevChild(bool next) {
  return cycleFocusWithin(*this, next ? FocusDirection::Next : FocusDirection::Previous);
}

}  // namespace varnel
