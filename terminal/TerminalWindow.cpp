#include "terminal/TerminalWindow.h"

#include <utility>

#include "terminal/Characters.h"

namespace varnel {

TerminalWindow::TerminalWindow(const Area& area, Repainting& repainting,
                               std::function<void()> leavingObserver)
    : _area(area), _repainting(repainting), _leavingObserver(std::move(leavingObserver)) {}

TerminalWindow::~TerminalWindow() {
  dropRoot();
  if (_leavingObserver) _leavingObserver();
}

void TerminalWindow::dropRoot() {
  if (_root) _root->setWindow(nullptr);
  _root = nullptr;
}

void TerminalWindow::setRoot(NavigationStack& stack) {
  dropRoot();
  // The user interface that made this window made the stack too.
  _root = &static_cast<TerminalStack&>(stack);
  _root->setWindow(this);
  _root->setArea(_area);
  if (_isVisible) makeKeyAndVisible();
}

void TerminalWindow::makeKeyAndVisible() {
  _isVisible = true;
  if (_root) _root->appear();
  _repainting.want();
}

void TerminalWindow::setTitle(std::string_view title) {
  _title = charactersOf(title);
  _repainting.want();
}

void TerminalWindow::hide() {
  _isVisible = false;
  _repainting.want();
}

void TerminalWindow::setArea(const Area& area) {
  _area = area;
  if (_root) _root->setArea(area);
}

}  // namespace varnel
