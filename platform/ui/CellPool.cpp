#include "platform/ui/CellPool.h"

#include <algorithm>

namespace varnel {

std::unique_ptr<TableCell> CellPool::take(std::string_view reuseIdentifier) {
  const auto found = std::ranges::find_if(
      _cells, [&](const auto& cell) { return cell->reuseIdentifier() == reuseIdentifier; });
  if (found == _cells.end()) return nullptr;
  std::unique_ptr<TableCell> cell = std::move(*found);
  _cells.erase(found);
  return cell;
}

}  // namespace varnel
