#include "host/Subscription.h"

#include "base/MessagePrefix.h"
#include "platform/TelephonyService.h"

namespace varnel {

Unasked unaskedOf(std::string_view technology) {
  return technology == technology::allRadios ? Unasked::All : Unasked::First;
}

std::string subscriptionName(std::optional<std::uint8_t> subscription) {
  return subscription ? subscriptionName(*subscription) : "No SIM";
}

std::string subscriptionNames(std::span<const std::uint8_t> subscriptions) {
  std::string names;
  for (std::size_t i = 0; i < subscriptions.size(); ++i) {
    if (i > 0) names += i + 1 < subscriptions.size() ? ", " : " and ";
    names += subscriptionName(subscriptions[i]);
  }
  return names;
}

}  // namespace varnel
