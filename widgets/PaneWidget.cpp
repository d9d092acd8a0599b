#include "widgets/PaneWidget.h"

#include "widgets/QtValues.h"

namespace varnel {

PaneWidget::PaneWidget() : _column(this) {
  setAutoFillBackground(true);
  _column.setContentsMargins(0, 0, 0, 0);
  _column.setSpacing(0);
  _column.addWidget(&_header);
  _column.addWidget(&_notice);
  _column.addWidget(&_table, 1);
  _column.addWidget(&_toolbar);
  _toolbar.hide();
}

void PaneWidget::setTitle(std::string_view title) {
  const QString shown = singleLine(title);
  if (shown == _header.title()) return;
  _header.setTitle(shown);
  _table.setAccessibleName(shown);
  if (_titleObserver) _titleObserver();
}

void PaneWidget::setToolbarItems(std::vector<ToolbarItem> items, Animation) {
  _toolbar.setItems(std::move(items));
}

void PaneWidget::resignFirstResponder() {
  if (QWidget* holder = focusWidget(); holder && holder->hasFocus()) holder->clearFocus();
}

void PaneWidget::showAs(Role role, bool hasToolbar) {
  _toolbar.setVisible(hasToolbar && role == Role::Top);
  _notice.setShownElsewhere(role == Role::Beside);
}

void PaneWidget::fallSilent() {
  _table.fallSilent();
  _toolbar.fallSilent();
  _header.setBackAction(nullptr);
  _titleObserver = nullptr;
}

}  // namespace varnel
