#pragma once

#include <list>
#include <memory>
#include <string_view>

#include "platform/ui/TableCell.h"

namespace varnel {

/// The cells of a table that are not in use, first in, first out.
///
/// A table puts its visible cells here in row order before it asks for them anew, so that a row gets its own
/// cell back as long as the rows stay what they are.
class CellPool {
 public:
  void put(std::unique_ptr<TableCell> cell) { _cells.push_back(std::move(cell)); }
  /// The cell of that identifier that has been here longest; null when there is none.
  std::unique_ptr<TableCell> take(std::string_view reuseIdentifier);

 private:
  std::list<std::unique_ptr<TableCell>> _cells;
};

}  // namespace varnel
