#pragma once

#include <string>
#include <string_view>

namespace varnel {

/// A field of comma-separated values, quoted according to RFC 4180 where it has to be. Control characters
/// other than tab and line end are written like `\u001B`.
std::string csvField(std::string_view value);

}  // namespace varnel
