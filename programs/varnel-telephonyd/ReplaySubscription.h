#pragma once

#include <cstdint>
#include <optional>
#include <string>

#include "host/Subscription.h"

namespace varnel {

/// Chooses the records of a replay like `SubscriptionFilter`. A log line tells, once, that there are other
/// subscriptions, unless one was given.
class ReplaySubscription {
 public:
  /// The name of the capture is for the log.
  ReplaySubscription(std::string name, std::optional<std::uint8_t> wanted, Unasked unasked = Unasked::First)
      : _name(std::move(name)), _filter(wanted, unasked), _tellsOthers(!wanted) {}

  bool takes(std::optional<std::uint8_t> subscription);
  /// The sentence that the replay has ended, with the reason when no record was played for want of one of the
  /// subscription.
  std::string endNote(bool hasPlayed) const;

 private:
  const std::string _name;
  SubscriptionFilter _filter;
  bool _tellsOthers;  // whether other subscriptions still have to be reported
  bool _hasOthers = false;
};

}  // namespace varnel
