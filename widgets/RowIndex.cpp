#include "widgets/RowIndex.h"

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

}  // namespace varnel
