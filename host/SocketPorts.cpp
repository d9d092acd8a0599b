#include "host/SocketPorts.h"

#include <QDeadlineTimer>
#include <exception>
#include <string>
#include <utility>

#include "base/Log.h"
#include "host/LinkMonitor.h"
#include "host/SocketConnection.h"
#include "host/SocketServer.h"
#include "host/TelephonyProtocol.h"

namespace varnel {

namespace {

class SocketLocalPort final : public LocalPort {
 public:
  SocketLocalPort(const RuntimeFolder& folder, std::string_view name, MessageHandler handler)
      : _delivery(std::make_shared<Delivery>(Delivery{std::move(handler)})),
        _server(std::make_unique<SocketServer>(
            socketPath(folder.path, name),
            [this](std::unique_ptr<SocketConnection> peer) { setPeer(std::move(peer)); },
            SocketLimits{.connections = 1}, SocketGate{.access = folder.access})) {}
  SocketLocalPort(const SocketLocalPort&) = delete;
  SocketLocalPort& operator=(const SocketLocalPort&) = delete;
  ~SocketLocalPort() override { end(); }

  void deliverOnMainQueue() override {
    _delivery->hasBegun = true;
    if (_peer) _peer->wake();
  }

  void setInvalidationHandler(InvalidationHandler handler) override {
    _invalidationHandler = std::move(handler);
  }

  void invalidate() override {
    if (_delivery->hasEnded) return;
    end();
    // This must be last: the handler may destroy this port.
    if (const auto handler = std::exchange(_invalidationHandler, nullptr)) handler();
  }

 private:
  // What outlives the port while a message is handled: the message's handler may destroy the port.
  struct Delivery {
    MessageHandler handler;
    bool hasBegun = false;
    bool hasEnded = false;
  };

  void end() {
    _delivery->hasEnded = true;
    _server.reset();
    _peer.reset();
  }

  void setPeer(std::shared_ptr<SocketConnection> peer) {
    peer->setActivityHandler([this, weak = std::weak_ptr(peer)] {
      const auto active = weak.lock();
      const auto delivery = _delivery;
      if (!deliver(*delivery, *active) || active->isOpen()) return;
      invalidate();
    });
    _peer = std::move(peer);
  }

  // Delivers what the peer has sent. False when the port does not deliver, or no longer exists.
  static bool deliver(const Delivery& delivery, SocketConnection& peer) {
    if (!delivery.hasBegun) return false;
    while (const auto frame = peer.nextFrame()) {
      const bool isRequest = frame->mark == FrameMark::Request;
      if (!isRequest && frame->mark != FrameMark::Message) continue;
      const auto reply = callHandler(delivery.handler, *frame);
      if (isRequest) answer(peer, frame->identifier, reply);
      if (delivery.hasEnded) return false;
    }
    return true;
  }

  static std::optional<Bytes> callHandler(const MessageHandler& handler, const Frame& frame) noexcept {
    return handler(frame.identifier, frame.payload);
  }

  static void answer(SocketConnection& peer, std::int32_t identifier, const std::optional<Bytes>& reply) {
    if (reply && reply->size() <= maximumPayload) {
      peer.send({identifier, FrameMark::Reply, *reply});
    } else {
      peer.send({identifier, FrameMark::NoReply, {}});
    }
  }

  std::shared_ptr<Delivery> _delivery;
  InvalidationHandler _invalidationHandler;
  std::shared_ptr<SocketConnection> _peer;  // null until a process has connected
  std::unique_ptr<SocketServer> _server;    // null once the port has ended
};

class SocketRemotePort final : public RemotePort {
 public:
  SocketRemotePort(std::unique_ptr<SocketConnection> connection, LinkMonitor* monitor)
      : _connection(std::move(connection)), _monitor(monitor) {
    // Nobody waits for these replies: they are late.
    _connection->setActivityHandler([this] {
      while (takeFrame()) {
      }
    });
  }

