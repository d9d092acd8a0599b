#include "host/SubscriptionPorts.h"

#include <utility>

#include "host/Subscription.h"

namespace varnel {

MessagePorts::LocalPortCreation SubscriptionPorts::createLocalPort(std::string_view name,
                                                                   LocalPort::MessageHandler handler) {
  std::optional<SubscriptionFilter> filter;
  if (_wanted) filter.emplace(_wanted);
  const auto take = [filter, &monitor = _monitor, handler = std::move(handler)](
                        std::int32_t identifier, ByteView data) mutable -> std::optional<Bytes> {
    const auto subscription = subscriptionOf(data);
    if (filter && !filter->takes(subscription)) return std::nullopt;
    if (subscription) monitor.subscriptionIsShown(*subscription);
    return handler(identifier, data);
  };
  return _ports.createLocalPort(name, take);
}

std::unique_ptr<RemotePort> SubscriptionPorts::createRemotePort(std::string_view name) {
  return _ports.createRemotePort(name);
}

}  // namespace varnel
