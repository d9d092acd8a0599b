#pragma once

#include <QSize>
#include <optional>

namespace varnel {

/// Windows are no smaller, in either direction.
inline constexpr int smallestWindowSide = 240;

/// True for the room of a screen that is hardly larger than a phone's: a window takes it whole.
bool isTakenWhole(const QSize& available);

/// The size that a window gets at first on a desktop with that much room. It leaves room for a frame.
/// @param last the size that it had last, if that is known
QSize firstSize(const QSize& available, const std::optional<QSize>& last);

}  // namespace varnel
