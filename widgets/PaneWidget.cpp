#include "widgets/PaneWidget.h"

#include <QApplication>
#include <utility>

#include "widgets/QtValues.h"
#include "widgets/RowMenu.h"

namespace varnel {

PaneWidget::PaneWidget() : _column(this) {
  setAutoFillBackground(true);
  _column.setContentsMargins(0, 0, 0, 0);
  _column.setSpacing(0);
  _column.addWidget(&_header);
  _column.addWidget(&_notice);
  _column.addWidget(&_table, 1);
  _column.addWidget(&_toolbar);
  _toolbar.hide();
  _table.setLoadObserver([this] { tableWasLoaded(); });
  _header.setSideAction([this] { _records ? showRows() : showRecords(); });
}

void PaneWidget::tableWasLoaded() {
  // An empty list does not tell whether it is one of records. It keeps the form that it had.
  const bool offersRecords = _source.hasRecords && (_source.hasRecords() || _records);
  if (offersRecords != _offersRecords) {
    _offersRecords = offersRecords;
    showSideButton();
  }
  if (isVisible()) refreshRecords();
}

void PaneWidget::showEvent(QShowEvent* event) {
  QWidget::showEvent(event);
  refreshRecords();
}

void PaneWidget::refreshRecords() {
  if (!_records || !_source.records) return;
  if (auto list = _source.records())
    _records->showRecords(std::move(*list));
  else
    showRows();
}

void PaneWidget::showSideButton() {
  if (!_offersRecords) return _header.showSideButton(std::nullopt);
  if (_records)
    _header.showSideButton(HeaderWidget::SideButton{tr("Rows"), tr("Show the rows again (Ctrl+T)")});
  else
    _header.showSideButton(HeaderWidget::SideButton{tr("Table"), tr("Show a table with columns (Ctrl+T)")});
}

void PaneWidget::showRecords() {
  if (_records || !_offersRecords) return;
  _records = new RecordTableWidget([this](std::size_t place) { _table.chooseRow(place); });
  _records->setAccessibleName(_header.title());
  _records->markOpen(_openRow);
  _records->setPale(_isPale);
  _column.insertWidget(_column.indexOf(&_table), _records, 1);
  refreshRecords();
  if (!_records) return;
  const bool hadKeyboard = isAncestorOf(QApplication::focusWidget());
  _records->show();
  if (const auto place = _table.currentPlace()) _records->makeCurrent(*place);
  _table.hide();
  if (hadKeyboard) takeKeyboard(Qt::OtherFocusReason);
  showSideButton();
}

// A key of the table may have caused the call.
void PaneWidget::showRows() {
  if (!_records) return;
  RecordTableWidget* const leaving = std::exchange(_records, nullptr);
  const bool hadKeyboard = isAncestorOf(QApplication::focusWidget());
  if (const auto place = leaving->currentPlace()) _table.selectRow({0, *place});
  _table.show();
  if (hadKeyboard) takeKeyboard(Qt::OtherFocusReason);
  leaving->hide();
  leaving->deleteLater();
  showSideButton();
}

void PaneWidget::markOpenRow(const QString& name) {
  _openRow = name;
  _table.markOpenRow(name);
  if (_records) _records->markOpen(name);
}

void PaneWidget::setPale(bool isPale) {
  _isPale = isPale;
  _table.setPale(isPale);
  if (_records) _records->setPale(isPale);
}

void PaneWidget::takeKeyboard(Qt::FocusReason reason) {
  QWidget* const list = _records ? static_cast<QWidget*>(_records) : &_table;
  list->setFocus(reason);
}

std::vector<std::string> PaneWidget::pathOfFocus() const {
  if (!_records) {
    const RowWidget* const row = _table.currentRow();
    return row ? std::vector{utf8(row->name())} : std::vector<std::string>();
  }
  std::vector<std::string> path;
  const QString name = _records->currentName();
  if (!name.isEmpty()) path.push_back(utf8(name));
  if (const QString column = _records->currentColumn(); !path.empty() && !column.isEmpty())
    path.push_back(utf8(column));
  return path;
}

void PaneWidget::setTitle(std::string_view title) {
  const QString shown = singleLine(title);
  if (shown == _header.title()) return;
  _header.setTitle(shown);
  _table.setAccessibleName(shown);
  if (_titleObserver) _titleObserver();
}

void PaneWidget::setToolbarItems(std::vector<ToolbarItem> items, Animation) {
  _toolbar.setItems(std::move(items));
}

void PaneWidget::resignFirstResponder() {
  if (QWidget* holder = focusWidget(); holder && holder->hasFocus()) holder->clearFocus();
}

void PaneWidget::showAs(Role role, bool hasToolbar) {
  _toolbar.setVisible(hasToolbar && role == Role::Top);
  const bool hasMenu = window()->findChild<RowMenu*>(QString(), Qt::FindDirectChildrenOnly);
  _header.showMenuButton(hasMenu && role == Role::Top);
  _notice.setShownElsewhere(role == Role::Beside);
}

void PaneWidget::fallSilent() {
  _table.fallSilent();
  _toolbar.fallSilent();
  _header.setBackAction(nullptr);
  _titleObserver = nullptr;
  _header.setSideAction(nullptr);
  _source = {};
}

}  // namespace varnel
