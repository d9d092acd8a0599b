#pragma once

#include <optional>
#include <string>
#include <vector>

#include "base/Value.h"

namespace varnel {

/// One element of a screen.
struct ScreenElement {
  enum class Kind {
    Button,
    TextField,  ///< as wide as the row allows
    Table,      ///< as wide and as high as the screen allows
    Space,      ///< takes the room that the other elements of its row leave
  };

  Kind kind = Kind::Space;
  std::string outlet{};  ///< the name under which the screen's controller finds a text field or a table
  std::string title{};   ///< the text on a button, or the text that an empty text field shows
  std::string action{};  ///< the operation that a button calls

  friend bool operator==(const ScreenElement&, const ScreenElement&) = default;
};

/// The layout of a screen: rows from top to bottom, and the elements of each from left to right.
struct ScreenLayout {
  std::vector<std::vector<ScreenElement>> rows{};
  double margin = 0;               ///< around the rows, logical pixels
  double spacing = 0;              ///< between rows and between elements, logical pixels
  std::string backgroundAction{};  ///< the operation that runs when the user touches no element

  /// The layout in an interface resource (docs/formats.md); nothing when the value is no such resource.
  static std::optional<ScreenLayout> fromResource(const Value& resource);
};

}  // namespace varnel
