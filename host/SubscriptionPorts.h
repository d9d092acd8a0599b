#pragma once

#include <cstdint>
#include <memory>
#include <optional>

#include "host/LinkMonitor.h"
#include "platform/MessagePort.h"

namespace varnel {

/// Message ports whose local ports get only the messages of one subscription, and those without one. When no
/// subscription is wanted they get all messages. The monitor learns the subscriptions of the log messages
/// that they got and that are as long as a header. The object must outlive its local ports.
class SubscriptionPorts final : public MessagePorts {
 public:
  /// The ports and the monitor must outlive this object.
  SubscriptionPorts(MessagePorts& ports, LinkMonitor& monitor, std::optional<std::uint8_t> wanted)
      : _ports(ports), _monitor(monitor), _wanted(wanted) {}

  LocalPortCreation createLocalPort(std::string_view name, LocalPort::MessageHandler handler) override;
  std::unique_ptr<RemotePort> createRemotePort(std::string_view name) override;
  /// How many messages all local ports have handed on so far.
  std::uint64_t messagesTaken() const { return _messagesTaken; }

 private:
  MessagePorts& _ports;
  LinkMonitor& _monitor;
  std::optional<std::uint8_t> _wanted;
  std::uint64_t _messagesTaken = 0;
};

}  // namespace varnel
