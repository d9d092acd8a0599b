#pragma once

#include <functional>
#include <string>

#include "platform/ui/Window.h"
#include "terminal/TerminalStack.h"

namespace varnel {

/// The application's window: the whole screen of the terminal.
class TerminalWindow final : public Window {
 public:
  /// The area is that of the terminal; the observer is called when the window leaves the screen for good.
  TerminalWindow(const Area& area, Repainting& repainting, std::function<void()> leavingObserver);
  TerminalWindow(const TerminalWindow&) = delete;
  TerminalWindow& operator=(const TerminalWindow&) = delete;
  ~TerminalWindow() override;

  void setRoot(NavigationStack& stack) override;
  void makeKeyAndVisible() override;
  void setTitle(std::string_view title) override;
  void hide() override;

  void setArea(const Area& area);
  /// Null while there is nothing to see.
  TerminalStack* visibleRoot() const { return _isVisible ? _root : nullptr; }
  /// The stack is being destroyed.
  void forgetRoot() { _root = nullptr; }
  const std::wstring& title() const { return _title; }

 private:
  void dropRoot();

  Area _area;
  Repainting& _repainting;
  std::function<void()> _leavingObserver;
  TerminalStack* _root = nullptr;
  bool _isVisible = false;
  std::wstring _title;
};

}  // namespace varnel
