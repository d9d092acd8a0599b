#include "host/SubscriptionPorts.h"

#include <utility>

namespace varnel {

MessagePorts::LocalPortCreation SubscriptionPorts::createLocalPort(std::string_view name,
                                                                   LocalPort::MessageHandler handler) {
  const auto takeOne = [filter = SubscriptionFilter(_subscription), handler = std::move(handler)](
                           std::int32_t identifier, ByteView data) mutable -> std::optional<Bytes> {
    if (!filter.takes(subscriptionOf(data))) return std::nullopt;
    return handler(identifier, data);
  };
  return _ports.createLocalPort(name, takeOne);
}

std::unique_ptr<RemotePort> SubscriptionPorts::createRemotePort(std::string_view name) {
  return _ports.createRemotePort(name);
}

}  // namespace varnel
