#pragma once

#include <cstdint>
#include <optional>
#include <string>

#include "base/Bytes.h"

namespace varnel {

/// Which SIM card's modem a message of the log channel is of, by the byte behind its leading 0x81; absent
/// where there is none, or it is 0.
std::optional<std::uint8_t> subscriptionOf(ByteView message);

/// Takes the messages of one subscription out of a stream that may have several, which the displays of one
/// modem would mix: of the wanted one, or else of the first that is met. What names none is of the whole
/// phone and always taken.
class SubscriptionFilter {
 public:
  explicit SubscriptionFilter(std::optional<std::uint8_t> wanted) : _taken(wanted) {}

  bool takes(std::optional<std::uint8_t> subscription) {
    if (!subscription) return true;
    if (!_taken) _taken = subscription;
    return subscription == _taken;
  }

  /// Absent as long as none was wanted and none met.
  std::optional<std::uint8_t> taken() const { return _taken; }

 private:
  std::optional<std::uint8_t> _taken;
};

/// How users are told of a subscription, or of none.
std::string subscriptionName(std::optional<std::uint8_t> subscription);

}  // namespace varnel
