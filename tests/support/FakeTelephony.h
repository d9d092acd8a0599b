#pragma once

#include <algorithm>
#include <functional>
#include <memory>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "platform/TelephonyService.h"

namespace varnel {

/// A telephony service that does what the test says. It must outlive its connections.
class FakeTelephony final : public TelephonyService {
 public:
  bool refusesConnections = false;
  /// The answer to each request for a log channel.
  TelephonyConnection::LogChannel logChannel{0, "service.commands"};
  /// Called while a log channel is being made and the connection is open.
  std::function<void()> whileMakingLogChannel;

  /// How many connections were requested.
  unsigned attempts = 0;
  /// The local ports of the requested log channels, the oldest first.
  std::vector<std::string> logChannelNames;

  std::unique_ptr<TelephonyConnection> connect(std::function<void()> notificationHandler) override {
    ++attempts;
    if (refusesConnections) return nullptr;
    return std::make_unique<Connection>(*this, std::move(notificationHandler));
  }

  std::size_t openConnections() const { return _connections.size(); }

  /// Sends one notification to every connection that is open.
  void notify() {
    const std::vector<Connection*> open = _connections;
    for (Connection* connection : open) {
      // A notification may close connections, including this one.
      if (std::ranges::find(_connections, connection) == _connections.end()) continue;
      const std::function<void()> handler = connection->_notificationHandler;
      handler();
    }
  }

 private:
  class Connection final : public TelephonyConnection {
   public:
    Connection(FakeTelephony& service, std::function<void()> notificationHandler)
        : _service(service), _notificationHandler(std::move(notificationHandler)) {
      _service._connections.push_back(this);
    }
    Connection(const Connection&) = delete;
    Connection& operator=(const Connection&) = delete;
    ~Connection() override { std::erase(_service._connections, this); }

    LogChannel createLogChannel(std::string_view localPortName) override {
      _service.logChannelNames.emplace_back(localPortName);
      if (_service.whileMakingLogChannel) _service.whileMakingLogChannel();
      return _service.logChannel;
    }

    FakeTelephony& _service;
    std::function<void()> _notificationHandler;
  };

  std::vector<Connection*> _connections;
};

}  // namespace varnel
