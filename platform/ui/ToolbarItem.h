#pragma once

#include <functional>
#include <string>
#include <variant>

#include "platform/ui/Font.h"

namespace varnel {

/// A small grey wheel that turns while something goes on. It is hidden, and takes no room, while it stands
/// still.
struct ActivityIndicator {
  bool isAnimating = false;
};

/// Dark text without a background, as large as the text. Plain text, as with `Label`.
struct ToolbarLabel {
  std::string text{};
  Font font{};
};

/// Takes the room that the other items leave.
struct FlexibleSpace {};

/// A button of a kind that the host knows how to name or draw.
struct BarButton {
  enum class SystemItem { Save };

  SystemItem item = SystemItem::Save;
  /// Called when it is pressed. It may set other items.
  std::function<void()> action{};
};

using ToolbarItem = std::variant<ActivityIndicator, ToolbarLabel, FlexibleSpace, BarButton>;

}  // namespace varnel
