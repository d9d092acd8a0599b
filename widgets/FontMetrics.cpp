#include "widgets/FontMetrics.h"

#include <QFontMetricsF>
#include <cmath>

#include "widgets/QtValues.h"

namespace varnel {

Size FontMetrics::sizeOfText(std::string_view text, const Font& font) const {
  const QFontMetricsF metrics(qtFont(font));
  // Whole pixels: a label that is too narrow by a fraction would be cut.
  return {std::ceil(metrics.horizontalAdvance(singleLine(text))), std::ceil(metrics.height())};
}

}  // namespace varnel
