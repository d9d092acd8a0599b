#include "platform/ui/RowIndex.h"

#include <numeric>
#include <utility>

namespace varnel {

RowIndex::RowIndex(std::vector<std::size_t> rowsOfSections)
    : _rowsOfSections(std::move(rowsOfSections)),
      _rows(std::accumulate(_rowsOfSections.begin(), _rowsOfSections.end(), std::size_t{0})) {}

IndexPath RowIndex::pathOf(std::size_t row) const {
  std::size_t section = 0;
  while (row >= _rowsOfSections.at(section)) row -= _rowsOfSections[section++];
  return {section, row};
}

std::optional<std::size_t> RowIndex::rowOf(const IndexPath& path) const {
  if (path.section >= _rowsOfSections.size() || path.row >= _rowsOfSections[path.section])
    return std::nullopt;
  const auto before = _rowsOfSections.begin() + static_cast<std::ptrdiff_t>(path.section);
  return std::accumulate(_rowsOfSections.begin(), before, path.row);
}

}  // namespace varnel
