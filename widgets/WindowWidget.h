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
  /// What the user may want from the application itself.
  struct Wishes {
    std::function<void()> close{};
    std::function<void()> startOver{};
  };

  /// As large as the frame. The desktop decides where it is.
  WindowWidget(const Rect& frame, Wishes wishes);
  ~WindowWidget() override;

  void setRoot(NavigationStack& stack) override;
  void makeKeyAndVisible() override;
  void setTitle(std::string_view title) override;
  void hide() override { QWidget::hide(); }

  /// The observer is called when the window is removed from the screen. It gets the size that the window has
  /// when it is neither maximized nor full-screen.
  void setLeavingObserver(std::function<void(const QSize&)> observer) {
    _leavingObserver = std::move(observer);
  }
  /// Gives the keyboard focus to what is on top.
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
