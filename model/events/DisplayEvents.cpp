#include "model/events/DisplayEvents.h"

#include <algorithm>
#include <iterator>
#include <string_view>

#include "base/Dictionary.h"
#include "base/MessagePrefix.h"

namespace varnel {

std::vector<DisplayEvent> DisplayEvents::lookAt(const Value& display, Time time) {
  std::vector<DisplayEvent> events;
  if (!display.dictionary()) return events;
  if (!isBoundTo(display)) bind(display);
  for (Subscription& subscription : _subscriptions) subscription.events.look(time, events);
  return events;
}

// While the display is the same, groups are only added, and a group has all its sections from the beginning.
bool DisplayEvents::isBoundTo(const Value& display) const {
  if (_subscriptions.empty() || _subscriptions[0].groups.dictionary() != display.dictionary()) return false;
  return std::ranges::all_of(_subscriptions, [](const Subscription& subscription) {
    return subscription.groups.dictionary()->size() == subscription.size;
  });
}

void DisplayEvents::bind(const Value& display) {
  const bool isNew = _subscriptions.empty() || _subscriptions[0].groups.dictionary() != display.dictionary();
  if (isNew) _subscriptions.clear();
  bindSubscription("", display);
  for (const auto& [key, value] : *display.dictionary())
    if (key.starts_with(subscriptionNameMark) && value.dictionary()) bindSubscription(key, value);
}

void DisplayEvents::bindSubscription(const std::string& name, const Value& groups) {
  auto found = std::ranges::find(_subscriptions, name, &Subscription::name);
  if (found == _subscriptions.end()) {
    _subscriptions.push_back({name, {}, 0, SubscriptionEvents(name.empty() ? name : name + '/')});
    found = std::prev(_subscriptions.end());
  }
  found->groups = groups;
  found->size = groups.dictionary()->size();
  found->events.bind(*groups.dictionary());
}

}  // namespace varnel
