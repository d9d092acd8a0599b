#pragma once

#include <cstdio>
#include <string_view>

namespace varnel {

/// Writes to an output and flushes it, so that a reader sees the text at once and nothing is lost when the
/// program ends. Throws std::system_error.
void writeOutput(std::FILE* output, std::string_view text);

}  // namespace varnel
