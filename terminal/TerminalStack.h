#pragma once

#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "platform/ui/NavigationStack.h"
#include "terminal/Glyphs.h"
#include "terminal/Repainting.h"
#include "terminal/TerminalModalScreen.h"
#include "terminal/TerminalPane.h"

namespace varnel {

class TerminalWindow;

/// From this width on, the last two panes of a stack stand side by side.
inline constexpr int columnsOfTwoPanes = 120;

/// Panes on top of each other: the title, the notice, the table, and the toolbar. On a wide terminal the pane
/// below the top one stands to its left.
///
/// Escape, Left, Backspace, and h go back. s and Ctrl+S press the Save button of the top pane.
class TerminalStack final : public NavigationStack {
 public:
  TerminalStack(std::shared_ptr<PaneController> root, Repainting& repainting);
  TerminalStack(const TerminalStack&) = delete;
  TerminalStack& operator=(const TerminalStack&) = delete;
  ~TerminalStack() override;

  void setDelegate(NavigationStackDelegate* delegate) override { _delegate = delegate; }
  std::vector<std::shared_ptr<PaneController>> controllers() const override { return _controllers; }
  std::shared_ptr<PaneController> topController() const override { return _controllers.back(); }
  void push(std::shared_ptr<PaneController> controller, Animation animation) override;
  void popTo(const PaneController& controller, Animation animation) override;
  void showToolbar() override;
  void setNotice(std::string_view text) override;
  void present(std::shared_ptr<ModalController> controller, Animation animation) override;
  void dismiss(Animation animation) override;

  /// The window becomes visible, and the top pane appears. The delegate is not told.
  void appear();
  void setWindow(TerminalWindow* window) { _window = window; }
  void setArea(const Area& area);
  KeyUse take(const Key& key);
  TerminalPane& topPane() const;
  /// The names of the panes and of the row with the focus, from the top of the tree. The root has no name.
  std::vector<std::wstring> pathOfFocus() const;
  /// True when a modal screen hides the panes.
  bool isCovered() const { return _modal != nullptr; }
  bool isPresenting() const { return _modal != nullptr; }
  /// The notice stands in so many rows below the title.
  int rowsOfNotice() const { return static_cast<int>(_noticeLines.size()); }
  /// True while a wheel turns, which `step` counts.
  bool isWheelTurning() const { return !_modal && topPane().toolbar().isWheelTurning; }
  /// `windowTitle` is the name of the window.
  void paint(CellGrid& grid, const Glyphs& glyphs, std::wstring_view windowTitle, unsigned step) const;

 private:
  void adopt(PaneController& controller);
  void release(PaneController& controller);
  void changeTop(std::vector<std::shared_ptr<PaneController>> controllers, Animation animation);
  void layOut();
  bool showsTwoPanes() const { return _controllers.size() > 1 && _area.columns >= columnsOfTwoPanes; }
  TerminalPane& paneBelow() const;
  void goBack();
  KeyUse takeMouse(const Key& key);
  KeyUse takeAsOwn(const Key& key);
  void paintTitle(CellGrid& grid, const Glyphs& glyphs, std::wstring_view windowTitle) const;
  void paintNotice(CellGrid& grid) const;
  void paintToolbar(CellGrid& grid, const Glyphs& glyphs, unsigned step) const;
  Area saveButton() const;

  Repainting& _repainting;
  std::vector<std::shared_ptr<PaneController>> _controllers;
  std::shared_ptr<ModalController> _modal;
  NavigationStackDelegate* _delegate = nullptr;
  TerminalWindow* _window = nullptr;
  bool _showsToolbar = false;
  std::string _notice;
  std::vector<std::wstring> _noticeLines;
  Area _area;
};

}  // namespace varnel
