#pragma once

#include <QFont>
#include <QRect>
#include <QRectF>
#include <QString>
#include <string_view>

#include "platform/ui/Font.h"
#include "platform/ui/Geometry.h"

namespace varnel {

/// The text as it is shown on one line. Line ends, tabs, and other control characters become blanks. Bytes
/// that are not UTF-8 become replacement characters.
QString singleLine(std::string_view text);
std::string utf8(const QString& text);

/// A tooltip that shows every character of the text as it is, in as many lines as needed.
QString plainTooltip(const QString& text);

QFont qtFont(const Font& font);

QRectF qtRect(const Rect& rect);
/// The nearest rectangle of whole pixels.
QRect qtPixels(const Rect& rect);

}  // namespace varnel
