#pragma once

#include <functional>
#include <string_view>

namespace varnel {

inline constexpr const char* programName = "varnel-decode";

/// The exit status of a run over several captures when an output, the report, or the database could not be
/// written. It is larger than that of captures that cannot be decoded.
inline constexpr int notWrittenStatus = 3;

/// Writes one line to standard error, after the program's name. Control characters, which names of files can
/// hold, are written as escapes.
void tell(std::string_view text);

/// Does a part of the work. If it throws std::runtime_error, writes the error to standard error and returns
/// false; the rest of the work can still be done. If only the reader of the output has left, as with `|
/// head`, nothing is written.
bool succeeds(const std::function<void()>& part);

}  // namespace varnel
