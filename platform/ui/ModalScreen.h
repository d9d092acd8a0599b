#pragma once

#include <functional>
#include <string_view>

#include "platform/ui/Animation.h"
#include "platform/ui/Geometry.h"
#include "platform/ui/TableView.h"
#include "platform/ui/TextField.h"

namespace varnel {

/// A screen that covers the others and takes all input, made from a layout.
class ModalScreen {
 public:
  /// Called with the name of the operation that a button or the background stands for.
  using Actions = std::function<void(std::string_view action)>;

  virtual ~ModalScreen() = default;
  virtual void setFrame(const Rect& frame) = 0;
  /// The element of that outlet, which lives as long as the screen; null when the layout has none.
  virtual TableView* table(std::string_view outlet) = 0;
  virtual TextField* textField(std::string_view outlet) = 0;
};

/// Who runs a modal screen.
class ModalController {
 public:
  virtual ~ModalController() = default;
  /// The controller's own screen, always the same one.
  virtual ModalScreen& screen() = 0;
  /// Called once, before the screen first appears.
  virtual void viewDidLoad() {}
  virtual void viewWillAppear(Animation) {}
  /// A host that runs short of memory calls them; the second when it has dropped the screen.
  virtual void didReceiveMemoryWarning() {}
  virtual void viewDidUnload() {}
};

}  // namespace varnel
