#include "widgets/RowMenu.h"

#include <QContextMenuEvent>
#include <utility>

namespace varnel {

RowMenu::RowMenu(WindowWidget& window, QList<QAction*> rowActions)
    : QObject(&window), _window(window), _rowActions(std::move(rowActions)) {
  _window.installEventFilter(this);
}

QPoint placeOfFocus(const WindowWidget& window) {
  const auto* const table = dynamic_cast<const TableWidget*>(window.focusWidget());
  const RowWidget* const row = table ? table->currentRow() : nullptr;
  return row ? row->mapToGlobal(row->rect().center()) : window.mapToGlobal(window.rect().center());
}

void RowMenu::open() { openAt(placeOfFocus(_window)); }

void RowMenu::openAt(const QPoint& place) {
  if (_menu) return;
  _menu = new QMenu(&_window);
  _menu->setAttribute(Qt::WA_DeleteOnClose);
  _menu->addActions(_rowActions);
  _menu->addSeparator();
  for (QAction* const action : _window.actions()) {
    if (action->isVisible() && !action->text().isEmpty() && !_rowActions.contains(action))
      _menu->addAction(action);
  }
  _menu->popup(place);
}

// The widgets below the mouse have no use for the event, so the window gets it.
bool RowMenu::eventFilter(QObject* watched, QEvent* event) {
  if (event->type() != QEvent::ContextMenu || _window.page() || _window.isCovered())
    return QObject::eventFilter(watched, event);
  const auto& wish = static_cast<QContextMenuEvent&>(*event);
  event->accept();
  if (wish.reason() == QContextMenuEvent::Keyboard) {
    open();
  } else {
    openAt(wish.globalPos());
  }
  return true;
}

}  // namespace varnel
