#include "terminal/Characters.h"

#include <algorithm>
#include <clocale>
#include <cstdint>
#include <cwchar>

namespace varnel {

namespace {

constexpr wchar_t replacement = 0xFFFD;

struct Decoded {
  wchar_t character;
  std::size_t length;  // in bytes
};

Decoded decodedAt(std::string_view text) {
  const auto byte = [&](std::size_t i) { return static_cast<std::uint8_t>(text[i]); };
  const std::uint8_t first = byte(0);
  if (first < 0x80) return {static_cast<wchar_t>(first), 1};
  const std::size_t length = first >= 0xF0 ? 4 : first >= 0xE0 ? 3 : 2;
  if (first < 0xC2 || first > 0xF4 || text.size() < length) return {replacement, 1};
  std::uint32_t code = first & (0xFFU >> (length + 1));
  for (std::size_t i = 1; i < length; ++i) {
    if ((byte(i) & 0xC0) != 0x80) return {replacement, 1};
    code = code << 6 | (byte(i) & 0x3F);
  }
  constexpr std::uint32_t lowest[] = {0, 0, 0x80, 0x800, 0x10000};
  const bool isSurrogate = code >= 0xD800 && code <= 0xDFFF;
  if (code < lowest[length] || code > 0x10FFFF || isSurrogate) return {replacement, 1};
  return {static_cast<wchar_t>(code), length};
}

// Also the characters that turn the direction of writing or end a line: they would change other rows.
bool bendsTheLine(wchar_t character) {
  return character < 0x20 || (character >= 0x7F && character <= 0x9F) ||
         (character >= 0x200B && character <= 0x200F) || (character >= 0x2028 && character <= 0x202E) ||
         (character >= 0x2066 && character <= 0x2069) || character == 0xFEFF;
}

}  // namespace

void useUtf8Characters() { std::setlocale(LC_CTYPE, "C.UTF-8"); }

std::wstring charactersOf(std::string_view text) {
  std::wstring characters;
  characters.reserve(text.size());
  while (!text.empty()) {
    const auto [character, length] = decodedAt(text);
    characters.push_back(bendsTheLine(character) ? L' ' : character);
    text.remove_prefix(length);
  }
  return characters;
}

std::string utf8(std::wstring_view text) {
  std::string bytes;
  for (const wchar_t character : text) {
    const auto code = static_cast<std::uint32_t>(character);
    const auto add = [&bytes](std::uint32_t byte) { bytes.push_back(static_cast<char>(byte)); };
    if (code < 0x80) {
      add(code);
    } else if (code < 0x800) {
      add(0xC0 | code >> 6);
      add(0x80 | (code & 0x3F));
    } else if (code < 0x10000) {
      add(0xE0 | code >> 12);
      add(0x80 | (code >> 6 & 0x3F));
      add(0x80 | (code & 0x3F));
    } else {
      add(0xF0 | code >> 18);
      add(0x80 | (code >> 12 & 0x3F));
      add(0x80 | (code >> 6 & 0x3F));
      add(0x80 | (code & 0x3F));
    }
  }
  return bytes;
}

int columnsOf(wchar_t character) {
  if (character >= 0x20 && character < 0x7F) return 1;
  // A character that the C library does not know is written as a replacement character.
  const int columns = ::wcwidth(character);
  return columns < 0 ? 1 : columns;
}

int columnsOf(std::wstring_view text) {
  int columns = 0;
  for (const wchar_t character : text) columns += columnsOf(character);
  return columns;
}

int columnsOf(std::string_view text) { return columnsOf(charactersOf(text)); }

std::wstring_view fitting(std::wstring_view text, int columns) {
  int taken = 0;
  for (std::size_t i = 0; i < text.size(); ++i) {
    taken += columnsOf(text[i]);
    if (taken > columns) return text.substr(0, i);
  }
  return text;
}

std::wstring cutTo(std::wstring_view text, int columns, std::wstring_view mark) {
  if (columnsOf(text) <= columns) return std::wstring(text);
  const std::wstring_view end = fitting(mark, std::max(0, columns));
  return std::wstring(fitting(text, columns - columnsOf(end))).append(end);
}

namespace {

void wrapLine(std::wstring_view line, int columns, std::vector<std::wstring>& lines) {
  do {
    std::wstring_view part = fitting(line, columns);
    if (part.empty()) part = line.substr(0, std::min<std::size_t>(line.size(), 1));
    const std::size_t blank = part.rfind(L' ');
    if (part.size() < line.size() && line[part.size()] != L' ' && blank != std::wstring_view::npos &&
        blank > 0)
      part = part.substr(0, blank);
    lines.emplace_back(part);
    line.remove_prefix(part.size());
    if (line.starts_with(L' ')) line.remove_prefix(1);
  } while (!line.empty());
}

}  // namespace

std::vector<std::wstring> wrapped(std::string_view text, int columns) {
  std::vector<std::wstring> lines;
  if (columns <= 0) return lines;
  while (!text.empty()) {
    const std::size_t end = std::min(text.find('\n'), text.size());
    wrapLine(charactersOf(text.substr(0, end)), columns, lines);
    text.remove_prefix(std::min(end + 1, text.size()));
  }
  return lines;
}

}  // namespace varnel
