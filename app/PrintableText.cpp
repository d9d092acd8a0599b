#include "app/PrintableText.h"

#include <cstddef>

namespace varnel {

std::string printableText(std::string_view text) {
  static constexpr char digits[] = "0123456789abcdef";
  std::string shown;
  shown.reserve(text.size());
  for (std::size_t i = 0; i < text.size(); ++i) {
    const auto byte = static_cast<unsigned char>(text[i]);
    const auto next = static_cast<unsigned char>(i + 1 < text.size() ? text[i + 1] : '\0');
    const bool isC1 = byte == 0xC2 && next >= 0x80 && next <= 0x9F;
    if (byte >= 0x20 && byte != 0x7F && !isC1) {
      shown.push_back(text[i]);
      continue;
    }
    const unsigned code = isC1 ? next : byte;
    shown += {'\\', 'x', digits[code >> 4], digits[code & 15]};
    if (isC1) ++i;
  }
  return shown;
}

}  // namespace varnel
