#pragma once

#include <cstdint>
#include <optional>
#include <span>
#include <string>
#include <string_view>

#include "base/MessagePrefix.h"

namespace varnel {

/// What is taken of a stream with several subscriptions when the user wants no particular one.
enum class Unasked {
  First,  ///< the subscription that is met first, since one display would mix the messages of several modems
  All,    ///< all, for a display that keeps them apart
};

/// `All` for the technology of all radios, `First` for the others.
Unasked unaskedOf(std::string_view technology);

/// Takes the messages of one subscription, or of all, from a stream that may have several. A message without
/// a subscription belongs to the whole phone and is always taken.
class SubscriptionFilter {
 public:
  explicit SubscriptionFilter(std::optional<std::uint8_t> wanted, Unasked unasked = Unasked::First)
      : _taken(wanted), _takesAll(!wanted && unasked == Unasked::All) {}

  bool takes(std::optional<std::uint8_t> subscription) {
    if (!subscription || _takesAll) return true;
    if (!_taken) _taken = subscription;
    return subscription == _taken;
  }

  bool takesAll() const { return _takesAll; }
  /// The one that is taken. Absent while none was wanted and none was met, and when all are taken.
  std::optional<std::uint8_t> taken() const { return _taken; }

 private:
  std::optional<std::uint8_t> _taken;
  bool _takesAll;
};

/// How messages to users name a subscription, or none.
std::string subscriptionName(std::optional<std::uint8_t> subscription);
/// The same of several, as "SIM 1, SIM 2 and SIM 3".
std::string subscriptionNames(std::span<const std::uint8_t> subscriptions);

}  // namespace varnel
