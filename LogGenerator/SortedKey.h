#pragma once

#include <cstddef>
#include <string_view>

namespace varnel {

/// The key that marks a dictionary whose entries are shown in the order of their keys. It is not shown
/// itself.
inline constexpr std::string_view sortMark = "_sorted";

/// The displayed part of a key in a sorted dictionary: of "order;name" the name. A key without ";" or with
/// several is shown whole.
constexpr std::string_view displayNameOfSortedKey(std::string_view key) {
  const std::size_t semicolon = key.find(';');
  const bool hasTwoParts = semicolon != std::string_view::npos && semicolon == key.rfind(';');
  return hasTwoParts ? key.substr(semicolon + 1) : key;
}

}  // namespace varnel
