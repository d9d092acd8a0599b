#pragma once

#include <QAccessibleWidget>

#include "widgets/TableWidget.h"

namespace varnel {

/// A table for screen readers: a list whose items are the rows on the screen, from top to bottom.
class AccessibleTable final : public QAccessibleWidget {
 public:
  explicit AccessibleTable(TableWidget& table);

  int childCount() const override;
  QAccessibleInterface* child(int index) const override;
  int indexOfChild(const QAccessibleInterface* child) const override;

 private:
  TableWidget& table() const;
};

/// Makes windows, tables, and rows known to screen readers. One call per program is enough.
void describeTablesToScreenReaders();

}  // namespace varnel
