#pragma once

#include <string>
#include <string_view>

namespace varnel {

/// The text with its control characters, those of ASCII and of the C1 block (in UTF-8 C2 80 to C2 9F), as
/// escapes such as `\x1b`, so that it stays on its line and cannot steer a terminal.
std::string printableText(std::string_view text);

}  // namespace varnel
