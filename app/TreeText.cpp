#include "app/TreeText.h"

#include <algorithm>

#include "app/PrintableText.h"

namespace varnel {

namespace {

constexpr std::size_t indentWidth = 2;
constexpr std::size_t columnGap = 2;
// A longer name does not move the values of its siblings to the right.
constexpr std::size_t widestColumn = 80;

// The number of characters in UTF-8: all bytes except continuation bytes.
std::size_t lengthOf(std::string_view text) {
  return static_cast<std::size_t>(std::ranges::count_if(text, [](char c) { return (c & 0xC0) != 0x80; }));
}

void appendChildren(std::string& text, const VarnelModelNode::Children& children, std::size_t indent) {
  std::size_t column = 0;
  for (const auto& child : children) {
    const std::size_t length = child->value() ? lengthOf(printableText(child->displayName())) : 0;
    if (length <= widestColumn) column = std::max(column, length);
  }
  for (const auto& child : children) {
    const std::string name = printableText(child->displayName());
    text.append(indent, ' ').append(name);
    if (const std::string* value = child->value(); value && !value->empty()) {
      const std::size_t length = lengthOf(name);
      text.append(std::max(column, length) - length + columnGap, ' ').append(printableText(*value));
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
    text.append(printableText(*root.value())).push_back('\n');
  }
  return text;
}

}  // namespace varnel
