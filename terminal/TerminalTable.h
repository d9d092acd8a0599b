#pragma once

#include <map>
#include <memory>
#include <optional>
#include <string>

#include "platform/ui/CellPool.h"
#include "platform/ui/RowIndex.h"
#include "platform/ui/TableView.h"
#include "terminal/Key.h"
#include "terminal/TerminalRow.h"

namespace varnel {

/// A table that has cells only for its visible rows.
///
/// A reload gives each row its own cell back, as long as the rows stay the same: the same number, and the
/// same names of the visible ones. Otherwise it makes every cell again.
///
/// One row has the focus, from which the keys go on. At a reload it stays on the row of the same name.
class TerminalTable final : public TableView {
 public:
  TerminalTable();
  TerminalTable(const TerminalTable&) = delete;
  TerminalTable& operator=(const TerminalTable&) = delete;
  ~TerminalTable() override;

  void setDelegate(TableViewDelegate* delegate) override;
  void reloadData() override;
  std::unique_ptr<TableCell> dequeueReusableCell(std::string_view reuseIdentifier) override;
  std::unique_ptr<CellView> makeCellView(CellStyle style) override;
  void selectRow(const IndexPath& path) override;
  void deselectRow(const IndexPath&, Animation) override {}
  void sizeToFit() override { _sizesToFit = true; }

  /// Keeps what it shows, but makes no more calls.
  void fallSilent() { _delegate = nullptr; }
  /// The room on the screen. The table asks for its rows when it first has some.
  void setArea(const Area& area);
  const Area& area() const { return _area; }
  /// The rows that it would take; nothing when it takes all that there are.
  std::optional<int> wantedRows() const;

  std::size_t rows() const { return _rows.rows(); }
  /// The number of the row with the focus; nothing without rows.
  std::optional<std::size_t> focus() const;
  /// The row with the focus; null without rows.
  const TerminalRow* focusedRow() const;
  KeyUse take(const Key& key);
  /// The row where the mouse is; nothing elsewhere.
  std::optional<std::size_t> rowAt(const Key& place) const;
  /// Gives the row the focus and tells the delegate.
  void choose(std::size_t row);
  /// "3/126" while not all rows are visible, and else empty.
  std::wstring position() const;

  /// `focused` is the emphasis of the row with the focus.
  void paint(CellGrid& grid, TerminalRow::Emphasis focused, const Glyphs& glyphs) const;

 private:
  void load();
  bool measureRows();
  void updateVisibleRows();
  void showRow(std::size_t row);
  void putAwayRowsOutside(std::size_t begin, std::size_t end);
  void putAwayAllRows();
  void forgetCells();
  std::map<std::size_t, std::wstring> namesOfVisibleRows() const;
  bool haveOtherNames(const std::map<std::size_t, std::wstring>& former) const;
  std::size_t rowsOnScreen() const;
  std::size_t lastTop() const;
  void moveTo(std::size_t row);
  void scrollTo(std::size_t top);
  void keepFocusVisible();
  void turnPage(Key::Kind direction);
  KeyUse scrollSideways(int columns);
  KeyUse takeMouse(const Key& key);

  TableViewDelegate* _delegate = nullptr;
  bool _isLoaded = false;
  bool _sizesToFit = false;
  Area _area;
  int _columns = 0;
  RowIndex _rows;
  std::size_t _top = 0;
  std::size_t _focus = 0;
  std::map<std::size_t, std::unique_ptr<TableCell>> _visible;  // by row
  CellPool _reloaded;  // during a reload, the cells that were visible before it
  CellPool _pool;
};

}  // namespace varnel
