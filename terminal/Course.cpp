#include "terminal/Course.h"

#include <algorithm>

namespace varnel {

std::wstring courseInBlocks(std::span<const std::optional<double>> values, int columns,
                            const Glyphs& glyphs) {
  const auto shown = std::min(values.size(), static_cast<std::size_t>(std::max(0, columns)));
  values = values.last(shown);
  std::optional<double> lowest, highest;
  for (const auto& value : values) {
    if (!value) continue;
    lowest = std::min(lowest.value_or(*value), *value);
    highest = std::max(highest.value_or(*value), *value);
  }
  if (!lowest) return {};
  std::wstring line;
  const auto top = static_cast<double>(glyphs.blocks.size() - 1);
  for (const auto& value : values) {
    // A value that does not change is a low line.
    const double share = !value || *highest == *lowest ? 0 : (*value - *lowest) / (*highest - *lowest);
    line.push_back(value ? glyphs.blocks[static_cast<std::size_t>(share * top + 0.5)] : L' ');
  }
  return line;
}

}  // namespace varnel
