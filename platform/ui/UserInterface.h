#pragma once

#include <memory>
#include <string>

#include "platform/ui/Geometry.h"
#include "platform/ui/ModalScreen.h"
#include "platform/ui/NavigationStack.h"
#include "platform/ui/ScreenLayout.h"
#include "platform/ui/TextMetrics.h"
#include "platform/ui/Window.h"

namespace varnel {

/// A message with one button, which closes it.
struct Alert {
  std::string title;
  std::string message;
  std::string buttonTitle;
};

/// The host's user interface. It makes everything on the screen. Objects from one user interface are only
/// passed to objects from the same one. Everything happens on the main queue's thread, and no call waits for
/// the user. It outlives all that it makes.
class UserInterface {
 public:
  virtual ~UserInterface() = default;

  /// The main screen: on a phone the whole screen, on a desktop a rectangle at (0, 0) with the first size of
  /// the window. The desktop decides where the window is.
  virtual Rect screenBounds() const = 0;
  /// The application's part of it: on a phone without the status bar, on a desktop the current area of the
  /// window.
  virtual Rect applicationFrame() const = 0;
  virtual const TextMetrics& textMetrics() const = 0;

  /// Makes a window that is not visible yet.
  virtual std::unique_ptr<Window> makeWindow(const Rect& frame) = 0;
  virtual std::unique_ptr<TablePane> makeTablePane() = 0;
  virtual std::unique_ptr<NavigationStack> makeNavigationStack(std::shared_ptr<PaneController> root) = 0;
  virtual std::unique_ptr<ModalScreen> makeModalScreen(const ScreenLayout& layout,
                                                       ModalScreen::Actions actions) = 0;
  /// Shows an alert above everything else until the user closes it. It outlives a modal screen below it.
  virtual void showAlert(const Alert& alert) = 0;
};

}  // namespace varnel
