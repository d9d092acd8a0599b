#include "widgets/AccessibleTable.h"

#include <algorithm>

#include "widgets/AccessibleRow.h"
#include "widgets/WindowWidget.h"

namespace varnel {

namespace {

QAccessibleInterface* interfaceFor(const QString&, QObject* object) {
  if (auto* row = dynamic_cast<RowWidget*>(object)) return new AccessibleRow(*row);
  if (auto* table = dynamic_cast<TableWidget*>(object)) return new AccessibleTable(*table);
  if (auto* window = dynamic_cast<WindowWidget*>(object))
    return new QAccessibleWidget(window, QAccessible::Window);
  return nullptr;
}

}  // namespace

AccessibleTable::AccessibleTable(TableWidget& table) : QAccessibleWidget(&table, QAccessible::List) {}

TableWidget& AccessibleTable::table() const { return static_cast<TableWidget&>(*widget()); }

int AccessibleTable::childCount() const { return static_cast<int>(table().visibleRows().size()); }

QAccessibleInterface* AccessibleTable::child(int index) const {
  const auto rows = table().visibleRows();
  if (index < 0 || static_cast<std::size_t>(index) >= rows.size()) return nullptr;
  return QAccessible::queryAccessibleInterface(rows[static_cast<std::size_t>(index)]);
}

int AccessibleTable::indexOfChild(const QAccessibleInterface* child) const {
  const auto rows = table().visibleRows();
  const auto found = std::ranges::find(rows, child->object());
  return found == rows.end() ? -1 : static_cast<int>(found - rows.begin());
}

void describeTablesToScreenReaders() { QAccessible::installFactory(interfaceFor); }

}  // namespace varnel
