#pragma once

#include <QAccessibleWidget>

#include "widgets/TableWidget.h"

namespace varnel {

/// A table for screen readers: a list whose items are the rows on the screen, top first.
class AccessibleTable final : public QAccessibleWidget {
 public:
  explicit AccessibleTable(TableWidget& table);

  int childCount() const override;
  QAccessibleInterface* child(int index) const override;
  int indexOfChild(const QAccessibleInterface* child) const override;

 private:
  TableWidget& table() const;
};

/// Has screen readers told of windows, tables and rows. It is enough to call it once a program.
void describeTablesToScreenReaders();

}  // namespace varnel
