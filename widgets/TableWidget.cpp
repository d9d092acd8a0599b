#include "widgets/TableWidget.h"

#include <QAccessible>
#include <QAction>
#include <QKeyEvent>
#include <QMouseEvent>
#include <QScrollBar>
#include <QToolTip>
#include <QWheelEvent>
#include <algorithm>
#include <cmath>
#include <utility>

namespace varnel {

namespace {

constexpr int rowHeight = static_cast<int>(tableRowHeight);
constexpr double sidewaysStep = 60;  // of an arrow key, logical pixels

// `makeCellView` made the view of every cell.
RowWidget& rowOf(const TableCell& cell) { return static_cast<RowWidget&>(cell.cellView()); }

// How far the wheel has turned sideways, in logical pixels; 0 when it has turned up or down.
double sidewaysMovement(const QWheelEvent& event) {
  const QPoint turned = event.pixelDelta().isNull() ? event.angleDelta() / 2 : event.pixelDelta();
  if (std::abs(turned.x()) > std::abs(turned.y())) return turned.x();
  return event.modifiers().testFlag(Qt::ShiftModifier) ? turned.y() : 0;
}

}  // namespace

TableWidget::TableWidget(QWidget* parent)
    : QAbstractScrollArea(parent),
      _touch(
          *this,
          [this](const QPoint& position) {
            const auto row = rowAt(position);
            return row ? visibleRow(*row) : nullptr;
          },
          [this](const QPoint& position) {
            _keysAreUsed = false;
            if (const auto row = rowAt(position)) takeClick(*row, position);
          }) {
  setFrameShape(QFrame::NoFrame);
  setFocusPolicy(Qt::StrongFocus);
  setHorizontalScrollBarPolicy(Qt::ScrollBarAlwaysOff);
  verticalScrollBar()->setSingleStep(rowHeight / 2);
  viewport()->setBackgroundRole(QPalette::Base);
  viewport()->setAutoFillBackground(true);
}

TableWidget::~TableWidget() = default;

void TableWidget::fallSilent() {
  _delegate = nullptr;
  _choiceMaker = nullptr;
  _loadObserver = nullptr;
}

void TableWidget::markOpenRow(const QString& name) {
  if (name == _openRow && name.isNull() == _openRow.isNull()) return;
  _openRow = name;
  showEmphasis();
}

void TableWidget::setPale(bool isPale) {
  if (isPale == _isPale) return;
  _isPale = isPale;
  showEmphasis();
}

void TableWidget::setDelegate(TableViewDelegate* delegate) {
  _delegate = delegate;
  if (!_delegate && _isLoaded) load();
}

void TableWidget::reloadData() { load(); }

void TableWidget::showFactsAgain() {
  if (!_delegate) return;
  for (const auto& [row, cell] : _visible)
    _delegate->tableView_showFactsInCell(*this, *cell, _rows.pathOf(row));
}

QString TableWidget::explanationOf(const RowWidget& row) {
  return _delegate && row.row() < _rows.rows()
             ? QString::fromStdString(_delegate->tableView_explanationOfRow(*this, _rows.pathOf(row.row())))
             : QString();
}

void TableWidget::load() {
  _isLoaded = true;
  const auto formerNames = namesOfVisibleRows();
  const auto sidewaysPositions = sidewaysPositionsByName();
  Rows rows = measureRows();
  putAwayAllRows();
  if (rows == Rows::Changed) forgetCells();
  updateScrollRange();
  updateVisibleRows();
  // Drops the cells that no row has taken back. If they were kept, they would come before the rows' own cells
  // at the next reload.
  _reloaded = CellPool();
  if (rows == Rows::Same && haveOtherNames(formerNames)) {
    rows = Rows::Changed;
    putAwayAllRows();
    forgetCells();
    updateVisibleRows();
  }
  if (rows == Rows::Changed) settleNewCells(sidewaysPositions);
  showEmphasis();
  if (_loadObserver) _loadObserver();
}

// Gives new cells the sideways positions of the old ones, and tells screen readers about the current row.
void TableWidget::settleNewCells(const std::map<QString, double>& sidewaysPositions) {
  for (RowWidget* row : visibleRows()) {
    const auto found = sidewaysPositions.find(row->name());
    if (found != sidewaysPositions.end()) row->scrollSidewaysTo(found->second);
  }
  if (_current) tellOfFocusOn(*_current);
}

void TableWidget::forgetCells() {
  _reloaded = CellPool();
  _pool = CellPool();
}

std::map<std::size_t, QString> TableWidget::namesOfVisibleRows() const {
  std::map<std::size_t, QString> names;
  for (const auto& [row, cell] : _visible) names.emplace(row, rowOf(*cell).name());
  return names;
}

// The positions of the rows that have been scrolled sideways.
std::map<QString, double> TableWidget::sidewaysPositionsByName() const {
  std::map<QString, double> positions;
  for (const RowWidget* row : visibleRows()) {
    if (row->sidewaysPosition() > 0) positions.emplace(row->name(), row->sidewaysPosition());
  }
  return positions;
}

bool TableWidget::haveOtherNames(const std::map<std::size_t, QString>& formerNames) const {
  return std::ranges::any_of(formerNames, [this](const auto& former) {
    const RowWidget* const row = visibleRow(former.first);
    return row && row->name() != former.second;
  });
}

TableWidget::Rows TableWidget::measureRows() {
  std::vector<std::size_t> rows;
  if (_delegate) {
    rows.resize(_delegate->numberOfSectionsInTableView(*this));
    for (std::size_t section = 0; section < rows.size(); ++section)
      rows[section] = _delegate->tableView_numberOfRowsInSection(*this, section);
  }
  const RowIndex former = std::exchange(_rows, RowIndex(std::move(rows)));
  if (_current && *_current >= _rows.rows()) {
    _current.reset();
    _currentIsSelected = false;
  }
  if (_sizesToFit) setMaximumHeight(static_cast<int>(_rows.rows()) * rowHeight);
  return _rows == former ? Rows::Same : Rows::Changed;
}

void TableWidget::updateScrollRange() {
  const int hidden = static_cast<int>(_rows.rows()) * rowHeight - viewport()->height();
  verticalScrollBar()->setPageStep(viewport()->height());
  verticalScrollBar()->setRange(0, std::max(0, hidden));
}

void TableWidget::updateVisibleRows() {
  if (!_isLoaded) return;
  const auto top = static_cast<std::size_t>(verticalScrollBar()->value());
  const auto bottom = top + static_cast<std::size_t>(viewport()->height());
  const std::size_t begin = std::min(_rows.rows(), top / rowHeight);
  const std::size_t end = std::min(_rows.rows(), (bottom + rowHeight - 1) / rowHeight);
  putAwayRowsOutside(begin, end);
  if (!_delegate) return;
  for (std::size_t row = begin; row < end; ++row) {
    if (!_visible.contains(row)) showRow(row);
  }
}

void TableWidget::showRow(std::size_t row) {
  std::unique_ptr<TableCell> cell = _delegate->tableView_cellForRowAtIndexPath(*this, _rows.pathOf(row));
  RowWidget& widget = rowOf(*cell);
  widget.setRow(row);
  widget.fitLabels();
  placeRow(widget);
  widget.setEmphasis(emphasisOf(widget));
  widget.show();
  _visible[row] = std::move(cell);
}

void TableWidget::placeRow(RowWidget& row) const {
  const int top = static_cast<int>(row.row()) * rowHeight - verticalScrollBar()->value();
  row.setGeometry(leftOfRows(), top, rowWidth(), rowHeight);
}

int TableWidget::rowWidth() const { return std::min(viewport()->width(), RowWidget::widest); }

int TableWidget::leftOfRows() const { return (viewport()->width() - rowWidth()) / 2; }

void TableWidget::putAwayRowsOutside(std::size_t begin, std::size_t end) {
  for (auto next = _visible.begin(); next != _visible.end();) {
    const auto current = next++;
    if (current->first >= begin && current->first < end) continue;
    rowOf(*current->second).hide();
    _pool.put(std::move(_visible.extract(current).mapped()));
  }
}

// The widgets stay on the screen, since most rows take them back.
void TableWidget::putAwayAllRows() {
  for (auto& [row, cell] : _visible) _reloaded.put(std::move(cell));
  _visible.clear();
}

std::unique_ptr<TableCell> TableWidget::dequeueReusableCell(std::string_view reuseIdentifier) {
  if (auto cell = _reloaded.take(reuseIdentifier)) return cell;
  return _pool.take(reuseIdentifier);
}

std::unique_ptr<CellView> TableWidget::makeCellView(CellStyle style) {
  return std::make_unique<RowWidget>(style, *viewport());
}

void TableWidget::deselectRow(const IndexPath& path, Animation) {
  if (!_current || _rows.pathOf(*_current) != path) return;
  _currentIsSelected = false;
  showEmphasis();
}

void TableWidget::sizeToFit() {
  _sizesToFit = true;
  if (_isLoaded) measureRows();
}

std::vector<RowWidget*> TableWidget::visibleRows() const {
  std::vector<RowWidget*> rows;
  for (const auto& [row, cell] : _visible) rows.push_back(&rowOf(*cell));
  return rows;
}

RowWidget* TableWidget::visibleRow(std::size_t row) const {
  const auto found = _visible.find(row);
  return found == _visible.end() ? nullptr : &rowOf(*found->second);
}

std::optional<std::size_t> TableWidget::rowAt(const QPoint& position) const {
  const int fromLeft = position.x() - leftOfRows();
  if (position.y() < 0 || fromLeft < 0 || fromLeft >= rowWidth()) return std::nullopt;
  const auto row = static_cast<std::size_t>((position.y() + verticalScrollBar()->value()) / rowHeight);
  return row < _rows.rows() ? std::optional(row) : std::nullopt;
}

QSize TableWidget::sizeHint() const { return {320, 4 * rowHeight}; }

void TableWidget::showEvent(QShowEvent* event) {
  QAbstractScrollArea::showEvent(event);
  if (!_isLoaded) load();
}

void TableWidget::resizeEvent(QResizeEvent* event) {
  QAbstractScrollArea::resizeEvent(event);
  updateScrollRange();
  updateVisibleRows();
  for (const auto& [row, cell] : _visible) {
    placeRow(rowOf(*cell));
    if (event->size().width() == event->oldSize().width()) continue;
    cell->layOutAgain();
    rowOf(*cell).fitLabels();
  }
}

void TableWidget::scrollContentsBy(int, int dy) {
  viewport()->scroll(0, dy);
  updateVisibleRows();
}

bool TableWidget::viewportEvent(QEvent* event) {
  if (event->type() == QEvent::ToolTip) {
    showTooltip(static_cast<const QHelpEvent&>(*event));
    return true;
  }
  return _touch.take(*event) || QAbstractScrollArea::viewportEvent(event);
}

void TableWidget::showTooltip(const QHelpEvent& event) {
  const auto row = rowAt(event.pos());
  if (const RowWidget* widget = row ? visibleRow(*row) : nullptr)
    return widget->showTooltip(event.globalPos(), explanationOf(*widget));
  QToolTip::hideText();
}

void TableWidget::keyPressEvent(QKeyEvent* event) {
  _keysAreUsed = true;
  if (event->modifiers().testFlag(Qt::ShiftModifier) && scrollCurrentRowSideways(event->key())) return;
  // The widget around the table handles keys with other modifiers.
  if ((event->modifiers() & ~Qt::KeypadModifier) != Qt::NoModifier) return event->ignore();
  switch (event->key()) {
    case Qt::Key_Right:
      return rightLeavesTable() ? event->ignore() : chooseCurrentRow();
    case Qt::Key_Return:
    case Qt::Key_Enter:
    case Qt::Key_Space:
      return chooseCurrentRow();
    case Qt::Key_PageUp:
    case Qt::Key_PageDown:
      return turnPage(event->key());
    case Qt::Key_Up:
    case Qt::Key_Down:
    case Qt::Key_Home:
    case Qt::Key_End:
      return moveTo(rowThatKeyLeadsTo(event->key()));
    default:
      event->ignore();
  }
}

std::optional<std::size_t> TableWidget::rowThatKeyLeadsTo(int key) const {
  if (_rows.rows() == 0) return std::nullopt;
  const std::size_t last = _rows.rows() - 1;
  if (key == Qt::Key_Home) return 0;
  if (key == Qt::Key_End) return last;
  if (!_current) return std::min(last, firstWhollyVisibleRow());
  return key == Qt::Key_Up ? *_current - std::min<std::size_t>(*_current, 1) : std::min(last, *_current + 1);
}

// The whole table moves by a page. The current row moves too and keeps its place on the screen, unless the
// table reaches its end.
void TableWidget::turnPage(int key) {
  if (_rows.rows() == 0) return;
  const std::size_t last = _rows.rows() - 1;
  const std::size_t page = rowsOnScreen();
  const bool isOnScreen = _current && _visible.contains(*_current);
  const std::size_t from = isOnScreen ? *_current : std::min(last, firstWhollyVisibleRow());
  QScrollBar& bar = *verticalScrollBar();
  const int distance = static_cast<int>(page) * rowHeight;
  bar.setValue(bar.value() + (key == Qt::Key_PageUp ? -distance : distance));
  moveTo(key == Qt::Key_PageUp ? from - std::min(from, page) : std::min(last, from + page));
}

void TableWidget::moveTo(std::optional<std::size_t> row) {
  if (!row) return;
  makeCurrent(*row);
  scrollToRow(*row);
}

std::size_t TableWidget::firstWhollyVisibleRow() const {
  return static_cast<std::size_t>((verticalScrollBar()->value() + rowHeight - 1) / rowHeight);
}

std::size_t TableWidget::rowsOnScreen() const {
  return static_cast<std::size_t>(std::max(1, viewport()->height() / rowHeight));
}

void TableWidget::scrollToRow(std::size_t row) {
  const int top = static_cast<int>(row) * rowHeight;
  QScrollBar& bar = *verticalScrollBar();
  if (top < bar.value()) bar.setValue(top);
  if (top + rowHeight > bar.value() + viewport()->height())
    bar.setValue(top + rowHeight - viewport()->height());
}

bool TableWidget::scrollCurrentRowSideways(int key) {
  if (key != Qt::Key_Left && key != Qt::Key_Right) return false;
  if (RowWidget* row = _current ? visibleRow(*_current) : nullptr)
    row->scrollSidewaysTo(row->sidewaysPosition() + (key == Qt::Key_Right ? sidewaysStep : -sidewaysStep));
  return true;
}

bool TableWidget::rightLeavesTable() const {
  if (_openRow.isNull()) return false;
  const RowWidget* const row = _current ? visibleRow(*_current) : nullptr;
  return !row || !row->leadsOn() || row->emphasis().isOpen;
}

void TableWidget::chooseCurrentRow() {
  if (_current) chooseRow(*_current);
}

void TableWidget::makeCurrent(std::size_t row) {
  _current = row;
  _currentIsSelected = true;
  showEmphasis();
  tellOfFocusOn(row);
}

// Screen readers then read the row aloud.
void TableWidget::tellOfFocusOn(std::size_t row) const {
  RowWidget* widget = visibleRow(row);
  if (!widget || !hasFocus()) return;
  QAccessibleEvent focus(widget, QAccessible::Focus);
  QAccessible::updateAccessibility(&focus);
}

void TableWidget::chooseRow(std::size_t row) {
  makeCurrent(row);
  const Choice choice = [this, row] {
    if (_delegate && row < _rows.rows())
      _delegate->tableView_didSelectRowAtIndexPath(*this, _rows.pathOf(row));
  };
  // A copy: the choice may make this table fall silent.
  if (const auto maker = _choiceMaker) return maker(choice);
  choice();
}

void TableWidget::takeClick(std::size_t row, const QPoint& position) {
  QAction* const course = courseActionAt(row, position);
  if (!course) return chooseRow(row);
  setFocus(Qt::MouseFocusReason);
  makeCurrent(row);
  course->trigger();
}

// Null when the position is not on the small line of the row.
QAction* TableWidget::courseActionAt(std::size_t row, const QPoint& position) const {
  const RowWidget* const widget = visibleRow(row);
  if (!widget || !widget->sparklineArea().contains(widget->mapFrom(viewport(), position))) return nullptr;
  return window()->findChild<QAction*>(QLatin1String(courseCommand), Qt::FindDirectChildrenOnly);
}

void TableWidget::showEmphasis() {
  for (RowWidget* row : visibleRows()) row->setEmphasis(emphasisOf(*row));
}

RowWidget::Emphasis TableWidget::emphasisOf(const RowWidget& row) const {
  const bool isCurrent = _current == row.row();
  // A row that is not selected has no other mark.
  const bool needsFrame = _keysAreUsed || !_currentIsSelected;
  return {isCurrent && _currentIsSelected, isCurrent && needsFrame && hasFocus(),
          !_openRow.isNull() && row.name() == _openRow, _isPale};
}

void TableWidget::mousePressEvent(QMouseEvent* event) {
  if (event->button() != Qt::LeftButton) return event->ignore();
  _keysAreUsed = false;
  _press.reset();
  const auto row = rowAt(event->position().toPoint());
  if (const RowWidget* widget = row ? visibleRow(*row) : nullptr) _press.emplace(*widget, event->position());
}

void TableWidget::mouseMoveEvent(QMouseEvent* event) {
  if (RowWidget* row = _press ? visibleRow(_press->row()) : nullptr) _press->moveTo(event->position(), *row);
}

void TableWidget::mouseReleaseEvent(QMouseEvent* event) {
  if (event->button() != Qt::LeftButton) return event->ignore();
  const auto press = std::exchange(_press, std::nullopt);
  if (press && !press->isDrag() && press->row() == rowAt(event->position().toPoint()))
    takeClick(press->row(), event->position().toPoint());
}

void TableWidget::wheelEvent(QWheelEvent* event) {
  const double movement = sidewaysMovement(*event);
  if (movement == 0) return QAbstractScrollArea::wheelEvent(event);
  const auto row = rowAt(event->position().toPoint());
  if (RowWidget* widget = row ? visibleRow(*row) : nullptr)
    widget->scrollSidewaysTo(widget->sidewaysPosition() - movement);
  event->accept();
}

// What is around the table opens the menu, for the row with the focus frame.
void TableWidget::contextMenuEvent(QContextMenuEvent* event) {
  _keysAreUsed = true;
  const bool isAtPlace = event->reason() != QContextMenuEvent::Keyboard;
  if (const auto row = isAtPlace ? rowAt(event->pos()) : std::nullopt) {
    setFocus(Qt::OtherFocusReason);
    makeCurrent(*row);
  }
  showEmphasis();
  event->ignore();
}

void TableWidget::focusInEvent(QFocusEvent* event) {
  if (event->reason() == Qt::TabFocusReason || event->reason() == Qt::BacktabFocusReason) _keysAreUsed = true;
  QAbstractScrollArea::focusInEvent(event);
  showEmphasis();
}

void TableWidget::focusOutEvent(QFocusEvent* event) {
  QAbstractScrollArea::focusOutEvent(event);
  showEmphasis();
}

}  // namespace varnel
