#include "widgets/WidgetUserInterface.h"

#include <QGuiApplication>
#include <QScreen>
#include <utility>

#include "base/Log.h"
#include "widgets/AccessibleTable.h"
#include "widgets/AlertWidget.h"

namespace varnel {

namespace {

// On a desktop the window is at first about as large as a phone's screen.
constexpr QSize preferredSize(480, 800);
// A screen that is hardly larger is taken whole.
constexpr QSize smallScreen(640, 960);

}  // namespace

WidgetUserInterface::WidgetUserInterface(WindowWidget::Wishes wishes) : _wishes(std::move(wishes)) {
  describeTablesToScreenReaders();
}

Rect WidgetUserInterface::screenBounds() const {
  const QScreen* const screen = QGuiApplication::primaryScreen();
  // A desktop may be without any screen for a while.
  const QRect available = screen ? screen->availableGeometry() : QRect(QPoint(), preferredSize);
  QRect bounds = available;
  if (available.width() > smallScreen.width()) {
    bounds.setSize(preferredSize.boundedTo(available.size()));
    bounds.moveCenter(available.center());
  }
  return {double(bounds.x()), double(bounds.y()), double(bounds.width()), double(bounds.height())};
}

Rect WidgetUserInterface::applicationFrame() const {
  if (!_window) return screenBounds();
  return {0, 0, double(_window->width()), double(_window->height())};
}

std::unique_ptr<Window> WidgetUserInterface::makeWindow(const Rect& frame) {
  auto window = std::make_unique<WindowWidget>(frame, _wishes);
  _window = window.get();
  return window;
}

std::unique_ptr<TablePane> WidgetUserInterface::makeTablePane() { return std::make_unique<PaneWidget>(); }

std::unique_ptr<NavigationStack> WidgetUserInterface::makeNavigationStack(
    std::shared_ptr<PaneController> root) {
  return std::make_unique<NavigationWidget>(std::move(root));
}

std::unique_ptr<ModalScreen> WidgetUserInterface::makeModalScreen(const ScreenLayout& layout,
                                                                  ModalScreen::Actions actions) {
  return std::make_unique<ModalScreenWidget>(layout, std::move(actions));
}

void WidgetUserInterface::showAlert(const Alert& alert) {
  if (!_window) {
    logError("There is no window for an alert: %s", alert.message);
    return;
  }
  // The window deletes it, unless the user closes it before.
  new AlertWidget(alert, *_window, [window = _window] {
    if (window) window->takeKeyboard();
  });
}

}  // namespace varnel
