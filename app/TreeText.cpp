#include "app/TreeText.h"

#include <algorithm>

namespace varnel {

namespace {

constexpr std::size_t indentWidth = 2;
constexpr std::size_t columnGap = 2;
// A longer name does not push the values of its siblings aside.
constexpr std::size_t widestColumn = 80;

// Control characters of ASCII and of the C1 block, which UTF-8 writes as C2 80 to C2 9F.
std::string printable(std::string_view text) {
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

// In characters of UTF-8: every byte but the continuations.
std::size_t lengthOf(std::string_view text) {
  return static_cast<std::size_t>(std::ranges::count_if(text, [](char c) { return (c & 0xC0) != 0x80; }));
}

void appendChildren(std::string& text, const VarnelModelNode::Children& children, std::size_t indent) {
  std::size_t column = 0;
  for (const auto& child : children) {
    const std::size_t length = child->value() ? lengthOf(printable(child->displayName())) : 0;
    if (length <= widestColumn) column = std::max(column, length);
  }
  for (const auto& child : children) {
    const std::string name = printable(child->displayName());
    text.append(indent, ' ').append(name);
    if (const std::string* value = child->value(); value && !value->empty()) {
      const std::size_t length = lengthOf(name);
      text.append(std::max(column, length) - length + columnGap, ' ').append(printable(*value));
    }
    text.push_back('\n');
    if (child->childNodes()) appendChildren(text, *child->childNodes(), indent + indentWidth);
  }
}

}  // namespace

std::string treeAsText(const VarnelModelNode& root) {
  std::string text;
  if (root.childNodes()) {
    appendChildren(text, *root.childNodes(), 0);
  } else {
    text.append(printable(*root.value())).push_back('\n');
  }
  return text;
}

}  // namespace varnel
