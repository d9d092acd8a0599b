#pragma once

#include <functional>

namespace varnel {

inline constexpr const char* programName = "varnel-decode";

/// Does a part of the work. A std::runtime_error is told on standard error, and whatever comes next can still
/// be done; false then. That whoever reads the output has left is not told: `| head` is no mistake.
bool succeeds(const std::function<void()>& part);

}  // namespace varnel
