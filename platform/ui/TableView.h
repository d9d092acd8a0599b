#pragma once

#include <cstddef>
#include <memory>
#include <optional>
#include <string>

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

/// Knows what a table shows. The table passes only paths of rows that it learned of at its last reload.
class TableViewDelegate {
 public:
  virtual ~TableViewDelegate() = default;
  virtual std::size_t numberOfSectionsInTableView(TableView&) { return 1; }
  virtual std::size_t tableView_numberOfRowsInSection(TableView& table, std::size_t section) = 0;
  /// A cell for the row: one from `dequeueReusableCell`, or a new one. The table keeps it while the row is
  /// visible.
  virtual std::unique_ptr<TableCell> tableView_cellForRowAtIndexPath(TableView& table,
                                                                     const IndexPath& path) = 0;
  /// Gives this cell, which shows the row, the row's facts of this moment (`CellView::setFacts`). Called by
  /// `showFactsAgain`.
  virtual void tableView_showFactsInCell(TableView&, TableCell&, const IndexPath&) {}
  /// What there is to say about a row beside its texts: whole sentences, in lines. Empty for nothing.
  virtual std::string tableView_explanationOfRow(TableView&, const IndexPath&) { return {}; }
  /// The user has chosen a row, by a click or by the return key on it.
  virtual void tableView_didSelectRowAtIndexPath(TableView& table, const std::optional<IndexPath>& path) = 0;
};

/// A plain table of rows of equal height, which scrolls up and down. It has cells only for its visible rows.
class TableView {
 public:
  virtual ~TableView() = default;
  /// Null removes the delegate. A table without a delegate is empty. The table does not call the delegate
  /// before it is on the screen or reloaded.
  virtual void setDelegate(TableViewDelegate* delegate) = 0;
  /// Asks the delegate for everything again. Position and selection stay, as far as their rows still exist.
  /// While the number of rows stays the same, the visible cells go through a `CellPool`, in row order. When a
  /// reload changes which rows there are, the table hands out no cell from before.
  virtual void reloadData() = 0;
  /// Asks the delegate for the facts of the visible rows again. Does nothing in a host that shows no facts
  /// that can change between two reloads.
  virtual void showFactsAgain() {}
  /// An unused cell with this identifier; null when there is none.
  virtual std::unique_ptr<TableCell> dequeueReusableCell(std::string_view reuseIdentifier) = 0;
  /// The view for a new cell of this table.
  virtual std::unique_ptr<CellView> makeCellView(CellStyle style) = 0;
  /// Makes the row the one from which the user's keys go on, and scrolls to it. A row that does not exist
  /// changes nothing.
  virtual void selectRow(const IndexPath& path) = 0;
  virtual void deselectRow(const IndexPath& path, Animation animation) = 0;
  /// Takes the height of all its rows, as far as there is room.
  virtual void sizeToFit() = 0;
};

}  // namespace varnel
