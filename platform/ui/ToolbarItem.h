#pragma once

#include <functional>
#include <string>
#include <variant>

#include "platform/ui/Font.h"

namespace varnel {

/// A small gray wheel that turns while something is going on. When it stands still, it is hidden and takes no
/// room.
struct ActivityIndicator {
  bool isAnimating = false;
};

/// Dark plain text without a background, as large as the text needs.
struct ToolbarLabel {
  std::string text{};
  Font font{};
};

/// Takes the room that the other items leave.
struct FlexibleSpace {};

/// A button of a kind that the host can name or draw.
struct BarButton {
  enum class SystemItem { Save };

  SystemItem item = SystemItem::Save;
  /// Called when the user presses the button. It may set other items.
  std::function<void()> action{};
};

using ToolbarItem = std::variant<ActivityIndicator, ToolbarLabel, FlexibleSpace, BarButton>;

}  // namespace varnel
