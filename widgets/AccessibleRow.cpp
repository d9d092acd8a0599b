#include "widgets/AccessibleRow.h"

#include "widgets/TableWidget.h"

namespace varnel {

namespace {

// The parent of a row is its table's viewport.
TableWidget& tableOf(const RowWidget& row) {
  return static_cast<TableWidget&>(*row.parentWidget()->parentWidget());
}

}  // namespace

AccessibleRow::AccessibleRow(RowWidget& row) : QAccessibleWidget(&row, QAccessible::ListItem) {}

RowWidget& AccessibleRow::row() const { return static_cast<RowWidget&>(*widget()); }

QString AccessibleRow::text(QAccessible::Text kind) const {
  if (kind == QAccessible::Name) return row().description();
  if (kind == QAccessible::Description) return row().details(tableOf(row()).explanationOf(row()));
  return QAccessibleWidget::text(kind);
}

QAccessible::State AccessibleRow::state() const {
  QAccessible::State state = QAccessibleWidget::state();
  state.selectable = true;
  state.selected = row().emphasis().isSelected || row().emphasis().isOpen;
  state.focusable = true;
  state.focused = row().emphasis().hasFocusFrame;
  return state;
}

QAccessibleInterface* AccessibleRow::parent() const {
  return QAccessible::queryAccessibleInterface(&tableOf(row()));
}

QStringList AccessibleRow::actionNames() const { return {pressAction()}; }

void AccessibleRow::doAction(const QString& name) {
  if (name == pressAction()) tableOf(row()).chooseRow(row().row());
}

}  // namespace varnel
