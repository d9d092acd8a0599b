#include "app/EventHistory.h"

#include <algorithm>
#include <utility>

namespace varnel {

void EventHistory::look(const Value& display, Time now, Duration at) {
  for (DisplayEvent& event : _display.lookAt(display, now)) add(std::move(event), at);
}

void EventHistory::add(DisplayEvent event, Duration at) {
  if (!_events.empty()) at = std::max(at, _events.back().at);
  _events.push_back({at, std::move(event)});
  if (_events.size() <= mostEvents) return;
  _events.pop_front();
  _lacksSome = true;
}

void EventHistory::clear() { *this = {}; }

void EventHistory::dropBefore(Duration point) {
  while (!_events.empty() && _events.front().at < point) _events.pop_front();
}

std::vector<EventHistory::Event> EventHistory::in(const ValueHistory::Stretch& stretch) const {
  const auto begin = std::ranges::lower_bound(_events, stretch.begin, {}, &Event::at);
  const auto end = std::ranges::upper_bound(begin, _events.end(), stretch.end, {}, &Event::at);
  return {begin, end};
}

std::string textOf(const DisplayEvent& event) {
  std::string text(nameOf(event.kind));
  text.append(", ").append(event.section).append(": ");
  if (!event.from.empty()) text.append(event.from).append(" -> ");
  return text.append(event.to);
}

}  // namespace varnel
