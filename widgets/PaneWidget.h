#pragma once

#include <QVBoxLayout>
#include <QWidget>
#include <functional>

#include "platform/ui/NavigationStack.h"
#include "widgets/HeaderWidget.h"
#include "widgets/NoticeWidget.h"
#include "widgets/TableWidget.h"
#include "widgets/ToolbarWidget.h"

namespace varnel {

/// One pane of a navigation stack: title bar, notice, table, and toolbar.
class PaneWidget final : public QWidget, public TablePane {
 public:
  PaneWidget();

  TableView& table() override { return _table; }
  void setTitle(std::string_view title) override;
  void setToolbarItems(std::vector<ToolbarItem> items, Animation animation) override;
  void resignFirstResponder() override;

  TableWidget& tableWidget() { return _table; }
  HeaderWidget& header() { return _header; }
  ToolbarWidget& toolbar() { return _toolbar; }
  NoticeWidget& notice() { return _notice; }
  /// What is on the screen of a stack's pane.
  enum class Role {
    Top,     ///< everything
    Beside,  ///< the top pane is beside it and has toolbar and notice for both
  };
  /// The toolbar is hidden before the first call.
  void showAs(Role role, bool hasToolbar);
  /// The observer is called when the title has changed.
  void setTitleObserver(std::function<void()> observer) { _titleObserver = std::move(observer); }
  /// Makes no more calls from now on.
  void fallSilent();

 private:
  QVBoxLayout _column;
  HeaderWidget _header;
  NoticeWidget _notice;
  TableWidget _table;
  ToolbarWidget _toolbar;
  std::function<void()> _titleObserver;
};

}  // namespace varnel
