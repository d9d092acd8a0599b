#pragma once

#include <optional>
#include <span>
#include <string>

#include "terminal/Glyphs.h"

namespace varnel {

/// The newest values as a line of blocks, as many as there are columns. The lowest value of them is the
/// lowest block. A blank stands where there is no value. Empty without any value.
std::wstring courseInBlocks(std::span<const std::optional<double>> values, int columns, const Glyphs& glyphs);

}  // namespace varnel
