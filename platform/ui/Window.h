#pragma once

#include <string_view>

#include "platform/ui/NavigationStack.h"

namespace varnel {

/// The application's window. Destroying it takes it off the screen.
class Window {
 public:
  virtual ~Window() = default;
  /// What the window shows, in its whole area. The stack stays its owner's: either may go first.
  virtual void setRoot(NavigationStack& stack) = 0;
  /// Shows the window, which gets the keyboard; the stack's top pane appears.
  virtual void makeKeyAndVisible() = 0;
  /// What the desktop calls the window; plain text.
  virtual void setTitle(std::string_view title) = 0;
  /// Takes the window off the screen.
  virtual void hide() = 0;
};

}  // namespace varnel
