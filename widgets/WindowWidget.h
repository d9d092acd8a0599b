#pragma once

#include <QPointer>
#include <QWidget>
#include <functional>

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

  WindowWidget(const Rect& frame, Wishes wishes);
  ~WindowWidget() override;

  void setRoot(NavigationStack& stack) override;
  void makeKeyAndVisible() override;
  void hide() override { QWidget::hide(); }

  /// Gives the keyboard to what is on top.
  void takeKeyboard();

 protected:
  void resizeEvent(QResizeEvent* event) override;
  void keyPressEvent(QKeyEvent* event) override;
  void closeEvent(QCloseEvent* event) override;

 private:
  void dropRoot();

  Wishes _wishes;
  QPointer<NavigationWidget> _root;
};

}  // namespace varnel
