#pragma once

#include <string>
#include <string_view>

#include "platform/ui/Font.h"
#include "platform/ui/Geometry.h"

namespace varnel {

/// One line of plain text, left-aligned and centred vertically in its frame. It never takes the row's clicks.
class Label {
 public:
  virtual ~Label() = default;
  virtual void setFont(const Font& font) = 0;
  /// The text is shown character by character as it is: no mark-up, no mnemonics.
  virtual void setText(std::string_view text) = 0;
  virtual std::string text() const = 0;
  /// Where it stands in what holds it.
  virtual void setFrame(const Rect& frame) = 0;
};

}  // namespace varnel
