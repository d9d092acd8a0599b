#pragma once

#include <cstddef>
#include <string>
#include <vector>

#include "base/Time.h"
#include "base/Value.h"
#include "model/events/DisplayEvent.h"
#include "model/events/SubscriptionEvents.h"

namespace varnel {

/// Tells what happens to a phone, from what the display of all radios shows. Whoever looks after each message
/// gets exact times. A look compares a few texts; it searches for them only when the display has got new
/// groups.
class DisplayEvents {
 public:
  /// What has happened since the last look, with this time. The first look at a display finds what it shows
  /// at all. The display may be absent.
  std::vector<DisplayEvent> lookAt(const Value& display, Time time);

 private:
  // The groups of one SIM card, or those that belong to none.
  struct Subscription {
    std::string name;  // "SIM 1"; empty for none
    Value groups;
    std::size_t size;  // of the groups when they were bound
    SubscriptionEvents events;
  };

  bool isBoundTo(const Value& display) const;
  void bind(const Value& display);
  void bindSubscription(const std::string& name, const Value& groups);

  std::vector<Subscription> _subscriptions;  // the first one is none
};

}  // namespace varnel
