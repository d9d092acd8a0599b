#pragma once

#include <cstddef>
#include <memory>
#include <optional>
#include <string_view>

#include "platform/ui/Animation.h"
#include "platform/ui/TableCell.h"

namespace varnel {

class TableView;

/// The height of every row.
inline constexpr double tableRowHeight = 50;

struct IndexPath {
  std::size_t section = 0;
  std::size_t row = 0;

  friend bool operator==(const IndexPath&, const IndexPath&) = default;
};

/// Who knows what a table shows. Paths that the table passes are those of rows that it was told of since it
/// was last reloaded.
class TableViewDelegate {
 public:
  virtual ~TableViewDelegate() = default;
  virtual std::size_t numberOfSectionsInTableView(TableView&) { return 1; }
  virtual std::size_t tableView_numberOfRowsInSection(TableView& table, std::size_t section) = 0;
  /// A cell for the row: one of `dequeueReusableCell` or a new one. The table keeps it while the row is
  /// visible.
  virtual std::unique_ptr<TableCell> tableView_cellForRowAtIndexPath(TableView& table,
                                                                     const IndexPath& path) = 0;
  /// The user has chosen a row (a click, or the return key on it).
  virtual void tableView_didSelectRowAtIndexPath(TableView& table, const std::optional<IndexPath>& path) = 0;
};

/// A plain table of rows of one height, which scrolls up and down. It has cells for its visible rows only.
class TableView {
 public:
  virtual ~TableView() = default;
  /// Null takes the delegate off; a table without one is empty. The delegate is not called before the table
  /// is on the screen or reloaded.
  virtual void setDelegate(TableViewDelegate* delegate) = 0;
  /// Asks for everything again. The position and the selection stay as far as the rows do. The visible cells
  /// go through a `CellPool`, in row order, as long as there are as many rows as before. When a reload
  /// changes which rows there are, no cell that was there before it is handed out again.
  virtual void reloadData() = 0;
  /// A cell of that identifier that is not in use; null when there is none.
  virtual std::unique_ptr<TableCell> dequeueReusableCell(std::string_view reuseIdentifier) = 0;
  /// The view for a new cell of this table.
  virtual std::unique_ptr<CellView> makeCellView(CellStyle style) = 0;
  virtual void deselectRow(const IndexPath& path, Animation animation) = 0;
  /// Takes the height of all its rows, as far as there is room.
  virtual void sizeToFit() = 0;
};

}  // namespace varnel
