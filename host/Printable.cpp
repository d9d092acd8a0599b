#include "host/Printable.h"

#include <cstdio>

namespace varnel {

namespace {

constexpr unsigned char firstOfC1 = 0xC2;  // in UTF-8, before 80 to 9F

bool isC1(std::string_view text) {
  if (text.size() < 2 || static_cast<unsigned char>(text[0]) != firstOfC1) return false;
  const auto second = static_cast<unsigned char>(text[1]);
  return second >= 0x80 && second <= 0x9F;
}

bool isAsciiControl(char character) {
  const auto byte = static_cast<unsigned char>(character);
  return byte < 0x20 || byte == 0x7F;
}

std::string escape(char character) {
  char text[8];
  std::snprintf(text, sizeof text, "\\u%04X", static_cast<unsigned>(static_cast<unsigned char>(character)));
  return text;
}

}  // namespace

std::string printable(std::string_view text, std::string_view kept) {
  std::string shown;
  shown.reserve(text.size());
  for (; !text.empty(); text.remove_prefix(1)) {
    if (isC1(text)) {
      shown += escape(text[1]);
      text.remove_prefix(1);
    } else if (isAsciiControl(text.front()) && kept.find(text.front()) == std::string_view::npos) {
      shown += escape(text.front());
    } else {
      shown += text.front();
    }
  }
  return shown;
}

}  // namespace varnel
