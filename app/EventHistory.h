#pragma once

#include <cstddef>
#include <deque>
#include <vector>

#include "app/ValueHistory.h"
#include "base/Time.h"
#include "base/Value.h"
#include "model/events/DisplayEvents.h"

namespace varnel {

/// What has happened to the phone, beside the numbers of a `ValueHistory` and on its axis.
class EventHistory {
 public:
  using Duration = ValueHistory::Duration;
  /// The oldest ones beyond these go.
  static constexpr std::size_t mostEvents = 10'000;

  struct Event {
    Duration at{};  ///< on the axis of the history
    DisplayEvent event;
  };

  /// Keeps what has happened since the last look at the display.
  void look(const Value& display, Time now, Duration at);
  /// Keeps an event that another process has found. It is not earlier than those before.
  void add(DisplayEvent event, Duration at);
  /// Forgets everything.
  void clear();
  /// Forgets events before this point.
  void dropBefore(Duration point);

  /// The events of a stretch, the oldest first.
  std::vector<Event> in(const ValueHistory::Stretch& stretch) const;
  /// Whether early events had to go because there are too many.
  bool lacksSome() const { return _lacksSome; }

 private:
  DisplayEvents _display;
  std::deque<Event> _events;
  bool _lacksSome = false;
};

/// An event in words, without its time: "handover, LTE/Serving Cell: PCI 16 -> PCI 22".
std::string textOf(const DisplayEvent& event);

}  // namespace varnel
