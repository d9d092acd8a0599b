#pragma once

#include <memory>

#include "host/Subscription.h"
#include "platform/MessagePort.h"

namespace varnel {

/// Message ports whose local ones get the messages of one subscription alone, and those that name none.
class SubscriptionPorts final : public MessagePorts {
 public:
  /// The ports outlive this object.
  SubscriptionPorts(MessagePorts& ports, std::uint8_t subscription)
      : _ports(ports), _subscription(subscription) {}

  LocalPortCreation createLocalPort(std::string_view name, LocalPort::MessageHandler handler) override;
  std::unique_ptr<RemotePort> createRemotePort(std::string_view name) override;

 private:
  MessagePorts& _ports;
  std::uint8_t _subscription;
};

}  // namespace varnel
