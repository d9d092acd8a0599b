#pragma once

#include <cstddef>
#include <vector>

#include "platform/ui/TableView.h"

namespace varnel {

/// How many rows the sections of a table have, and where a row stands when all are counted through.
class RowIndex {
 public:
  RowIndex() = default;
  explicit RowIndex(std::vector<std::size_t> rowsOfSections);

  std::size_t rows() const { return _rows; }
  /// The row is less than `rows`.
  IndexPath pathOf(std::size_t row) const;

  friend bool operator==(const RowIndex&, const RowIndex&) = default;

 private:
  std::vector<std::size_t> _rowsOfSections;
  std::size_t _rows = 0;
};

}  // namespace varnel
