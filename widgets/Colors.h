#pragma once

#include <QColor>
#include <QPalette>

namespace varnel {

/// Colors for which the desktop's palette has no role. They are made from colors of the palette, so that they
/// follow its light or dark scheme.

/// A color between two others: a share of 0 is the first, 1 the second.
QColor blend(const QColor& from, const QColor& to, double share);
/// From 1, the same lightness, to 21, black on white (WCAG 2.1, contrast ratio).
double contrast(const QColor& one, const QColor& other);

/// Lines between rows and along bars.
QColor separatorColor(const QPalette& palette);
/// Scroll bars within rows.
QColor barColor(const QPalette& palette);
/// Marks that are less prominent than text.
QColor markColor(const QPalette& palette);
/// Text that only adds to other text, readable on the ground of rows and on that of the selected row.
QColor quietTextColor(const QPalette& palette);
/// The ground of the selected row. The text on it keeps its color.
QColor selectionColor(const QPalette& palette);
/// The same in a pane without the keyboard.
QColor paleSelectionColor(const QPalette& palette);
/// Text that is out of date. It is still easy to read.
QColor dimmedTextColor(const QPalette& palette, const QColor& ground);
/// A color for marks on this ground: nearer to the text's color, as far as the mark would not be seen well.
QColor seenOn(const QColor& ground, const QColor& color, const QColor& text);
/// Things that can be pressed: the desktop's highlight color, made readable on this ground.
QColor accentColor(const QPalette& palette, const QColor& ground);

}  // namespace varnel
