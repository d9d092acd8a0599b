#pragma once

#include "platform/ui/TextMetrics.h"

namespace varnel {

/// Measures texts in the fonts in which they are drawn.
class FontMetrics final : public TextMetrics {
 public:
  Size sizeOfText(std::string_view text, const Font& font) const override;
};

}  // namespace varnel
