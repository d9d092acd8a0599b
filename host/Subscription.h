#pragma once

#include <cstdint>
#include <optional>
#include <span>
#include <string>

#include "base/MessagePrefix.h"

namespace varnel {

/// Takes the messages of one subscription from a stream that may have several. Without it, one display
/// would mix the messages of several modems. Takes the wanted subscription, or else the first one that is
/// met. A message without a subscription belongs to the whole phone and is always taken.
class SubscriptionFilter {
 public:
  explicit SubscriptionFilter(std::optional<std::uint8_t> wanted) : _taken(wanted) {}

  bool takes(std::optional<std::uint8_t> subscription) {
    if (!subscription) return true;
    if (!_taken) _taken = subscription;
    return subscription == _taken;
  }

  /// Absent while none was wanted and none was met.
  std::optional<std::uint8_t> taken() const { return _taken; }

 private:
  std::optional<std::uint8_t> _taken;
};

/// How messages to users name a subscription, or none.
std::string subscriptionName(std::optional<std::uint8_t> subscription);
/// The same of several, as "SIM 1, SIM 2 and SIM 3".
std::string subscriptionNames(std::span<const std::uint8_t> subscriptions);

}  // namespace varnel
