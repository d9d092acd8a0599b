#pragma once

#include <memory>
#include <string_view>
#include <vector>

#include "platform/ui/Animation.h"
#include "platform/ui/ModalScreen.h"
#include "platform/ui/TableView.h"
#include "platform/ui/ToolbarItem.h"

namespace varnel {

class NavigationStack;

/// What a navigation stack shows at a time: a title above, a table, a toolbar below.
class TablePane {
 public:
  virtual ~TablePane() = default;
  virtual TableView& table() = 0;
  virtual void setTitle(std::string_view title) = 0;
  /// The toolbar's items, left to right, in place of those that are there. They come every few seconds,
  /// mostly the same kinds: a host may change what it has instead of making them anew.
  virtual void setToolbarItems(std::vector<ToolbarItem> items, Animation animation) = 0;
  /// Gives the keyboard away.
  virtual void resignFirstResponder() = 0;
};

/// Who runs a pane of a navigation stack.
class PaneController {
 public:
  virtual ~PaneController() = default;
  /// The controller's own pane, always the same one, made by the user interface that made the stack.
  virtual TablePane& pane() = 0;
  /// The stack calls them before the pane comes onto the screen and before it leaves it.
  virtual void viewWillAppear(Animation) {}
  virtual void viewWillDisappear(Animation) {}

  /// The stack that the pane is on; null when it is on none. The stack sets it before it calls anything else,
  /// and clears it when the pane has left or the stack itself goes.
  NavigationStack* navigationController() const { return _navigationController; }
  void setNavigationController(NavigationStack* stack) { _navigationController = stack; }

 private:
  NavigationStack* _navigationController = nullptr;
};

/// Who is told what a navigation stack is about to show.
class NavigationStackDelegate {
 public:
  virtual ~NavigationStackDelegate() = default;
  /// Called when a pane is about to be shown by a push or a pop, the user's way back included; not for the
  /// root pane that the window's becoming visible shows.
  virtual void navigationController_willShowViewController_animated(NavigationStack& stack,
                                                                    PaneController& controller,
                                                                    Animation animation) = 0;
};

/// Panes one above the other, of which the top one is seen. The user can go back to the one below.
///
/// When the pane on top changes, the stack calls, in this order: `viewWillDisappear` of the former top,
/// `viewWillAppear` of the new one, the delegate with the new one. `controllers` tells of the change already
/// then. A pane that was popped, its table and toolbar included, makes no more calls, and is kept as long as
/// it is still seen leaving.
class NavigationStack {
 public:
  virtual ~NavigationStack() = default;
  /// Null takes the delegate off.
  virtual void setDelegate(NavigationStackDelegate* delegate) = 0;

  /// Bottom first; never empty.
  virtual std::vector<std::shared_ptr<PaneController>> controllers() const = 0;
  virtual std::shared_ptr<PaneController> topController() const = 0;
  virtual void push(std::shared_ptr<PaneController> controller, Animation animation) = 0;
  /// Takes away every pane above that one, which is on the stack. Nothing happens when it is on top.
  virtual void popTo(const PaneController& controller, Animation animation) = 0;
  /// The toolbar is hidden until then.
  virtual void showToolbar() = 0;
  /// What there is to tell beside the toolbars' status, lines with a newline between them: it stands below
  /// the title, whichever pane is on top, and on a presented screen. Empty text takes no room.
  virtual void setNotice(std::string_view text) = 0;

  /// Lays a screen over the stack. Calls the controller's `viewDidLoad` before its first `viewWillAppear`.
  /// The stack keeps the controller until its screen is off.
  virtual void present(std::shared_ptr<ModalController> controller, Animation animation) = 0;
  /// Takes the presented screen off; its actions are not called from now on. Nothing happens when there is
  /// none.
  virtual void dismiss(Animation animation) = 0;
};

}  // namespace varnel
