#include "terminal/TerminalMetrics.h"

#include <algorithm>
#include <cmath>

#include "terminal/Characters.h"

namespace varnel {

namespace {

// Layouts are small; a longer length is a text that nobody can scroll to the end of.
constexpr double longestLength = 1e6;

int wholeUnits(double length, double unit) {
  return static_cast<int>(std::floor(std::clamp(length, -longestLength, longestLength) / unit));
}

}  // namespace

int wholeColumns(double length) { return wholeUnits(length, columnWidth); }
int wholeRows(double length) { return wholeUnits(length, rowHeight); }

Area areaOf(const Rect& frame) {
  return {wholeColumns(frame.x), wholeRows(frame.y), wholeColumns(frame.width), wholeRows(frame.height)};
}

Rect frameOf(const Area& area) {
  return {area.column * columnWidth, area.row * rowHeight, area.columns * columnWidth, area.rows * rowHeight};
}

Size TerminalMetrics::sizeOfText(std::string_view text, const Font&) const {
  return {columnsOf(text) * columnWidth, rowHeight};
}

}  // namespace varnel
