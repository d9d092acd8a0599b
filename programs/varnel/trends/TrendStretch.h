#pragma once

#include "app/ValueHistory.h"

namespace varnel {

/// Which stretch of a history a picture shows. The whole history grows while it is shown.
class TrendStretch {
 public:
  using Duration = ValueHistory::Duration;
  using Stretch = ValueHistory::Stretch;
  static constexpr Duration shortest = std::chrono::seconds(10);
  /// A history that is shorter is shown as if it were that long.
  static constexpr Duration leastWhole = std::chrono::minutes(1);

  enum class Kind {
    Last,   ///< the time up to the newest display: it goes on with the history
    Whole,  ///< everything: it goes on too
    Fixed,  ///< it stands still
  };

  Kind kind() const { return _kind; }
  /// Of `Kind::Last` alone.
  Duration length() const { return _length; }

  void showLast(Duration length);
  void showWhole();
  void show(const Stretch& stretch);

  /// The stretch to show of a history.
  Stretch of(const Stretch& whole) const;

  /// Shows a part of the stretch, or more than it: a factor of 0.5 shows half of it. The point at this share
  /// of the stretch, 0 to 1, keeps its place. A stretch that reaches the end of the history goes on with it.
  void zoom(double factor, double share, const Stretch& whole);
  /// The same at the end where the stretch goes on with the history, else in its middle: for keys and
  /// buttons.
  void zoom(double factor, const Stretch& whole);
  /// Moves by a share of the stretch; above 0 toward later times. It stops where the history ends.
  void pan(double share, const Stretch& whole);
  /// Moves to the beginning of the history.
  void goToBegin(const Stretch& whole);
  /// Moves to its end, and goes on with it.
  void goToEnd(const Stretch& whole);

 private:
  // Keeps what is shown within the history.
  void settle(Stretch stretch, const Stretch& whole);

  Kind _kind = Kind::Last;
  Duration _length = std::chrono::minutes(10);
  Stretch _fixed;
};

}  // namespace varnel
