#include "host/Subscription.h"

#include <utility>

namespace varnel {

namespace {

constexpr std::uint8_t prefixMark = 0x81;

}  // namespace

std::optional<std::uint8_t> subscriptionOf(ByteView message) {
  if (message.size() < 2 || message[0] != prefixMark || message[1] == 0) return std::nullopt;
  return message[1];
}

SubscriptionFilter::SubscriptionFilter(std::optional<std::uint8_t> wanted, std::string stream, Tell tell)
    : _isTelling(!wanted && tell), _taken(wanted), _stream(std::move(stream)), _tell(std::move(tell)) {}

bool SubscriptionFilter::takesNamed(std::uint8_t subscription) {
  if (!_taken) {
    _taken = subscription;
    return true;
  }
  ++_leftOut;
  if (std::exchange(_isTelling, false)) {
    const std::string taken = std::to_string(*_taken), other = std::to_string(subscription);
    _tell(_stream + " has messages of subscriptions " + taken + " and " + other + "; those of " + taken +
          " are taken, and --sim " + other + " takes the others");
  }
  return false;
}

}  // namespace varnel
