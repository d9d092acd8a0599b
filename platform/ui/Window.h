#pragma once

#include <string_view>

#include "platform/ui/NavigationStack.h"

namespace varnel {

/// The application's window. The destructor removes it from the screen.
class Window {
 public:
  virtual ~Window() = default;
  /// Shows the stack in the whole window. The caller owns the stack; stack and window may be destroyed in any
  /// order.
  virtual void setRoot(NavigationStack& stack) = 0;
  /// Shows the window and gives it the keyboard focus. The stack's top pane appears.
  virtual void makeKeyAndVisible() = 0;
  /// The window's name on the desktop, as plain text.
  virtual void setTitle(std::string_view title) = 0;
  /// Removes the window from the screen.
  virtual void hide() = 0;
};

}  // namespace varnel
