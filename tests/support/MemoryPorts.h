#pragma once

#include <functional>
#include <memory>
#include <stdexcept>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "platform/MessagePort.h"

namespace varnel {

/// Message ports within one process. The test plays the peer: it delivers messages, answers requests, goes
/// away, and refuses what it wants to. It must outlive its ports.
class MemoryPorts final : public MessagePorts {
 public:
  /// One message that was sent to a remote port.
  struct Request {
    std::int32_t identifier;
    Bytes data;
    std::chrono::milliseconds timeout;
    std::optional<std::chrono::milliseconds> replyTimeout;
  };
  /// How the peer answers a request. A reply for which nobody waits is lost.
  using Answer = std::function<RemotePort::SendResult(const Request&)>;

  bool refusesLocalPorts = false;
  bool refusesRemotePorts = false;
  /// Without an answer function, requests are sent and get no reply.
  Answer answer;

  /// All sent messages, the oldest first.
  std::vector<Request> requests;
  /// What happened to the ports, the oldest first: "local NAME created", "local handler set", "local handler
  /// removed", "local delivers", "local invalidated", "local destroyed", "remote NAME created", "remote
  /// invalidated", "remote destroyed".
  std::vector<std::string> events;

  LocalPortCreation createLocalPort(std::string_view name, LocalPort::MessageHandler handler) override {
    if (refusesLocalPorts) return {};
    if (local(name)) return {nullptr, true};
    auto port = std::make_unique<Local>(*this, name, std::move(handler));
    note("local " + std::string(name) + " created");
    return {std::move(port), false};
  }

  std::unique_ptr<RemotePort> createRemotePort(std::string_view name) override {
    if (refusesRemotePorts) return nullptr;
    auto port = std::make_unique<Remote>(*this);
    note("remote " + std::string(name) + " created");
    return port;
  }

  /// True while there is a local port with this name.
  bool hasLocalPort(std::string_view name) const { return local(name) != nullptr; }
  /// The local port with this name, whose address handlers log.
  const LocalPort* localPort(std::string_view name) const { return local(name); }
  /// The newest remote port, while it exists.
  const RemotePort* remotePort() const { return _remotes.empty() ? nullptr : _remotes.back(); }

  /// Delivers a message to the local port with this name, and returns the reply.
  std::optional<Bytes> deliver(std::string_view name, std::int32_t identifier, ByteView data) {
    Local* port = local(name);
    if (!port || !port->_delivers) throw std::logic_error("no local port takes messages under that name");
    const LocalPort::MessageHandler handler = port->_messageHandler;  // a copy: it may destroy the port
    return call(handler, identifier, data);
  }

  /// The peer of the local port with this name goes away.
  void invalidateLocalPort(std::string_view name) {
    Local* port = local(name);
    if (!port) throw std::logic_error("no local port has that name");
    port->invalidate();
  }

  /// The peer of every remote port goes away. Only `isValid` tells.
  void endRemotePorts() {
    for (Remote* port : _remotes) port->_isValid = false;
  }

 private:
  class Local final : public LocalPort {
   public:
    Local(MemoryPorts& ports, std::string_view name, MessageHandler handler)
        : _ports(ports), _name(name), _messageHandler(std::move(handler)) {
      _ports._locals.push_back(this);
    }
    Local(const Local&) = delete;
    Local& operator=(const Local&) = delete;
    ~Local() override {
      std::erase(_ports._locals, this);
      _ports.note("local destroyed");
    }

    void deliverOnMainQueue() override {
      _delivers = true;
      _ports.note("local delivers");
    }
    void setInvalidationHandler(InvalidationHandler handler) override {
      _invalidationHandler = std::move(handler);
      _ports.note(_invalidationHandler ? "local handler set" : "local handler removed");
    }
    void invalidate() override {
      if (std::erase(_ports._locals, this) == 0) return;
      _ports.note("local invalidated");
      const InvalidationHandler handler = _invalidationHandler;  // a copy: the handler may destroy this port
      if (handler) handler();
    }

    MemoryPorts& _ports;
    const std::string _name;
    MessageHandler _messageHandler;
    InvalidationHandler _invalidationHandler;
    bool _delivers = false;
  };

  class Remote final : public RemotePort {
   public:
    explicit Remote(MemoryPorts& ports) : _ports(ports) { _ports._remotes.push_back(this); }
    Remote(const Remote&) = delete;
    Remote& operator=(const Remote&) = delete;
    ~Remote() override {
      std::erase(_ports._remotes, this);
      _ports.note("remote destroyed");
    }

    SendResult sendRequest(std::int32_t identifier, ByteView data, std::chrono::milliseconds timeout,
                           std::optional<std::chrono::milliseconds> replyTimeout) override {
      const Request request{identifier, Bytes(data.begin(), data.end()), timeout, replyTimeout};
      _ports.requests.push_back(request);
      if (!_isValid) return {isInvalid, std::nullopt};
      SendResult result = _ports.answer ? _ports.answer(request) : SendResult{};
      if (!replyTimeout) result.reply.reset();
      return result;
    }
    bool isValid() const override { return _isValid; }
    void invalidate() override {
      _isValid = false;
      _ports.note("remote invalidated");
    }

    MemoryPorts& _ports;
    bool _isValid = true;
  };

  static std::optional<Bytes> call(const LocalPort::MessageHandler& handler, std::int32_t identifier,
                                   ByteView data) noexcept {
    return handler(identifier, data);
  }

  Local* local(std::string_view name) const {
    for (Local* port : _locals) {
      if (port->_name == name) return port;
    }
    return nullptr;
  }

  void note(std::string event) { events.push_back(std::move(event)); }

  std::vector<Local*> _locals;  // those that have not ended
  std::vector<Remote*> _remotes;
};

}  // namespace varnel
