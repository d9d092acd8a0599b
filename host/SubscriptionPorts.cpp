#include "host/SubscriptionPorts.h"

#include <cstddef>
#include <utility>

#include "host/Subscription.h"

namespace varnel {

namespace {

constexpr std::int32_t logMessageIdentifier = 0;
// The viewer decodes nothing shorter. Like the viewer, this counts the prefix with the subscription.
constexpr std::size_t headerSize = 13;

bool isShown(std::int32_t identifier, ByteView message) {
  return identifier == logMessageIdentifier && message.size() >= headerSize;
}

}  // namespace

MessagePorts::LocalPortCreation SubscriptionPorts::createLocalPort(std::string_view name,
                                                                   LocalPort::MessageHandler handler) {
  std::optional<SubscriptionFilter> filter;
  if (_wanted) filter.emplace(_wanted);
  const auto take = [this, filter, handler = std::move(handler)](
                        std::int32_t identifier, ByteView data) mutable -> std::optional<Bytes> {
    const auto subscription = subscriptionOf(data);
    if (filter && !filter->takes(subscription)) return std::nullopt;
    if (subscription && isShown(identifier, data)) _monitor.subscriptionIsShown(*subscription);
    ++_messagesTaken;
    return handler(identifier, data);
  };
  return _ports.createLocalPort(name, take);
}

std::unique_ptr<RemotePort> SubscriptionPorts::createRemotePort(std::string_view name) {
  return _ports.createRemotePort(name);
}

}  // namespace varnel
