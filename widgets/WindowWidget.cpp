#include "widgets/WindowWidget.h"

#include <QCloseEvent>
#include <QKeyEvent>
#include <utility>

#include "widgets/FirstSize.h"
#include "widgets/QtValues.h"

namespace varnel {

namespace {

bool isControlAnd(Qt::Key key, const QKeyEvent& event) {
  return event.key() == key && event.modifiers() == Qt::ControlModifier;
}

}  // namespace

WindowWidget::WindowWidget(const Rect& frame, Wishes wishes) : _wishes(std::move(wishes)) {
  setWindowTitle(QStringLiteral("Varnel"));
  setMinimumSize(smallestWindowSide, smallestWindowSide);
  resize(qtPixels(frame).size());
}

WindowWidget::~WindowWidget() { dropRoot(); }

void WindowWidget::dropRoot() {
  if (!_root) return;
  _root->hide();
  _root->setParent(nullptr);
  _root.clear();
}

void WindowWidget::setRoot(NavigationStack& stack) {
  dropRoot();
  _root = &static_cast<NavigationWidget&>(stack);
  _root->setParent(this);
  _root->setGeometry(rect());
  if (isVisible()) makeKeyAndVisible();
}

void WindowWidget::makeKeyAndVisible() {
  if (_root) {
    _root->appear();
    _root->show();
  }
  show();
  raise();
  activateWindow();
}

void WindowWidget::setTitle(std::string_view title) { setWindowTitle(singleLine(title)); }

void WindowWidget::takeKeyboard() {
  if (_root) _root->takeKeyboard();
}

void WindowWidget::resizeEvent(QResizeEvent* event) {
  QWidget::resizeEvent(event);
  if (_root) _root->setGeometry(rect());
}

void WindowWidget::keyPressEvent(QKeyEvent* event) {
  if (isControlAnd(Qt::Key_R, *event) && _wishes.startOver) return _wishes.startOver();
  // Not every desktop has its own key for quitting.
  if (event->matches(QKeySequence::Quit) || isControlAnd(Qt::Key_Q, *event)) {
    close();
    return;
  }
  // No widget had the keyboard focus for this key. From now on one has it.
  if (!focusWidget()) takeKeyboard();
  event->ignore();
}

void WindowWidget::closeEvent(QCloseEvent* event) {
  event->accept();
  if (_wishes.close) _wishes.close();
}

void WindowWidget::hideEvent(QHideEvent* event) {
  QWidget::hideEvent(event);
  const bool isMinimized = event->spontaneous();
  if (!isMinimized && _leavingObserver) _leavingObserver(ordinarySize());
}

QSize WindowWidget::ordinarySize() const {
  const bool fillsTheScreen = isMaximized() || isFullScreen();
  return fillsTheScreen && normalGeometry().isValid() ? normalGeometry().size() : size();
}

}  // namespace varnel
