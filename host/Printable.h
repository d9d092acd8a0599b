#pragma once

#include <string>
#include <string_view>

namespace varnel {

/// The text with its control characters (C0, DEL and C1) written as `\u001B`, so that it cannot steer a
/// terminal. Those of ASCII that are to be kept stay as they are.
std::string printable(std::string_view text, std::string_view kept = {});

}  // namespace varnel
