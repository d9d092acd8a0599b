#pragma once

#include <QPointer>
#include <QWidget>
#include <functional>
#include <utility>

#include "platform/ui/Window.h"
#include "widgets/NavigationWidget.h"

namespace varnel {

/// The application's window. Ctrl+R starts over, Ctrl+Q closes the window.
class WindowWidget final : public QWidget, public Window {
 public:
  /// What the user may want of the application itself.
  struct Wishes {
    std::function<void()> close{};
    std::function<void()> startOver{};
  };

  /// As large as the frame. Where it stands, the desktop decides.
  WindowWidget(const Rect& frame, Wishes wishes);
  ~WindowWidget() override;

  void setRoot(NavigationStack& stack) override;
  void makeKeyAndVisible() override;
  void setTitle(std::string_view title) override;
  void hide() override { QWidget::hide(); }

  /// Called when the window is taken off the screen, with the size that it has while it is neither maximized
  /// nor full-screen.
  void setLeavingObserver(std::function<void(const QSize&)> observer) {
    _leavingObserver = std::move(observer);
  }
  /// Gives the keyboard to what is on top.
  void takeKeyboard();

 protected:
  void resizeEvent(QResizeEvent* event) override;
  void keyPressEvent(QKeyEvent* event) override;
  void closeEvent(QCloseEvent* event) override;
  void hideEvent(QHideEvent* event) override;

 private:
  void dropRoot();

  QSize ordinarySize() const;

  Wishes _wishes;
  std::function<void(const QSize&)> _leavingObserver;
  QPointer<NavigationWidget> _root;
};

}  // namespace varnel
