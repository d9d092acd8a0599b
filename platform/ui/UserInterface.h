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

/// The host's user interface: it makes whatever is on the screen. What one user interface has made is only
/// ever given to others that it has made. Everything happens on the main queue's thread; nothing it calls
/// waits for the user. It outlives what it makes.
class UserInterface {
 public:
  virtual ~UserInterface() = default;

  /// The main screen: all of a phone's, and on a desktop the size that the window is to have at first, at
  /// (0, 0): the desktop decides where it stands.
  virtual Rect screenBounds() const = 0;
  /// The part of it that is the application's: less the status bar; on a desktop the window's area as it is
  /// now.
  virtual Rect applicationFrame() const = 0;
  virtual const TextMetrics& textMetrics() const = 0;

  /// Not visible yet.
  virtual std::unique_ptr<Window> makeWindow(const Rect& frame) = 0;
  virtual std::unique_ptr<TablePane> makeTablePane() = 0;
  virtual std::unique_ptr<NavigationStack> makeNavigationStack(std::shared_ptr<PaneController> root) = 0;
  virtual std::unique_ptr<ModalScreen> makeModalScreen(const ScreenLayout& layout,
                                                       ModalScreen::Actions actions) = 0;
  /// Shows an alert above everything else, where it stays until the user closes it: it outlives a modal
  /// screen below it.
  virtual void showAlert(const Alert& alert) = 0;
};

}  // namespace varnel
