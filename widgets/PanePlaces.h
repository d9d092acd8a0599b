#pragma once

#include <QRect>
#include <cstddef>
#include <optional>

namespace varnel {

/// Where the panes of a stack are on the screen. All others are hidden.
struct PanePlaces {
  /// From this width on the last two panes are side by side.
  static constexpr int narrowestForTwo = 900;

  std::optional<QRect> left;  ///< of the pane below the top one; absent while only the top one is visible
  QRect top;

  /// The places in this room for a stack of so many panes, at least one. Between two panes there is a line.
  static PanePlaces in(const QRect& room, std::size_t panes);
  /// The part of this room in which the top pane changes.
  static QRect partThatChanges(const QRect& room);
};

}  // namespace varnel
