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

/// One pane of a navigation stack: a title above, a table, and a toolbar below.
class TablePane {
 public:
  virtual ~TablePane() = default;
  virtual TableView& table() = 0;
  virtual void setTitle(std::string_view title) = 0;
  /// Replaces the toolbar's items, from left to right. The items come every few seconds and are mostly of the
  /// same kinds, so a host may change the old ones instead of making new ones.
  virtual void setToolbarItems(std::vector<ToolbarItem> items, Animation animation) = 0;
  /// Gives up the keyboard focus.
  virtual void resignFirstResponder() = 0;
};

/// Controls a pane of a navigation stack.
class PaneController {
 public:
  virtual ~PaneController() = default;
  /// The controller's own pane, always the same one. The user interface that made the stack makes it.
  virtual TablePane& pane() = 0;
  /// The stack calls them before the pane comes onto the screen, and before it leaves the screen.
  virtual void viewWillAppear(Animation) {}
  virtual void viewWillDisappear(Animation) {}

  /// The stack with this pane; null when there is none. The stack sets it before it calls anything else. It
  /// clears it when the pane has left, or when the stack itself is destroyed.
  NavigationStack* navigationController() const { return _navigationController; }
  void setNavigationController(NavigationStack* stack) { _navigationController = stack; }

 private:
  NavigationStack* _navigationController = nullptr;
};

/// Learns what a navigation stack is about to show.
class NavigationStackDelegate {
 public:
  virtual ~NavigationStackDelegate() = default;
  /// Called before a pane is shown by a push or a pop, also by the user's way back. Not called for the root
  /// pane when the window becomes visible.
  virtual void navigationController_willShowViewController_animated(NavigationStack& stack,
                                                                    PaneController& controller,
                                                                    Animation animation) = 0;
};

/// Panes on top of each other. Only the top one has appeared, and the user can go back to the one below. A
/// host with much room may draw that one beside the top one, which changes no call. When the user chooses a
/// row there, the stack first pops to that pane, and then calls its delegate.
///
/// When the top pane changes, the stack calls, in this order: `viewWillDisappear` of the old top pane,
/// `viewWillAppear` of the new one, and the delegate with the new one. During these calls `controllers`
/// already includes the change. A pane that was popped makes no more calls, and neither do its table and
/// toolbar. The stack keeps it as long as the user still sees it leave.
class NavigationStack {
 public:
  virtual ~NavigationStack() = default;
  /// Null removes the delegate.
  virtual void setDelegate(NavigationStackDelegate* delegate) = 0;

  /// From the bottom to the top; never empty.
  virtual std::vector<std::shared_ptr<PaneController>> controllers() const = 0;
  virtual std::shared_ptr<PaneController> topController() const = 0;
  virtual void push(std::shared_ptr<PaneController> controller, Animation animation) = 0;
  /// Removes every pane above this one, which must be on the stack. Does nothing when it is on top.
  virtual void popTo(const PaneController& controller, Animation animation) = 0;
  /// Shows the toolbar, which is hidden before.
  virtual void showToolbar() = 0;
  /// Shows the notice: lines with a newline between them, below the title of every pane and on a presented
  /// screen. An empty text takes no room.
  virtual void setNotice(std::string_view text) = 0;

  /// Lays a screen over the stack. Calls the controller's `viewDidLoad` before its first `viewWillAppear`.
  /// The stack keeps the controller until its screen has left.
  virtual void present(std::shared_ptr<ModalController> controller, Animation animation) = 0;
  /// Removes the presented screen, whose actions are not called any more. Does nothing when there is none.
  virtual void dismiss(Animation animation) = 0;
};

}  // namespace varnel
