#pragma once

#include <functional>
#include <optional>
#include <utility>
#include <vector>

#include "app/RowCourse.h"
#include "platform/Clock.h"

namespace varnel {

/// The courses of rows while a capture is played. The history of the whole capture has them also when the
/// display has just come from another place. What it lacks comes from the displays that were shown.
class CaptureCourses final : public RowCourses {
 public:
  /// The history of a capture, as far as it is read.
  struct Capture {
    const ValueHistory* numbers = nullptr;
    bool isWhole = false;
  };
  /// Everything must outlive the object.
  struct Sources {
    const ValueHistory& displays;                     ///< those that were shown
    const Clock& clock;                               ///< shows the time of the place that is played
    std::function<std::optional<Capture>()> capture;  ///< the one that is played; nothing when none is
  };

  explicit CaptureCourses(Sources sources) : _sources(std::move(sources)) {}

  std::vector<std::optional<double>> course(const VarnelModelNode& row) const override;
  unsigned edition() const override { return playedPlace() ? 1 : 0; }

 private:
  struct Place {
    const ValueHistory* numbers;
    ValueHistory::Duration point;
  };
  // The last search for a moment. It goes through all displays of a capture, and every row wants it.
  struct Search {
    const ValueHistory* numbers;
    ValueHistory::Duration end;  // of the numbers
    Time time;
    std::optional<ValueHistory::Duration> point;
  };

  /// Nothing when no capture is played, and when it is not yet read until there.
  std::optional<Place> playedPlace() const;
  std::optional<ValueHistory::Duration> pointAt(const ValueHistory& numbers, Time time) const;

  const Sources _sources;
  mutable std::optional<Search> _search;
};

}  // namespace varnel
