#pragma once

#include <string>
#include <vector>

#include "platform/ui/NavigationStack.h"
#include "terminal/Repainting.h"
#include "terminal/TerminalTable.h"

namespace varnel {

/// A pane. Its stack paints the title and the toolbar.
class TerminalPane final : public TablePane {
 public:
  /// What the toolbar has at the moment.
  struct Toolbar {
    bool isWheelTurning = false;
    std::wstring status{};
    std::function<void()> save{};  ///< empty without a Save button
  };

  explicit TerminalPane(Repainting& repainting) : _repainting(repainting) {}

  TerminalTable& table() override { return _table; }
  void setTitle(std::string_view title) override;
  void setToolbarItems(std::vector<ToolbarItem> items, Animation animation) override;
  void resignFirstResponder() override {}

  const std::wstring& title() const { return _title; }
  const Toolbar& toolbar() const { return _toolbar; }
  /// Keeps what it shows, but makes no more calls.
  void fallSilent();

 private:
  Repainting& _repainting;
  TerminalTable _table;
  std::wstring _title;
  Toolbar _toolbar;
};

}  // namespace varnel
