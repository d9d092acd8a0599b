#pragma once

#include "platform/ui/TextMetrics.h"

namespace varnel {

/// How much room texts take in the fonts that they are drawn with.
class FontMetrics final : public TextMetrics {
 public:
  Size sizeOfText(std::string_view text, const Font& font) const override;
};

}  // namespace varnel
