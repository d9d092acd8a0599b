#pragma once

#include <string>
#include <string_view>

#include "base/Value.h"

namespace varnel {

/// Writes a display, which may be absent, as the program puts it out.
using DisplayWriter = std::string (*)(const Value& display);

/// The display tree for reading.
std::string displayAsText(const Value& display);

/// One line a tree node, in pre-order: its path, and for a leaf a tab and its value. Backslash, tab, newline
/// and carriage return are written as `\\`, `\t`, `\n` and `\r`, other control characters as `\u001B`.
std::string displayAsPaths(const Value& display);

/// The display tree as one line of JSON, names as shown and in the tree's order. A name that occurs twice is
/// written twice. Bytes that are not UTF-8 become U+FFFD.
std::string displayAsJson(const Value& display);

/// The display itself as an XML property list, every kind of value kept; empty when there is no display.
/// Throws std::runtime_error when it holds what XML cannot.
std::string displayAsPropertyList(const Value& display);

/// Nothing at all, for those who only want what else is written.
std::string displayAsNothing(const Value& display);

/// The display tree as in `displayAsJson`, without the newline.
std::string treeAsJson(const Value& display);
/// A text as a string of JSON.
std::string jsonString(const std::string& text);

struct DisplayFormat {
  std::string_view name;
  DisplayWriter write;
};

/// Every format by the name that the command line gives it.
inline constexpr DisplayFormat displayFormats[] = {
    {"text", displayAsText},          {"paths", displayAsPaths},  {"json", displayAsJson},
    {"plist", displayAsPropertyList}, {"none", displayAsNothing},
};

}  // namespace varnel
