#pragma once

#include <string>
#include <string_view>

namespace varnel {

/// The text with its control characters (ASCII, and C1: in UTF-8 C2 80 to C2 9F) written as escapes such as
/// `\x1b`, so that it stays on its line and cannot control a terminal.
std::string printableText(std::string_view text);

}  // namespace varnel
