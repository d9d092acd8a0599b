#include "widgets/NavigationWidget.h"

#include <QKeyEvent>
#include <QMouseEvent>
#include <QTimer>
#include <algorithm>
#include <utility>

#include "widgets/Motion.h"
#include "widgets/QtValues.h"

namespace varnel {

namespace {

// The user interface that made this stack made its panes and screens too.
PaneWidget& paneOf(PaneController& controller) { return static_cast<PaneWidget&>(controller.pane()); }
ModalScreenWidget& screenOf(ModalController& controller) {
  return static_cast<ModalScreenWidget&>(controller.screen());
}

bool isWayBack(const QKeyEvent& event) {
  if (event.matches(QKeySequence::Back)) return true;
  if ((event.modifiers() & ~Qt::KeypadModifier) != Qt::NoModifier) return false;
  switch (event.key()) {
    case Qt::Key_Escape:
    case Qt::Key_Left:
    case Qt::Key_Backspace:
    case Qt::Key_Back:
      return true;
    default:
      return false;
  }
}

}  // namespace

NavigationWidget::NavigationWidget(std::shared_ptr<PaneController> root) {
  _controllers.push_back(std::move(root));
  adopt(0);
}

NavigationWidget::~NavigationWidget() {
  // Their widgets do not belong to this one.
  if (_modal) screenOf(*_modal).leave();
  for (const auto& controller : _controllers) release(*controller);
}

void NavigationWidget::adopt(std::size_t index) {
  PaneController& controller = *_controllers[index];
  controller.setNavigationController(this);
  PaneWidget& pane = paneOf(controller);
  pane.setParent(this);
  pane.setGeometry(rect());
  pane.toolbar().setVisible(_showsToolbar);
  pane.notice().setText(_notice);
  pane.header().setBackAction([this] { goBack(); });
  showWayBack(index);
  pane.setTitleObserver([this, index] {
    if (index + 1 < _controllers.size()) showWayBack(index + 1);
  });
}

void NavigationWidget::showWayBack(std::size_t index) {
  if (index == 0) return;
  paneOf(*_controllers[index]).header().showBackButton(paneOf(*_controllers[index - 1]).header().title());
}

void NavigationWidget::release(PaneController& controller) {
  PaneWidget& pane = paneOf(controller);
  pane.fallSilent();
  pane.hide();
  pane.setParent(nullptr);
  controller.setNavigationController(nullptr);
}

void NavigationWidget::appear() {
  showTop();
  topController()->viewWillAppear(Animation::None);
  topPane().show();
  takeKeyboard();
}

void NavigationWidget::push(std::shared_ptr<PaneController> controller, Animation animation) {
  auto controllers = _controllers;
  controllers.push_back(std::move(controller));
  changeTop(std::move(controllers), animation, SlideOverlay::Movement::Forth);
}

void NavigationWidget::popTo(const PaneController& controller, Animation animation) {
  const auto kept = std::ranges::find(_controllers, &controller, &std::shared_ptr<PaneController>::get);
  if (kept == _controllers.end() || kept + 1 == _controllers.end()) return;
  changeTop({_controllers.begin(), kept + 1}, animation, SlideOverlay::Movement::Back);
}

void NavigationWidget::changeTop(std::vector<std::shared_ptr<PaneController>> controllers,
                                 Animation animation, SlideOverlay::Movement movement) {
  const bool isShown = isVisible() && !_modal;
  const Animation shownAs = isShown && isShownHappening(*this, animation) ? animation : Animation::None;
  const QPixmap former = shownAs == Animation::Animated ? topPane().grab() : QPixmap();
  const auto formerControllers = std::exchange(_controllers, std::move(controllers));
  if (_controllers.size() > formerControllers.size()) adopt(_controllers.size() - 1);

  formerControllers.back()->viewWillDisappear(shownAs);
  topController()->viewWillAppear(shownAs);
  if (_delegate)
    _delegate->navigationController_willShowViewController_animated(*this, *topController(), shownAs);

  showTop();
  if (shownAs == Animation::Animated) slide(former, topPane().grab(), movement);
  for (std::size_t index = _controllers.size(); index < formerControllers.size(); ++index) {
    release(*formerControllers[index]);
    releaseLater(formerControllers[index]);
  }
  takeKeyboard();
}

void NavigationWidget::showTop() {
  PaneWidget& top = topPane();
  top.setGeometry(rect());
  top.show();
  top.raise();
  for (const auto& controller : _controllers) {
    if (PaneWidget& pane = paneOf(*controller); &pane != &top) pane.hide();
  }
  if (ModalScreenWidget* screen = modalScreen()) screen->raise();
}

void NavigationWidget::showToolbar() {
  _showsToolbar = true;
  for (const auto& controller : _controllers) paneOf(*controller).toolbar().show();
}

void NavigationWidget::setNotice(std::string_view text) {
  _notice = text;
  for (const auto& controller : _controllers) paneOf(*controller).notice().setText(_notice);
  if (ModalScreenWidget* screen = modalScreen()) screen->notice().setText(_notice);
}

void NavigationWidget::present(std::shared_ptr<ModalController> controller, Animation animation) {
  dismiss(Animation::None);
  const Animation shownAs = isShownHappening(*this, animation) ? animation : Animation::None;
  const QPixmap former = shownAs == Animation::Animated ? topPane().grab() : QPixmap();
  _modal = std::move(controller);
  ModalScreenWidget& screen = screenOf(*_modal);
  screen.enter(*this);
  screen.notice().setText(_notice);
  _modal->viewDidLoad();
  _modal->viewWillAppear(shownAs);
  screen.show();
  screen.raise();
  if (shownAs == Animation::Animated) slide(former, screen.grab(), SlideOverlay::Movement::Rise);
  takeKeyboard();
}

void NavigationWidget::dismiss(Animation animation) {
  if (!_modal) return;
  ModalScreenWidget& screen = screenOf(*_modal);
  const bool isAnimated = isShownHappening(*this, animation);
  const QPixmap former = isAnimated ? screen.grab() : QPixmap();
  screen.leave();
  if (isAnimated) slide(former, topPane().grab(), SlideOverlay::Movement::Sink);
  releaseLater(std::exchange(_modal, nullptr));
  takeKeyboard();
}

// A button of the leaving object may have caused this call. So the object is released later, by the event
// loop.
void NavigationWidget::releaseLater(std::shared_ptr<void> leaving) {
  QTimer::singleShot(0, this, [leaving = std::move(leaving)] {});
}

void NavigationWidget::slide(const QPixmap& former, const QPixmap& next, SlideOverlay::Movement movement) {
  delete _overlay.data();
  _overlay = new SlideOverlay(former, next, movement, *this);
  _overlay->show();
}

void NavigationWidget::takeKeyboard() {
  if (isHidden()) return;  // a page of the window has the keyboard
  if (ModalScreenWidget* screen = modalScreen()) return screen->takeKeyboard();
  topPane().tableWidget().setFocus(Qt::OtherFocusReason);
}

std::vector<std::string> NavigationWidget::pathOfFocus() const {
  std::vector<std::string> path;
  for (std::size_t i = 1; i < _controllers.size(); ++i)
    path.push_back(utf8(paneOf(*_controllers[i]).header().title()));
  if (const RowWidget* const row = topPane().tableWidget().currentRow()) path.push_back(utf8(row->name()));
  return path;
}

PaneWidget& NavigationWidget::topPane() const { return paneOf(*_controllers.back()); }

ModalScreenWidget* NavigationWidget::modalScreen() const { return _modal ? &screenOf(*_modal) : nullptr; }

void NavigationWidget::resizeEvent(QResizeEvent* event) {
  QWidget::resizeEvent(event);
  delete _overlay.data();
  topPane().setGeometry(rect());
  if (ModalScreenWidget* screen = modalScreen()) screen->setGeometry(rect());
}

void NavigationWidget::goBack() {
  if (_controllers.size() < 2) return;
  const auto below = _controllers[_controllers.size() - 2];
  popTo(*below, Animation::Animated);
}

void NavigationWidget::keyPressEvent(QKeyEvent* event) {
  if (isWayBack(*event)) return goBack();
  if (event->matches(QKeySequence::Save) && topPane().toolbar().press(BarButton::SystemItem::Save)) return;
  event->ignore();
}

void NavigationWidget::mousePressEvent(QMouseEvent* event) {
  if (event->button() == Qt::BackButton) return goBack();
  event->ignore();
}

}  // namespace varnel
