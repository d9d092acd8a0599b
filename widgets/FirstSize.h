#pragma once

#include <QSize>
#include <optional>

namespace varnel {

/// Neither side of a window is smaller.
inline constexpr int smallestWindowSide = 240;

/// True for a screen that is hardly larger than a phone's: the window fills it.
bool isTakenWhole(const QSize& available);

/// The first size of a window on a desktop with this much room. It leaves room for a frame.
/// @param last the last size of the window, if it is known
QSize firstSize(const QSize& available, const std::optional<QSize>& last);

}  // namespace varnel
