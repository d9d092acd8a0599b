#pragma once

#include <QPointer>
#include <QWidget>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "platform/ui/NavigationStack.h"
#include "widgets/ModalScreenWidget.h"
#include "widgets/PaneWidget.h"
#include "widgets/SlideOverlay.h"

namespace varnel {

/// Panes on top of each other. Every change happens at once; an animation is a picture above it.
///
/// Escape, Left, Backspace, and the desktop's key and mouse button for going back go back. Ctrl+S presses the
/// Save button of the top pane.
class NavigationWidget final : public QWidget, public NavigationStack {
 public:
  explicit NavigationWidget(std::shared_ptr<PaneController> root);
  ~NavigationWidget() override;

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
  /// Gives the keyboard focus to what is on top.
  void takeKeyboard();
  PaneWidget& topPane() const;
  /// The names from below the root to the current row of the top pane; without such a row, to the pane's own
  /// node.
  std::vector<std::string> pathOfFocus() const;
  /// Null while no screen is presented.
  ModalScreenWidget* modalScreen() const;

 protected:
  void resizeEvent(QResizeEvent* event) override;
  void keyPressEvent(QKeyEvent* event) override;
  void mousePressEvent(QMouseEvent* event) override;

 private:
  void adopt(std::size_t index);
  void release(PaneController& controller);
  void changeTop(std::vector<std::shared_ptr<PaneController>> controllers, Animation animation,
                 SlideOverlay::Movement movement);
  void showTop();
  void showWayBack(std::size_t index);
  void goBack();
  void slide(const QPixmap& former, const QPixmap& next, SlideOverlay::Movement movement);
  void releaseLater(std::shared_ptr<void> leaving);

  std::vector<std::shared_ptr<PaneController>> _controllers;
  std::shared_ptr<ModalController> _modal;
  NavigationStackDelegate* _delegate = nullptr;
  bool _showsToolbar = false;
  std::string _notice;
  QPointer<SlideOverlay> _overlay;
};

}  // namespace varnel
