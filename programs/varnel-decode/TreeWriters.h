#pragma once

#include <string>
#include <string_view>

#include "base/Value.h"
#include "programs/shared/TreeJson.h"

namespace varnel {

/// Turns a display, which may be absent, into the program's output.
using DisplayWriter = std::string (*)(const Value& display);

/// The display tree as text for people.
std::string displayAsText(const Value& display);

/// One line per tree node, in pre-order: its path, and for a leaf a tab and its value. Backslash, tab,
/// newline, and carriage return are written as `\\`, `\t`, `\n`, and `\r`, other control characters like
/// `\u001B`.
std::string displayAsPaths(const Value& display);

/// The display tree as one line of JSON, with the names and the order of the tree. A name that occurs twice
/// is written twice. Bytes that are not UTF-8 become U+FFFD.
std::string displayAsJson(const Value& display);

/// The display itself as an XML property list, which keeps every kind of value; empty when there is no
/// display. Throws std::runtime_error when the display holds something that XML cannot.
std::string displayAsPropertyList(const Value& display);

/// Nothing at all, for users who want only other outputs.
std::string displayAsNothing(const Value& display);

/// The display tree as in `displayAsJson`, without the newline.
std::string treeAsJson(const Value& display);

struct DisplayFormat {
  std::string_view name;
  DisplayWriter write;
};

/// Every format with its name on the command line.
inline constexpr DisplayFormat displayFormats[] = {
    {"text", displayAsText},          {"paths", displayAsPaths},  {"json", displayAsJson},
    {"plist", displayAsPropertyList}, {"none", displayAsNothing},
};

}  // namespace varnel
