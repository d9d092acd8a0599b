#include "widgets/WidgetUserInterface.h"

#include <QGuiApplication>
#include <QScreen>
#include <utility>

#include "base/Log.h"
#include "widgets/AccessibleTable.h"
#include "widgets/AlertWidget.h"
#include "widgets/FirstSize.h"
#include "widgets/QtValues.h"

namespace varnel {

namespace {

// A desktop can be without any screen for a while.
constexpr QRect roomWithoutAScreen(0, 0, 800, 900);

QRect availableRoom() {
  const QScreen* const screen = QGuiApplication::primaryScreen();
  return screen ? screen->availableGeometry() : roomWithoutAScreen;
}

}  // namespace

WidgetUserInterface::WidgetUserInterface(WindowWidget::Wishes wishes, RememberedSize lastSize)
    : _wishes(std::move(wishes)), _lastSize(std::move(lastSize)) {
  describeTablesToScreenReaders();
}

Rect WidgetUserInterface::screenBounds() const {
  const QRect room = availableRoom();
  if (isTakenWhole(room.size()))
    return {double(room.x()), double(room.y()), double(room.width()), double(room.height())};
  const QSize size = firstSize(room.size(), _lastSize.size());
  return {0, 0, double(size.width()), double(size.height())};
}

Rect WidgetUserInterface::applicationFrame() const {
  if (!_window) return screenBounds();
  return {0, 0, double(_window->width()), double(_window->height())};
}

std::unique_ptr<Window> WidgetUserInterface::makeWindow(const Rect& frame) {
  auto window = std::make_unique<WindowWidget>(frame, _wishes);
  if (isTakenWhole(availableRoom().size())) {
    window->setGeometry(qtPixels(frame));
  } else {
    window->setLeavingObserver([this](const QSize& size) { _lastSize.keep(size); });
  }
  _window = window.get();
  if (_windowObserver) _windowObserver(*window);
  return window;
}

std::unique_ptr<TablePane> WidgetUserInterface::makeTablePane() { return std::make_unique<PaneWidget>(); }

std::unique_ptr<NavigationStack> WidgetUserInterface::makeNavigationStack(
    std::shared_ptr<PaneController> root) {
  auto stack = std::make_unique<NavigationWidget>(std::move(root));
  stack->setRecordSource(_recordSource);
  return stack;
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
  // The window deletes it, unless the user closes it first.
  new AlertWidget(alert, *_window, [window = _window] {
    if (window) window->takeKeyboard();
  });
}

}  // namespace varnel
