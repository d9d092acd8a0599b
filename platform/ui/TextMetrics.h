#pragma once

#include <string_view>

#include "platform/ui/Font.h"
#include "platform/ui/Geometry.h"

namespace varnel {

/// How much room texts take.
class TextMetrics {
 public:
  virtual ~TextMetrics() = default;
  /// The room of the text on a single line. A label of that size and font shows it whole.
  virtual Size sizeOfText(std::string_view text, const Font& font) const = 0;
};

}  // namespace varnel
