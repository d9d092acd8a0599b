#pragma once

#include <cstdint>
#include <string>
#include <string_view>

namespace varnel {

/// How a property list is written.
enum class Encoding : std::uint8_t { Xml, Binary };

/// Whether a list of that encoding can hold the text: UTF-8 without U+0000 for both, in XML without the other
/// control characters too (but tab, newline and carriage return), U+FFFE and U+FFFF.
bool canHold(Encoding encoding, std::string_view text);

/// The text with U+FFFD in place of each character that such a list cannot hold, and of each byte that is no
/// UTF-8.
std::string replacedWhereUnfit(Encoding encoding, std::string_view text);

}  // namespace varnel
