#pragma once

#include <functional>
#include <string_view>

namespace varnel {

inline constexpr const char* programName = "varnel-decode";

/// Writes one line to standard error, the program's name before it. Control characters, as names of files may
/// hold them, are shown as escapes.
void tell(std::string_view text);

/// Does a part of the work. A std::runtime_error is told on standard error, and whatever comes next can still
/// be done; false then. That whoever reads the output has left is not told: `| head` is no mistake.
bool succeeds(const std::function<void()>& part);

}  // namespace varnel
