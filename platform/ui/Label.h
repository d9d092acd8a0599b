#pragma once

#include <string>
#include <string_view>

#include "platform/ui/Font.h"
#include "platform/ui/Geometry.h"

namespace varnel {

/// One line of plain text, left-aligned and vertically centered in its frame. Clicks go through it to the
/// row.
class Label {
 public:
  virtual ~Label() = default;
  virtual void setFont(const Font& font) = 0;
  /// Every character of the text is shown as it is: there is no markup and there are no mnemonics.
  virtual void setText(std::string_view text) = 0;
  virtual std::string text() const = 0;
  /// The frame in the coordinates of the parent.
  virtual void setFrame(const Rect& frame) = 0;
};

}  // namespace varnel
