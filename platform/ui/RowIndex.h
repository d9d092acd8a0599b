#pragma once

#include <cstddef>
#include <optional>
#include <vector>

#include "platform/ui/TableView.h"

namespace varnel {

/// The number of rows in each section of a table, and the place of a row when the rows of all sections are
/// counted.
class RowIndex {
 public:
  RowIndex() = default;
  explicit RowIndex(std::vector<std::size_t> rowsOfSections);

  std::size_t rows() const { return _rows; }
  /// `row` must be less than `rows`.
  IndexPath pathOf(std::size_t row) const;
  /// Nothing when there is no such row.
  std::optional<std::size_t> rowOf(const IndexPath& path) const;

  friend bool operator==(const RowIndex&, const RowIndex&) = default;

 private:
  std::vector<std::size_t> _rowsOfSections;
  std::size_t _rows = 0;
};

}  // namespace varnel
