#include "widgets/WindowWidget.h"

#include <QCloseEvent>
#include <QKeyEvent>
#include <algorithm>
#include <utility>

#include "widgets/AlertWidget.h"
#include "widgets/FirstSize.h"
#include "widgets/QtValues.h"

namespace varnel {

WindowWidget::WindowWidget(const Rect& frame, Wishes wishes) : _wishes(std::move(wishes)) {
  setWindowTitle(QStringLiteral("Varnel"));
  setMinimumSize(smallestWindowSide, smallestWindowSide);
  resize(qtPixels(frame).size());
  if (_wishes.startOver) addCommand(tr("Start over"), {Qt::CTRL | Qt::Key_R}, _wishes.startOver);
  // Not every desktop has its own key for quitting.
  auto quitKeys = QKeySequence::keyBindings(QKeySequence::Quit);
  if (!quitKeys.contains(QKeySequence(Qt::CTRL | Qt::Key_Q))) quitKeys.append(Qt::CTRL | Qt::Key_Q);
  addCommand(tr("Quit"), quitKeys, [this] { close(); });
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
  _root->setNoticeObserver([this] {
    if (_page) _page->notice().setText(_root->noticeText());
  });
  arrange();
  if (isVisible()) makeKeyAndVisible();
}

// The page hides the stack, so that no pane takes the keyboard below it.
void WindowWidget::arrange() {
  const int barHeight = _bar ? std::min(_bar->sizeHint().height(), height()) : 0;
  const QRect main(0, 0, width(), height() - barHeight);
  if (_root) _root->setGeometry(main);
  if (_page) _page->setGeometry(main);
  if (_bar) _bar->setGeometry(0, main.height(), width(), barHeight);
}

QAction& WindowWidget::addCommand(const QString& text, const QList<QKeySequence>& keys,
                                  std::function<void()> act) {
  auto* const action = new QAction(text, this);
  action->setShortcuts(keys);
  connect(action, &QAction::triggered, this, [this, act = std::move(act)] {
    if (!isCovered()) act();
  });
  addAction(action);
  return *action;
}

bool WindowWidget::offers(const QAction& action) const {
  const auto condition = _conditions.find(&action);
  return condition == _conditions.end() || condition->second();
}

bool WindowWidget::isCovered() const {
  if (_root && _root->modalScreen()) return true;
  return std::ranges::any_of(children(),
                             [](const QObject* child) { return dynamic_cast<const AlertWidget*>(child); });
}

void WindowWidget::showPage(const QString& title, std::unique_ptr<QWidget> content) {
  closePage();
  const QString below = _root ? _root->topPane().header().title() : windowTitle();
  _page = new PageWidget(
      {title, below}, std::move(content), [this] { closePage(); }, *this);
  if (_root) _page->notice().setText(_root->noticeText());
  arrange();
  _page->show();
  if (_root) _root->hide();
  takeKeyboard();
}

// A key or a button of the page may have caused the call.
void WindowWidget::closePage() {
  if (!_page) return;
  PageWidget* const leaving = std::exchange(_page, nullptr);
  leaving->hide();
  leaving->deleteLater();
  if (_root) _root->show();
  takeKeyboard();
}

void WindowWidget::setBar(std::unique_ptr<QWidget> bar) {
  if (_bar) {
    _bar->hide();
    _bar.release()->deleteLater();  // one of its buttons may have caused the call
  }
  _bar = std::move(bar);
  if (_bar) {
    _bar->setParent(this);
    _bar->show();
  }
  arrange();
}

std::vector<std::string> WindowWidget::pathOfFocus() const {
  return _root ? _root->pathOfFocus() : std::vector<std::string>();
}

void WindowWidget::makeKeyAndVisible() {
  if (_root) {
    _root->setVisible(!_page);
    _root->appear();
  }
  show();
  raise();
  activateWindow();
}

void WindowWidget::setTitle(std::string_view title) { setWindowTitle(singleLine(title)); }

void WindowWidget::takeKeyboard() {
  if (_page) return _page->takeKeyboard();
  if (_root) _root->takeKeyboard();
}

void WindowWidget::resizeEvent(QResizeEvent* event) {
  QWidget::resizeEvent(event);
  arrange();
}

void WindowWidget::keyPressEvent(QKeyEvent* event) {
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
