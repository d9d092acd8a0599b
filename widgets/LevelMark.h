#pragma once

#include <QPainter>
#include <QPalette>
#include <QPointF>
#include <QSizeF>

#include "platform/ui/TableCell.h"

namespace varnel {

/// The size of a level's mark, in logical pixels.
inline constexpr QSizeF levelMarkSize{18, 14};

/// Four bars of growing height, of which one (poor) to four (excellent) are filled. Their color says the same
/// again. Paints nothing for no level.
void paintLevelMark(QPainter& painter, const QPointF& topLeft, CellLevel level, const QColor& filled,
                    const QColor& empty);
/// A color for the filled bars of this level, which can be seen well on the ground.
QColor levelColor(CellLevel level, const QPalette& palette, const QColor& ground);

}  // namespace varnel