  SendResult sendRequest(std::int32_t identifier, ByteView data, std::chrono::milliseconds timeout,
                         std::optional<std::chrono::milliseconds> replyTimeout) override {
    if (data.size() > maximumPayload) return {transportError, std::nullopt};
    if (!replyTimeout && hasRoomBehindOthers()) {
      _connection->send({identifier, FrameMark::Message, data});
      return {};
    }
    if (!isValid()) return {isInvalid, std::nullopt};
    const QDeadlineTimer sendDeadline(timeout);
    if (!_connection->waitForRoom(sendDeadline)) return {statusOr(sendTimeout), std::nullopt};
    if (!replyTimeout) {
      _connection->send({identifier, FrameMark::Message, data});
      return {};
    }
    _connection->send({identifier, FrameMark::Request, data});
    ++_awaitedReplies;
    const bool isSent = _connection->waitUntilSent(sendDeadline);
    if (!isSent && _connection->isOpen()) return {sendTimeout, std::nullopt};
    const SendResult result = awaitReply(QDeadlineTimer(*replyTimeout));
    if (result.status != 0 && _monitor) _monitor->commandWentUnanswered();
    return result;
  }

  bool isValid() const override { return _connection && !_connection->peerHasGone(); }
  void invalidate() override { _connection.reset(); }

 private:
  // A message behind others that wait to be sent has their fate. So a stream of messages asks the system
  // neither about the peer nor for the time.
  bool hasRoomBehindOthers() const {
    return _connection && _connection->isOpen() && _connection->hasUnsentBytes() && _connection->hasRoom();
  }

  SendResult awaitReply(const QDeadlineTimer& deadline) {
    do {
      while (const auto frame = takeFrame()) {
        if (!isAnswer(*frame) || _awaitedReplies > 0) continue;
        if (frame->mark == FrameMark::NoReply) return {};
        return {0, Bytes(frame->payload.begin(), frame->payload.end())};
      }
    } while (_connection->waitForArrival(deadline));
    return {statusOr(receiveTimeout), std::nullopt};
  }

  // Replies come in the order of their requests. So the reply that makes the count zero is that of the newest
  // request.
  std::optional<Frame> takeFrame() {
    const auto frame = _connection->nextFrame();
    if (frame && isAnswer(*frame) && _awaitedReplies > 0) --_awaitedReplies;
    return frame;
  }

  static bool isAnswer(const Frame& frame) {
    return frame.mark == FrameMark::Reply || frame.mark == FrameMark::NoReply;
  }

  // Why a wait ended: the time was up, or the connection had ended.
  std::int32_t statusOr(std::int32_t timeoutStatus) const {
    return _connection->isOpen() ? timeoutStatus : becameInvalid;
  }

  std::unique_ptr<SocketConnection> _connection;  // null once the port was invalidated
  LinkMonitor* _monitor;
  std::uint64_t _awaitedReplies = 0;  // requests without an answer so far
};

// The handler gets reports too, and ignores their identifier.
LocalPort::MessageHandler showingReports(LinkMonitor& monitor, LocalPort::MessageHandler handler) {
  return [&monitor, handler = std::move(handler)](std::int32_t identifier, ByteView data) {
    if (identifier == telephonyProtocol::streamReportIdentifier) monitor.takeStreamReport(data);
    return handler(identifier, data);
  };
}

}  // namespace

MessagePorts::LocalPortCreation SocketPorts::createLocalPort(std::string_view name,
                                                             LocalPort::MessageHandler handler) {
  if (_monitor) handler = showingReports(*_monitor, std::move(handler));
  try {
    return {std::make_unique<SocketLocalPort>(_folder, name, std::move(handler)), false};
  } catch (const SocketNameTaken&) {
    if (_monitor) _monitor->portNameIsTaken();
    return {nullptr, true};
  } catch (const std::runtime_error& error) {
    logError("%s", error.what());
    if (_monitor) _monitor->failed(error.what());
    return {};
  }
}

std::unique_ptr<RemotePort> SocketPorts::createRemotePort(std::string_view name) {
  try {
    auto [connection, error] = SocketConnection::open(socketPath(_folder.path, name), _folder.access);
    if (_monitor && connection) _monitor->linkIsOpen();
    if (_monitor && !connection) _monitor->serverIsOutOfReach(error);
    return connection ? std::make_unique<SocketRemotePort>(std::move(connection), _monitor) : nullptr;
  } catch (const std::runtime_error& error) {
    logError("%s", error.what());
    if (_monitor) _monitor->failed(error.what());
    return nullptr;
  }
}

}  // namespace varnel
