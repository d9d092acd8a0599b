#pragma once

#include <cstdint>
#include <functional>
#include <optional>
#include <string>

#include "base/Bytes.h"

namespace varnel {

/// Which SIM card's modem a message of the log channel is of, by the byte behind its leading 0x81; absent
/// where there is none, or it is 0.
std::optional<std::uint8_t> subscriptionOf(ByteView message);

/// Takes the messages of one subscription out of a stream that may have several, which the displays of one
/// modem would mix. What names no subscription belongs to each.
class SubscriptionFilter {
 public:
  using Tell = std::function<void(const std::string& line)>;

  /// Unless one is wanted, the first that is met is taken; of the next other one `tell` gets a line, once,
  /// which calls the stream by that name.
  SubscriptionFilter(std::optional<std::uint8_t> wanted, std::string stream, Tell tell);

  bool takes(std::optional<std::uint8_t> subscription) {
    return !subscription || subscription == _taken || takesNamed(*subscription);
  }

  /// How many messages were of other subscriptions so far.
  std::uint64_t leftOut() const { return _leftOut; }

 private:
  bool takesNamed(std::uint8_t subscription);

  bool _isTelling;
  std::optional<std::uint8_t> _taken;
  std::string _stream;
  Tell _tell;
  std::uint64_t _leftOut = 0;
};

}  // namespace varnel
