#pragma once

#include "platform/ui/Geometry.h"
#include "platform/ui/TextMetrics.h"
#include "terminal/CellGrid.h"

namespace varnel {

/// The size of a terminal's cell in the lengths of a layout. A row of a table is one row of the terminal.
inline constexpr double columnWidth = 10;
inline constexpr double rowHeight = 50;

/// The column or row in which a length ends. Parts of one do not count.
int wholeColumns(double length);
int wholeRows(double length);
/// The cells of a rectangle.
Area areaOf(const Rect& frame);
Rect frameOf(const Area& area);

/// Every font has the same width. A wide character takes two columns.
class TerminalMetrics final : public TextMetrics {
 public:
  Size sizeOfText(std::string_view text, const Font& font) const override;
};

}  // namespace varnel
