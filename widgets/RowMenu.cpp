#include "widgets/RowMenu.h"

#include <QContextMenuEvent>
#include <QScreen>

namespace varnel {

namespace {

const QString roomyItems = QStringLiteral(
    "QMenu::item { padding: 11px 14px; }"
    "QMenu::item:selected { background: palette(highlight); color: palette(highlighted-text); }");

}  // namespace

RowMenu::RowMenu(WindowWidget& window) : QObject(&window), _window(window), _lastActions(window.actions()) {
  _window.installEventFilter(this);
}

QPoint placeOfFocus(const WindowWidget& window) {
  if (const auto* const table = dynamic_cast<const TableWidget*>(window.focusWidget())) {
    if (const RowWidget* const row = table->currentRow()) return row->mapToGlobal(row->rect().center());
  }
  if (const auto* const table = dynamic_cast<const RecordTableWidget*>(window.focusWidget())) {
    const QRect cell = table->visualRect(table->currentIndex());
    if (!cell.isEmpty()) return table->viewport()->mapToGlobal(cell.center());
  }
  return window.mapToGlobal(window.rect().center());
}

void RowMenu::open() { openAt(placeOfFocus(_window), Items::ForMouse); }

void RowMenu::openAt(const QPoint& place, Items items) {
  if (_menu) return;
  _menu = new QMenu(&_window);
  _menu->setAttribute(Qt::WA_DeleteOnClose);
  if (items == Items::ForFinger) _menu->setStyleSheet(roomyItems);
  _menu->addActions(_rowActions);
  _menu->addSeparator();
  for (QAction* const action : _window.actions()) {
    const bool isElsewhere =
        _rowActions.contains(action) || _lastActions.contains(action) || action == _leftOut;
    if (!action->text().isEmpty() && !isElsewhere) _menu->addAction(action);
  }
  _menu->addSeparator();
  _menu->addActions(_lastActions);
  offerWhatApplies();
  showKeysIfTheyFit();
  _menu->popup(place);
}

// An action is enabled again as soon as the menu goes, since its keys may say why it does nothing.
void RowMenu::offerWhatApplies() {
  for (QAction* const action : _menu->actions()) {
    if (action->isSeparator() || _window.offers(*action)) continue;
    action->setEnabled(false);
    connect(_menu, &QMenu::aboutToHide, action, [action] { action->setEnabled(true); });
  }
}

// Keys that are cut at the edge of the screen would tell nobody anything.
void RowMenu::showKeysIfTheyFit() {
  const auto showKeys = [this](bool areShown) {
    for (QAction* const action : _menu->actions()) action->setShortcutVisibleInContextMenu(areShown);
  };
  showKeys(true);
  if (_menu->sizeHint().width() > _window.screen()->availableGeometry().width()) showKeys(false);
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
    openAt(wish.globalPos(), wish.reason() == QContextMenuEvent::Other ? Items::ForFinger : Items::ForMouse);
  }
  return true;
}

}  // namespace varnel
