#pragma once

#include <memory>

#include "host/Subscription.h"
#include "platform/MessagePort.h"

namespace varnel {

/// Message ports whose local ports get only the messages of one subscription, and those without one.
class SubscriptionPorts final : public MessagePorts {
 public:
  /// The ports must outlive this object.
  SubscriptionPorts(MessagePorts& ports, std::uint8_t subscription)
      : _ports(ports), _subscription(subscription) {}

  LocalPortCreation createLocalPort(std::string_view name, LocalPort::MessageHandler handler) override;
  std::unique_ptr<RemotePort> createRemotePort(std::string_view name) override;

 private:
  MessagePorts& _ports;
  std::uint8_t _subscription;
};

}  // namespace varnel
