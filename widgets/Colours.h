#pragma once

#include <QColor>
#include <QPalette>

namespace varnel {

/// Colours that the desktop's palette has no role for, made from those that it has, so that they follow it
/// from light to dark.

/// Part of the way from one colour to another: 0 is the first, 1 the second.
QColor blend(const QColor& from, const QColor& to, double share);
/// Between 1, the same lightness, and 21, black on white (WCAG 2.1, contrast ratio).
double contrast(const QColor& one, const QColor& other);

/// Lines between rows and along bars.
QColor separatorColour(const QPalette& palette);
/// Scroll bars within rows.
QColor barColour(const QPalette& palette);
/// Marks that stand back behind the text.
QColor markColour(const QPalette& palette);
/// The ground of the selected row, on which the text keeps its colour.
QColor selectionColour(const QPalette& palette);
/// What can be pressed: the desktop's highlight colour, made readable on that ground.
QColor accentColour(const QPalette& palette, const QColor& ground);

}  // namespace varnel
