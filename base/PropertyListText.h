#pragma once

#include <cstdint>
#include <string>
#include <string_view>

namespace varnel {

/// How a property list is written.
enum class Encoding : std::uint8_t { Xml, Binary };

/// Whether a list of this encoding can hold the text. Both encodings hold UTF-8 without U+0000. XML also
/// excludes U+FFFE, U+FFFF, and control characters other than tab, newline, and carriage return.
bool canHold(Encoding encoding, std::string_view text);

/// The text with U+FFFD in place of each character that the list cannot hold, and of each byte that is not
/// UTF-8.
std::string replacedWhereUnfit(Encoding encoding, std::string_view text);

}  // namespace varnel
