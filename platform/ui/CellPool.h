#pragma once

#include <list>
#include <memory>
#include <string_view>

#include "platform/ui/TableCell.h"

namespace varnel {

/// The unused cells of a table, first in, first out.
///
/// A table puts its visible cells here in row order before it asks for them again. So each row gets its own
/// cell back as long as the rows stay the same.
class CellPool {
 public:
  void put(std::unique_ptr<TableCell> cell) { _cells.push_back(std::move(cell)); }
  /// Takes the cell with this identifier that has been here longest; null when there is none.
  std::unique_ptr<TableCell> take(std::string_view reuseIdentifier);

 private:
  std::list<std::unique_ptr<TableCell>> _cells;
};

}  // namespace varnel
