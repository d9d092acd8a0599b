#pragma once

#include <QHBoxLayout>
#include <QWidget>
#include <functional>
#include <vector>

#include "platform/ui/ToolbarItem.h"

namespace varnel {

/// The bar below a pane. Items of the same kinds as before change the widgets that are there.
class ToolbarWidget final : public QWidget {
 public:
  explicit ToolbarWidget(QWidget* parent = nullptr);

  void setItems(std::vector<ToolbarItem> items);
  /// Does what the button of that kind does; false when there is none.
  bool press(BarButton::SystemItem item);
  /// Calls no action from now on.
  void fallSilent();

 protected:
  void paintEvent(QPaintEvent* event) override;

 private:
  bool hasSameKinds(const std::vector<ToolbarItem>& items) const;
  void rebuild(const std::vector<ToolbarItem>& items);
  void showItem(std::size_t index);
  void perform(std::size_t index);

  QHBoxLayout _row;
  std::vector<ToolbarItem> _items;
  std::vector<QWidget*> _widgets;  // one an item; null for spaces
};

}  // namespace varnel
