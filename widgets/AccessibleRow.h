#pragma once

#include <QAccessibleWidget>

#include "widgets/RowWidget.h"

namespace varnel {

/// A row for screen readers: an item of a list, named "name: value", which can be pressed. Its description is
/// what its tooltip shows.
class AccessibleRow final : public QAccessibleWidget {
 public:
  explicit AccessibleRow(RowWidget& row);

  QString text(QAccessible::Text kind) const override;
  QAccessible::State state() const override;
  QAccessibleInterface* parent() const override;
  QStringList actionNames() const override;
  void doAction(const QString& name) override;

 private:
  RowWidget& row() const;
};

}  // namespace varnel
