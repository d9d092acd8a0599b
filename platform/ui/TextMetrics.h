#pragma once

#include <string_view>

#include "platform/ui/Font.h"
#include "platform/ui/Geometry.h"

namespace varnel {

/// Measures texts.
class TextMetrics {
 public:
  virtual ~TextMetrics() = default;
  /// The size of the text on a single line. A label of this size and font shows the whole text.
  virtual Size sizeOfText(std::string_view text, const Font& font) const = 0;
};

}  // namespace varnel
