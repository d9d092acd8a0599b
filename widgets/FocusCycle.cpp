#include "widgets/FocusCycle.h"

#include <QApplication>

namespace varnel {

namespace {

bool takesKeyboard(const QWidget& widget, const QWidget& root) {
  return root.isAncestorOf(&widget) && (widget.focusPolicy() & Qt::TabFocus) == Qt::TabFocus &&
         widget.isVisible() && widget.isEnabled() && !widget.focusProxy();
}

}  // namespace

bool cycleFocusWithin(QWidget& root, FocusDirection direction) {
  const bool isForward = direction == FocusDirection::Next;
  QWidget* const focused = QApplication::focusWidget();
  QWidget* const start = focused && root.isAncestorOf(focused) ? focused : &root;
  const auto following = [isForward](const QWidget* widget) {
    return isForward ? widget->nextInFocusChain() : widget->previousInFocusChain();
  };
  for (QWidget* next = following(start); next != start; next = following(next)) {
    if (!takesKeyboard(*next, root)) continue;
    next->setFocus(isForward ? Qt::TabFocusReason : Qt::BacktabFocusReason);
    return true;
  }
  return false;
}

}  // namespace varnel
