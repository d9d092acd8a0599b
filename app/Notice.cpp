#include "app/Notice.h"

#include "app/PrintableText.h"

namespace varnel {

namespace {

// Paths of runtime folders and files fit. A text from a strange server may not.
constexpr std::size_t longestLine = 500;

// Does not leave half a character of UTF-8 at the end.
std::string_view cut(std::string_view text) {
  if (text.size() <= longestLine) return text;
  std::size_t length = longestLine;
  while (length > 0 && (text[length] & 0xC0) == 0x80) --length;
  return text.substr(0, length);
}

}  // namespace

bool Notice::set(Matter matter, std::string_view line) {
  if (line.empty()) return _lines.erase(matter) > 0;
  const std::string_view shown = cut(line);
  std::string text = printableText(shown);
  if (shown.size() < line.size()) text += "…";
  std::string& former = _lines[matter];
  if (former == text) return false;
  former = std::move(text);
  return true;
}

std::string Notice::text() const {
  std::string text;
  for (const auto& [matter, line] : _lines) {
    if (!text.empty()) text += '\n';
    text += line;
  }
  return text;
}

}  // namespace varnel
