#pragma once

#include <string>
#include <string_view>

namespace varnel {

/// The text with its control characters (C0, DEL, and C1) written like `\u001B`, so that it cannot control a
/// terminal. ASCII control characters in `kept` stay as they are.
std::string printable(std::string_view text, std::string_view kept = {});

}  // namespace varnel
