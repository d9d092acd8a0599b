#pragma once

#include <QPointer>

#include "platform/ui/UserInterface.h"
#include "widgets/FontMetrics.h"
#include "widgets/RememberedSize.h"
#include "widgets/WindowWidget.h"

namespace varnel {

/// The user interface on Qt 6 Widgets. It needs a `WidgetApplication`.
class WidgetUserInterface final : public UserInterface {
 public:
  /// The wishes apply to every window that it makes.
  explicit WidgetUserInterface(WindowWidget::Wishes wishes, RememberedSize lastSize = RememberedSize());

  /// The observer is called with each window that it makes.
  void setWindowObserver(std::function<void(WindowWidget& window)> observer) {
    _windowObserver = std::move(observer);
  }

  /// Holds for every stack that it makes from now on.
  void setRecordSource(NavigationWidget::RecordSource source) { _recordSource = std::move(source); }

  Rect screenBounds() const override;
  Rect applicationFrame() const override;
  const TextMetrics& textMetrics() const override { return _textMetrics; }

  std::unique_ptr<Window> makeWindow(const Rect& frame) override;
  std::unique_ptr<TablePane> makeTablePane() override;
  std::unique_ptr<NavigationStack> makeNavigationStack(std::shared_ptr<PaneController> root) override;
  std::unique_ptr<ModalScreen> makeModalScreen(const ScreenLayout& layout,
                                               ModalScreen::Actions actions) override;
  /// Shows nothing while there is no window.
  void showAlert(const Alert& alert) override;

 private:
  WindowWidget::Wishes _wishes;
  RememberedSize _lastSize;
  std::function<void(WindowWidget& window)> _windowObserver;
  NavigationWidget::RecordSource _recordSource;
  FontMetrics _textMetrics;
  QPointer<WindowWidget> _window;  // the newest window
};

}  // namespace varnel
