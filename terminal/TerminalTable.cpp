#include "terminal/TerminalTable.h"

#include <algorithm>
#include <utility>

namespace varnel {

namespace {

constexpr int sidewaysStep = 8;
constexpr std::size_t wheelStep = 3;

// `makeCellView` made the view of every cell.
TerminalRow& rowOf(const TableCell& cell) { return static_cast<TerminalRow&>(cell.cellView()); }

}  // namespace

TerminalTable::TerminalTable() = default;
TerminalTable::~TerminalTable() = default;

void TerminalTable::setDelegate(TableViewDelegate* delegate) {
  _delegate = delegate;
  if (!_delegate && _isLoaded) load();
}

void TerminalTable::reloadData() { load(); }

void TerminalTable::load() {
  _isLoaded = true;
  const auto formerNames = namesOfVisibleRows();
  std::map<std::wstring, int> sideways;
  for (const auto& [row, cell] : _visible) {
    if (rowOf(*cell).sidewaysPosition() > 0)
      sideways.emplace(rowOf(*cell).name(), rowOf(*cell).sidewaysPosition());
  }
  const TerminalRow* const focused = focusedRow();
  const std::wstring formerFocus = focused ? focused->name() : std::wstring();
  const bool hadFocus = focused != nullptr;
  bool isChanged = measureRows();
  putAwayAllRows();
  if (isChanged) forgetCells();
  updateVisibleRows();
  // Drops the cells that no row has taken back. If they were kept, they would come before the rows' own cells
  // at the next reload.
  _reloaded = CellPool();
  if (!isChanged && haveOtherNames(formerNames)) {
    isChanged = true;
    putAwayAllRows();
    forgetCells();
    updateVisibleRows();
  }
  if (!isChanged) return;
  if (hadFocus) {
    // The row may have moved: rows came or went above it.
    for (const auto& [row, cell] : _visible) {
      if (rowOf(*cell).name() != formerFocus) continue;
      const std::size_t top = _top + row > _focus ? _top + row - _focus : 0;
      _focus = row;
      scrollTo(top);
      break;
    }
    keepFocusVisible();
  }
  for (const auto& [row, cell] : _visible) {
    const auto found = sideways.find(rowOf(*cell).name());
    if (found != sideways.end()) rowOf(*cell).scrollSidewaysTo(found->second);
  }
}

void TerminalTable::forgetCells() {
  _reloaded = CellPool();
  _pool = CellPool();
}

std::map<std::size_t, std::wstring> TerminalTable::namesOfVisibleRows() const {
  std::map<std::size_t, std::wstring> names;
  for (const auto& [row, cell] : _visible) names.emplace(row, rowOf(*cell).name());
  return names;
}

bool TerminalTable::haveOtherNames(const std::map<std::size_t, std::wstring>& former) const {
  return std::ranges::any_of(former, [this](const auto& row) {
    const auto found = _visible.find(row.first);
    return found != _visible.end() && rowOf(*found->second).name() != row.second;
  });
}

// Whether there are other rows than before.
bool TerminalTable::measureRows() {
  std::vector<std::size_t> rows;
  if (_delegate) {
    rows.resize(_delegate->numberOfSectionsInTableView(*this));
    for (std::size_t section = 0; section < rows.size(); ++section)
      rows[section] = _delegate->tableView_numberOfRowsInSection(*this, section);
  }
  const RowIndex former = std::exchange(_rows, RowIndex(std::move(rows)));
  if (_focus >= _rows.rows()) _focus = _rows.rows() == 0 ? 0 : _rows.rows() - 1;
  _top = std::min(_top, lastTop());
  return _rows != former;
}

std::size_t TerminalTable::rowsOnScreen() const { return static_cast<std::size_t>(std::max(0, _area.rows)); }

std::size_t TerminalTable::lastTop() const {
  return _rows.rows() > rowsOnScreen() ? _rows.rows() - rowsOnScreen() : 0;
}

void TerminalTable::updateVisibleRows() {
  if (!_isLoaded) return;
  const std::size_t end = std::min(_rows.rows(), _top + rowsOnScreen());
  putAwayRowsOutside(_top, end);
  if (!_delegate) return;
  for (std::size_t row = _top; row < end; ++row) {
    if (!_visible.contains(row)) showRow(row);
  }
}

void TerminalTable::showRow(std::size_t row) {
  std::unique_ptr<TableCell> cell = _delegate->tableView_cellForRowAtIndexPath(*this, _rows.pathOf(row));
  rowOf(*cell).fitLabels();
  _visible[row] = std::move(cell);
}

void TerminalTable::putAwayRowsOutside(std::size_t begin, std::size_t end) {
  for (auto next = _visible.begin(); next != _visible.end();) {
    const auto current = next++;
    if (current->first >= begin && current->first < end) continue;
    rowOf(*current->second).scrollSidewaysTo(0);  // another row is going to have this cell
    _pool.put(std::move(_visible.extract(current).mapped()));
  }
}

void TerminalTable::putAwayAllRows() {
  for (auto& [row, cell] : _visible) _reloaded.put(std::move(cell));
  _visible.clear();
}

std::unique_ptr<TableCell> TerminalTable::dequeueReusableCell(std::string_view reuseIdentifier) {
  if (auto cell = _reloaded.take(reuseIdentifier)) return cell;
  return _pool.take(reuseIdentifier);
}

std::unique_ptr<CellView> TerminalTable::makeCellView(CellStyle style) {
  return std::make_unique<TerminalRow>(style, _columns);
}

void TerminalTable::selectRow(const IndexPath& path) {
  if (!_isLoaded) load();
  if (const auto row = _rows.rowOf(path)) moveTo(*row);
}

void TerminalTable::setArea(const Area& area) {
  if (area == _area && _isLoaded) return;
  const bool isOtherWidth = area.columns != _columns;
  _area = area;
  _columns = area.columns;
  if (!_isLoaded) return load();
  if (isOtherWidth) {
    for (const auto& [row, cell] : _visible) {
      cell->layOutAgain();
      rowOf(*cell).fitLabels();
    }
    // Unused cells have the former width.
    _pool = CellPool();
  }
  _top = std::min(_top, lastTop());
  updateVisibleRows();
  keepFocusVisible();
}

std::optional<int> TerminalTable::wantedRows() const {
  if (!_sizesToFit) return std::nullopt;
  return static_cast<int>(_rows.rows());
}

std::optional<std::size_t> TerminalTable::focus() const {
  return _rows.rows() == 0 ? std::nullopt : std::optional(_focus);
}

const TerminalRow* TerminalTable::focusedRow() const {
  const auto found = _visible.find(_focus);
  return found == _visible.end() ? nullptr : &rowOf(*found->second);
}

void TerminalTable::scrollTo(std::size_t top) {
  const std::size_t reached = std::min(top, lastTop());
  if (reached == _top) return;
  _top = reached;
  updateVisibleRows();
}

void TerminalTable::keepFocusVisible() {
  if (rowsOnScreen() == 0) return;
  if (_focus < _top) scrollTo(_focus);
  if (_focus >= _top + rowsOnScreen()) scrollTo(_focus + 1 - rowsOnScreen());
}

void TerminalTable::moveTo(std::size_t row) {
  if (row >= _rows.rows()) return;
  _focus = row;
  keepFocusVisible();
}

// The whole table moves by a page. The focus moves too and keeps its place on the screen, unless the table
// reaches its end.
void TerminalTable::turnPage(Key::Kind direction) {
  if (_rows.rows() == 0) return;
  const std::size_t page = std::max<std::size_t>(1, rowsOnScreen());
  const std::size_t last = _rows.rows() - 1;
  if (direction == Key::Kind::PageUp) {
    scrollTo(_top - std::min(_top, page));
    moveTo(_focus - std::min(_focus, page));
  } else {
    scrollTo(_top + page);
    moveTo(std::min(last, _focus + page));
  }
}

KeyUse TerminalTable::scrollSideways(int columns) {
  const auto found = _visible.find(_focus);
  if (found != _visible.end())
    rowOf(*found->second).scrollSidewaysTo(rowOf(*found->second).sidewaysPosition() + columns);
  return KeyUse::Used;
}

void TerminalTable::choose(std::size_t row) {
  moveTo(row);
  if (_delegate && row < _rows.rows()) _delegate->tableView_didSelectRowAtIndexPath(*this, _rows.pathOf(row));
}

KeyUse TerminalTable::take(const Key& key) {
  switch (key.kind) {
    case Key::Kind::Up:
      moveTo(_focus - std::min<std::size_t>(_focus, 1));
      return KeyUse::Used;
    case Key::Kind::Down:
      moveTo(_focus + 1);
      return KeyUse::Used;
    case Key::Kind::Home:
      moveTo(0);
      return KeyUse::Used;
    case Key::Kind::End:
      if (_rows.rows() > 0) moveTo(_rows.rows() - 1);
      return KeyUse::Used;
    case Key::Kind::PageUp:
    case Key::Kind::PageDown:
      turnPage(key.kind);
      return KeyUse::Used;
    case Key::Kind::Enter:
    case Key::Kind::Right:
      choose(_focus);
      return KeyUse::Used;
    case Key::Kind::ShiftLeft:
      return scrollSideways(-sidewaysStep);
    case Key::Kind::ShiftRight:
      return scrollSideways(sidewaysStep);
    case Key::Kind::Click:
    case Key::Kind::WheelUp:
    case Key::Kind::WheelDown:
      return takeMouse(key);
    case Key::Kind::Character:
      break;
    default:
      return KeyUse::Unused;
  }
  struct Letter {
    wchar_t letter;
    Key::Kind sameAs;
  };
  static constexpr Letter letters[] = {{L'j', Key::Kind::Down},      {L'k', Key::Kind::Up},
                                       {L'l', Key::Kind::Right},     {L' ', Key::Kind::Right},
                                       {L'g', Key::Kind::Home},      {L'G', Key::Kind::End},
                                       {L'<', Key::Kind::ShiftLeft}, {L'>', Key::Kind::ShiftRight}};
  const auto* const found = std::ranges::find(letters, key.character, &Letter::letter);
  return found == std::end(letters) ? KeyUse::Unused : take(Key{found->sameAs});
}

std::optional<std::size_t> TerminalTable::rowAt(const Key& place) const {
  if (!_area.contains(place.column, place.row)) return std::nullopt;
  const std::size_t row = _top + static_cast<std::size_t>(place.row - _area.row);
  return row < _rows.rows() ? std::optional(row) : std::nullopt;
}

KeyUse TerminalTable::takeMouse(const Key& key) {
  if (!_area.contains(key.column, key.row)) return KeyUse::Unused;
  if (key.kind == Key::Kind::Click) {
    if (const auto row = rowAt(key)) choose(*row);
    return KeyUse::Used;
  }
  // The focus stays within the visible rows, so that the keys go on from what the user sees.
  scrollTo(key.kind == Key::Kind::WheelUp ? _top - std::min(_top, wheelStep) : _top + wheelStep);
  if (_rows.rows() > 0 && rowsOnScreen() > 0)
    _focus = std::clamp(_focus, _top, std::min(_rows.rows(), _top + rowsOnScreen()) - 1);
  return KeyUse::Used;
}

std::wstring TerminalTable::position() const {
  if (_rows.rows() <= rowsOnScreen()) return {};
  return std::to_wstring(_focus + 1) + L"/" + std::to_wstring(_rows.rows());
}

void TerminalTable::paint(CellGrid& grid, TerminalRow::Emphasis focused, const Glyphs& glyphs) const {
  for (const auto& [row, cell] : _visible) {
    const int line = _area.row + static_cast<int>(row - _top);
    rowOf(*cell).paint(grid, {_area.column, line, _area.columns, 1},
                       row == _focus ? focused : TerminalRow::Emphasis::None, glyphs);
  }
}

}  // namespace varnel
