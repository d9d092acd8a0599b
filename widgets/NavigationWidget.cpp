#include "widgets/NavigationWidget.h"

#include <QApplication>
#include <QKeyEvent>
#include <QMouseEvent>
#include <QPainter>
#include <QTimer>
#include <algorithm>
#include <utility>

#include "widgets/Colors.h"
#include "widgets/Motion.h"
#include "widgets/PanePlaces.h"
#include "widgets/QtValues.h"

namespace varnel {

namespace {

// The user interface that made this stack made its panes and screens too.
PaneWidget& paneOf(PaneController& controller) { return static_cast<PaneWidget&>(controller.pane()); }
ModalScreenWidget& screenOf(ModalController& controller) {
  return static_cast<ModalScreenWidget&>(controller.screen());
}

bool hasModifiers(const QKeyEvent& event) {
  return (event.modifiers() & ~Qt::KeypadModifier) != Qt::NoModifier;
}

bool isWayBack(const QKeyEvent& event) {
  if (event.matches(QKeySequence::Back)) return true;
  if (hasModifiers(event)) return false;
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

bool hasKeyboard(const PaneWidget& pane) { return pane.isAncestorOf(QApplication::focusWidget()); }

}  // namespace

NavigationWidget::NavigationWidget(std::shared_ptr<PaneController> root) {
  _controllers.push_back(std::move(root));
  adopt(0);
  connect(qApp, &QApplication::focusChanged, this, [this] { showPaneWithKeyboard(); });
}

NavigationWidget::~NavigationWidget() {
  disconnect(qApp, nullptr, this, nullptr);
  // Their widgets do not belong to this one.
  if (_modal) screenOf(*_modal).leave();
  for (const auto& controller : _controllers) release(*controller);
}

void NavigationWidget::adopt(std::size_t index) {
  PaneController& controller = *_controllers[index];
  controller.setNavigationController(this);
  PaneWidget& pane = paneOf(controller);
  pane.setParent(this);
  pane.setGeometry(PanePlaces::in(rect(), _controllers.size()).top);
  pane.notice().setText(_notice);
  pane.header().setBackAction([this, index] { goBackFrom(index); });
  pane.tableWidget().setChoiceMaker(
      [this, index](const TableWidget::Choice& choice) { make(index, choice); });
  showWayBack(index);
  offerRecords(index);
  pane.setTitleObserver([this, index] {
    if (index + 1 < _controllers.size()) showWayBack(index + 1);
    if (PaneWidget* beside = paneBeside()) beside->markOpenRow(topPane().header().title());
  });
}

void NavigationWidget::showWayBack(std::size_t index) {
  if (index == 0) return;
  paneAt(index).header().showBackButton(paneAt(index - 1).header().title());
}

void NavigationWidget::release(PaneController& controller) {
  PaneWidget& pane = paneOf(controller);
  pane.fallSilent();
  pane.hide();
  pane.setParent(nullptr);
  controller.setNavigationController(nullptr);
}

void NavigationWidget::appear() {
  arrange();
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
  // A choice beside the top pane is seen at once: the pane that was open has gone already.
  const bool slides = shownAs == Animation::Animated && !_isChoosing;
  const QRect part = PanePlaces::partThatChanges(rect());
  endAnimation();
  const QPixmap former = slides ? grab(part) : QPixmap();
  const auto formerControllers = std::exchange(_controllers, std::move(controllers));
  if (_controllers.size() > formerControllers.size()) adopt(_controllers.size() - 1);

  formerControllers.back()->viewWillDisappear(shownAs);
  topController()->viewWillAppear(shownAs);
  if (_delegate)
    _delegate->navigationController_willShowViewController_animated(*this, *topController(), shownAs);

  for (std::size_t index = _controllers.size(); index < formerControllers.size(); ++index) {
    release(*formerControllers[index]);
    releaseLater(formerControllers[index]);
  }
  arrange();
  if (slides) slide(former, part, movement);
  takeKeyboard();
}

void NavigationWidget::arrange() {
  if (_isChoosing) return;
  const PanePlaces places = PanePlaces::in(rect(), _controllers.size());
  const std::size_t top = _controllers.size() - 1;
  bool losesKeyboard = false;
  for (std::size_t index = 0; index <= top; ++index) {
    PaneWidget& pane = paneAt(index);
    const bool isBeside = places.left && index + 1 == top;
    pane.showAs(isBeside ? PaneWidget::Role::Beside : PaneWidget::Role::Top, _showsToolbar);
    pane.markOpenRow(isBeside ? topPane().header().title() : QString());
    if (isBeside || index == top) {
      pane.setGeometry(isBeside ? *places.left : places.top);
      pane.show();
      pane.raise();
    } else {
      losesKeyboard |= hasKeyboard(pane);
      pane.hide();
    }
  }
  if (ModalScreenWidget* screen = modalScreen()) screen->raise();
  showPaneWithKeyboard();
  if (losesKeyboard) takeKeyboard();
}

// A choice in the pane that is beside the top one goes back to that pane first.
void NavigationWidget::make(std::size_t index, const TableWidget::Choice& choice) {
  if (index + 1 == _controllers.size()) return choice();
  _isChoosing = true;
  popTo(*_controllers[index], Animation::None);
  choice();
  _isChoosing = false;
  arrange();
  takeKeyboard();
}

void NavigationWidget::showToolbar() {
  if (_showsToolbar) return;
  _showsToolbar = true;
  arrange();
}

void NavigationWidget::setNotice(std::string_view text) {
  _notice = text;
  for (const auto& controller : _controllers) paneOf(*controller).notice().setText(_notice);
  if (ModalScreenWidget* screen = modalScreen()) screen->notice().setText(_notice);
  if (_noticeObserver) _noticeObserver();
}

void NavigationWidget::present(std::shared_ptr<ModalController> controller, Animation animation) {
  dismiss(Animation::None);
  const Animation shownAs = isShownHappening(*this, animation) ? animation : Animation::None;
  endAnimation();
  const QPixmap former = shownAs == Animation::Animated ? grab() : QPixmap();
  _modal = std::move(controller);
  ModalScreenWidget& screen = screenOf(*_modal);
  screen.enter(*this);
  screen.notice().setText(_notice);
  _modal->viewDidLoad();
  _modal->viewWillAppear(shownAs);
  screen.show();
  screen.raise();
  if (shownAs == Animation::Animated) slide(former, rect(), SlideOverlay::Movement::Rise);
  takeKeyboard();
}

void NavigationWidget::dismiss(Animation animation) {
  if (!_modal) return;
  ModalScreenWidget& screen = screenOf(*_modal);
  const bool isAnimated = isShownHappening(*this, animation);
  endAnimation();
  const QPixmap former = isAnimated ? grab() : QPixmap();
  screen.leave();
  if (isAnimated) slide(former, rect(), SlideOverlay::Movement::Sink);
  releaseLater(std::exchange(_modal, nullptr));
  takeKeyboard();
}

// A button of the leaving object may have caused this call. So the object is released later, by the event
// loop.
void NavigationWidget::releaseLater(std::shared_ptr<void> leaving) {
  QTimer::singleShot(0, this, [leaving = std::move(leaving)] {});
}

void NavigationWidget::endAnimation() {
  const std::unique_ptr<SlideOverlay> overlay(_overlay.data());
  _overlay.clear();
}

// From the former picture of this part to what it shows now.
void NavigationWidget::slide(const QPixmap& former, const QRect& part, SlideOverlay::Movement movement) {
  _overlay = new SlideOverlay(former, grab(part), movement, part, *this);
  _overlay->show();
}

void NavigationWidget::takeKeyboard() {
  if (isHidden()) return;  // a page of the window has the keyboard
  if (ModalScreenWidget* screen = modalScreen()) return screen->takeKeyboard();
  topPane().takeKeyboard(Qt::OtherFocusReason);
}

// The names from below the root to the node of this pane.
std::vector<std::string> NavigationWidget::pathOf(std::size_t index) const {
  std::vector<std::string> path;
  for (std::size_t i = 1; i <= index; ++i) path.push_back(utf8(paneAt(i).header().title()));
  return path;
}

std::vector<std::string> NavigationWidget::pathOfFocus() const {
  const std::size_t index = paneWithKeyboard();
  std::vector<std::string> path = pathOf(index);
  for (std::string& name : paneAt(index).pathOfFocus()) path.push_back(std::move(name));
  return path;
}

bool NavigationWidget::hasRowWithFocus() const { return !paneAt(paneWithKeyboard()).pathOfFocus().empty(); }

// When no pane has the keyboard, the top one counts. A window that is not active keeps its pane.
std::size_t NavigationWidget::paneWithKeyboard() const {
  const PaneWidget* const beside = paneBeside();
  return _controllers.size() - (beside && beside->isAncestorOf(window()->focusWidget()) ? 2 : 1);
}

// The commands of rows are for the pane with the keyboard.
void NavigationWidget::showPaneWithKeyboard() {
  if (_isChoosing) return;
  const std::size_t marked = paneWithKeyboard();
  for (std::size_t index = 0; index < _controllers.size(); ++index) paneAt(index).setPale(index != marked);
}

void NavigationWidget::setRecordSource(const RecordSource& source) {
  _recordSource = source;
  for (std::size_t index = 0; index < _controllers.size(); ++index) offerRecords(index);
}

void NavigationWidget::offerRecords(std::size_t index) {
  if (!_recordSource.hasRecords || !_recordSource.records) return;
  paneAt(index).setRecordSource({[this, index] { return _recordSource.hasRecords(pathOf(index)); },
                                 [this, index] { return _recordSource.records(pathOf(index)); }});
}

bool NavigationWidget::toggleRecordTable() {
  for (PaneWidget* const pane : {&paneAt(paneWithKeyboard()), &topPane()}) {
    if (!pane->offersRecords()) continue;
    pane->recordTable() ? pane->showRows() : pane->showRecords();
    return true;
  }
  return false;
}

bool NavigationWidget::offersRecordTable() const {
  return paneAt(paneWithKeyboard()).offersRecords() || topPane().offersRecords();
}

// Escape in a table with columns does not go back yet.
bool NavigationWidget::showRowsAgain(const QKeyEvent& event) {
  PaneWidget& pane = paneAt(paneWithKeyboard());
  if (event.key() != Qt::Key_Escape || !pane.recordTable()) return false;
  pane.showRows();
  return true;
}

PaneWidget& NavigationWidget::paneAt(std::size_t index) const { return paneOf(*_controllers[index]); }

PaneWidget& NavigationWidget::topPane() const { return paneOf(*_controllers.back()); }

PaneWidget* NavigationWidget::paneBeside() const {
  const bool isThere = PanePlaces::in(rect(), _controllers.size()).left.has_value();
  return isThere ? &paneAt(_controllers.size() - 2) : nullptr;
}

ModalScreenWidget* NavigationWidget::modalScreen() const { return _modal ? &screenOf(*_modal) : nullptr; }

void NavigationWidget::resizeEvent(QResizeEvent* event) {
  QWidget::resizeEvent(event);
  endAnimation();
  arrange();
  if (ModalScreenWidget* screen = modalScreen()) screen->setGeometry(rect());
}

// The line between two panes.
void NavigationWidget::paintEvent(QPaintEvent*) {
  QPainter(this).fillRect(rect(), separatorColor(palette()));
}

void NavigationWidget::goBack() { goBackFrom(_controllers.size() - 1); }

void NavigationWidget::goBackFrom(std::size_t index) {
  if (index == 0) return;
  const auto below = _controllers[index - 1];
  popTo(*below, Animation::Animated);
}

// Left and Right between two panes. False when the key means something else.
bool NavigationWidget::moveKeyboard(const QKeyEvent& event) {
  PaneWidget* const beside = paneBeside();
  if (!beside || hasModifiers(event)) return false;
  const bool isBeside = hasKeyboard(*beside);
  if (event.key() != (isBeside ? Qt::Key_Right : Qt::Key_Left)) return false;
  // As after Tab, the table shows where the keyboard is.
  (isBeside ? topPane() : *beside).takeKeyboard(Qt::TabFocusReason);
  return true;
}

void NavigationWidget::keyPressEvent(QKeyEvent* event) {
  if (moveKeyboard(*event) || showRowsAgain(*event)) return;
  if (isWayBack(*event)) return goBack();
  if (event->matches(QKeySequence::Save) && topPane().toolbar().press(BarButton::SystemItem::Save)) return;
  event->ignore();
}

void NavigationWidget::mousePressEvent(QMouseEvent* event) {
  if (event->button() == Qt::BackButton) return goBack();
  event->ignore();
}

}  // namespace varnel
