#pragma once

#include <cstddef>
#include <string_view>

namespace varnel {

/// The key that marks a dictionary whose rows are shown in the order of their keys; it is no row itself.
inline constexpr std::string_view sortMark = "_sorted";

/// What is shown of a key of a sorted dictionary: of "order;name" the name. A key with no ";" or with several
/// is shown whole.
constexpr std::string_view displayNameOfSortedKey(std::string_view key) {
  const std::size_t semicolon = key.find(';');
  const bool hasTwoParts = semicolon != std::string_view::npos && semicolon == key.rfind(';');
  return hasTwoParts ? key.substr(semicolon + 1) : key;
}

}  // namespace varnel
