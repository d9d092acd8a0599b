#pragma once

#include <cstdint>
#include <optional>
#include <string>

#include "host/Subscription.h"

namespace varnel {

/// Chooses the records of a replay by their subscription: those of the given one, else of the first one, and
/// those of none. A log line tells, once, that there are others, unless one was given.
class ReplaySubscription {
 public:
  /// The name of the capture is for the log.
  ReplaySubscription(std::string name, std::optional<std::uint8_t> wanted)
      : _name(std::move(name)), _filter(wanted), _tellsOthers(!wanted) {}

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
