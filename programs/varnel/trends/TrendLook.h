#pragma once

#include <QColor>
#include <QFont>
#include <QPalette>
#include <QPen>

namespace varnel {

/// Colors and font of a picture.
struct TrendLook {
  QColor ground, text, grid;
  bool isDark = false;
  QFont font;

  /// That of a widget, which follows the desktop.
  static TrendLook of(const QPalette& palette, const QFont& font);
  /// Black on white, for reports.
  static TrendLook forPaper(const QFont& font);

  /// The pen of a line. People who do not see all colors can tell these apart too.
  QPen penOf(std::size_t line) const;
};

/// More lines than these are in no picture.
inline constexpr std::size_t mostTrendLines = 8;
/// More units than these, each with its axis, are in no picture.
inline constexpr std::size_t mostTrendUnits = 4;

}  // namespace varnel
