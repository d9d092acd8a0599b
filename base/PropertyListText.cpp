#include "base/PropertyListText.h"

#include <cstdint>
#include <cstring>

namespace varnel {

namespace {

// Takes the first character of the text; 0 when the text does not begin with valid UTF-8.
char32_t takeCharacter(std::string_view& text) {
  const auto first = static_cast<unsigned char>(text[0]);
  const std::size_t length = first < 0x80 ? 1 : first < 0xE0 ? 2 : first < 0xF0 ? 3 : 4;
  if ((first >= 0x80 && first < 0xC2) || first > 0xF4 || text.size() < length) return 0;
  char32_t character = length == 1 ? first : first & (0x7FU >> length);
  for (std::size_t i = 1; i < length; ++i) {
    const auto next = static_cast<unsigned char>(text[i]);
    if ((next & 0xC0U) != 0x80) return 0;
    character = character << 6U | (next & 0x3FU);
  }
  constexpr char32_t leastOfLength[] = {0, 0, 0x80, 0x800, 0x10000};
  const bool isSurrogate = character >= 0xD800 && character <= 0xDFFF;
  if (character < leastOfLength[length] || character > 0x10FFFF || isSurrogate) return 0;
  text.remove_prefix(length);
  return character;
}

bool isPlain(char character) {
  const auto code = static_cast<unsigned char>(character);
  return code >= 0x20 && code < 0x80;
}

// Whether the text begins with eight plain ASCII characters.
bool beginsPlain(std::string_view text) {
  constexpr std::uint64_t highBits = 0x8080808080808080;
  constexpr std::uint64_t blanks = 0x2020202020202020;
  std::uint64_t word = 0;
  if (text.size() < sizeof word) return false;
  std::memcpy(&word, text.data(), sizeof word);
  return ((word | (word - blanks)) & highBits) == 0;
}

bool isFit(Encoding encoding, char32_t character) {
  if (character == 0 || encoding == Encoding::Binary) return character != 0;
  const bool isControl = character < 0x20 && character != '\t' && character != '\n' && character != '\r';
  return !isControl && character != 0xFFFE && character != 0xFFFF;
}

}  // namespace

bool canHold(Encoding encoding, std::string_view text) {
  while (!text.empty()) {
    // Nearly every character is plain ASCII.
    if (beginsPlain(text)) {
      text.remove_prefix(sizeof(std::uint64_t));
      continue;
    }
    if (isPlain(text[0])) {
      text.remove_prefix(1);
      continue;
    }
    if (!isFit(encoding, takeCharacter(text))) return false;
  }
  return true;
}

std::string replacedWhereUnfit(Encoding encoding, std::string_view text) {
  std::string replaced;
  while (!text.empty()) {
    const std::string_view before = text;
    const char32_t character = takeCharacter(text);
    if (text.size() == before.size()) text.remove_prefix(1);  // not UTF-8
    if (isFit(encoding, character))
      replaced += before.substr(0, before.size() - text.size());
    else
      replaced += "\uFFFD";
  }
  return replaced;
}

}  // namespace varnel
