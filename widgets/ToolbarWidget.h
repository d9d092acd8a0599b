#pragma once

#include <QHBoxLayout>
#include <QWidget>
#include <functional>
#include <vector>

#include "platform/ui/ToolbarItem.h"

namespace varnel {

/// The bar below a pane. New items of the same kinds reuse the widgets.
class ToolbarWidget final : public QWidget {
 public:
  explicit ToolbarWidget(QWidget* parent = nullptr);

  void setItems(std::vector<ToolbarItem> items);
  /// Does what the button of this kind does; false when there is no such button.
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
  std::vector<QWidget*> _widgets;  // one per item; null for spaces
};

}  // namespace varnel
