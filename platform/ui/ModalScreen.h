#pragma once

#include <functional>
#include <string_view>

#include "platform/ui/Animation.h"
#include "platform/ui/Geometry.h"
#include "platform/ui/TableView.h"
#include "platform/ui/TextField.h"

namespace varnel {

/// A screen that covers the others and takes all input. A layout describes it.
class ModalScreen {
 public:
  /// Called with the name of the operation of a button or of the background.
  using Actions = std::function<void(std::string_view action)>;

  virtual ~ModalScreen() = default;
  virtual void setFrame(const Rect& frame) = 0;
  /// The element of this outlet; null when the layout has none. It lives as long as the screen.
  virtual TableView* table(std::string_view outlet) = 0;
  virtual TextField* textField(std::string_view outlet) = 0;
};

/// Controls a modal screen.
class ModalController {
 public:
  virtual ~ModalController() = default;
  /// The controller's own screen, always the same one.
  virtual ModalScreen& screen() = 0;
  /// Called once, before the screen first appears.
  virtual void viewDidLoad() {}
  virtual void viewWillAppear(Animation) {}
  /// A host that is short of memory calls both. It calls the second one after it has dropped the screen.
  virtual void didReceiveMemoryWarning() {}
  virtual void viewDidUnload() {}
};

}  // namespace varnel
