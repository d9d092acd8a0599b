#include "host/SocketTelephonyService.h"

#include <QDeadlineTimer>
#include <utility>

#include "base/Dictionary.h"
#include "base/Log.h"
#include "base/PropertyList.h"
#include "host/LinkMonitor.h"
#include "host/SocketConnection.h"
#include "host/TelephonyProtocol.h"

namespace varnel {

namespace {

namespace protocol = telephonyProtocol;

std::optional<Bytes> logChannelRequest(std::string_view localPortName) {
  Value request = Value::ofDictionary();
  request.dictionary()->set(protocol::commandKey, protocol::createLogChannel);
  request.dictionary()->set(protocol::portNameKey, localPortName);
  return writeXmlPropertyList(request);
}

TelephonyConnection::LogChannel logChannel(ByteView reply) {
  const auto list = readPropertyList(reply);
  const Dictionary* const answer = list ? list->dictionary() : nullptr;
  const auto error = answer ? answer->get(protocol::errorKey).integer() : std::nullopt;
  if (!error) return {protocol::malformedReply, std::nullopt};
  const std::string* const portName = answer->get(protocol::portNameKey).string();
  return {*error, portName ? std::optional(*portName) : std::nullopt};
}

class SocketTelephonyConnection final : public TelephonyConnection {
 public:
  SocketTelephonyConnection(std::shared_ptr<SocketConnection> connection, std::chrono::milliseconds timeout,
                            LinkMonitor* monitor, std::function<void()> notificationHandler)
      : _connection(std::move(connection)),
        _replyTimeout(timeout),
        _monitor(monitor),
        _notificationHandler(std::make_shared<std::function<void()>>(std::move(notificationHandler))) {
    _connection->setActivityHandler([weak = std::weak_ptr(_connection), handler = _notificationHandler] {
      const auto active = weak.lock();
      while (const auto frame = active->nextFrame()) notify(*frame, *handler);
    });
  }

  LogChannel createLogChannel(std::string_view localPortName) override {
    LinkMonitor* const monitor = _monitor;  // a copy: this object may be destroyed meanwhile
    LogChannel channel = askForLogChannel(localPortName);
    if (channel.error != 0 && monitor) monitor->channelWasRefused(channel.error);
    return channel;
  }

 private:
  LogChannel askForLogChannel(std::string_view localPortName) {
    // A copy: the notification handler may destroy this object.
    const auto connection = _connection;
    const auto handler = _notificationHandler;
    const QDeadlineTimer deadline(_replyTimeout);
    const auto request = logChannelRequest(localPortName);
    if (!request) return {protocol::malformedRequest, std::nullopt};
    connection->sendAtOnce({0, FrameMark::Request, *request});
    do {
      while (const auto frame = connection->nextFrame()) {
        if (frame->mark == FrameMark::Reply) return logChannel(frame->payload);
        notify(*frame, *handler);
      }
    } while (connection->waitForArrival(deadline));
    return {protocol::noReply, std::nullopt};
  }

  static void notify(const Frame& frame, const std::function<void()>& handler) noexcept {
    if (frame.mark == FrameMark::Notification && handler) handler();
  }

  std::shared_ptr<SocketConnection> _connection;
  std::chrono::milliseconds _replyTimeout;
  LinkMonitor* _monitor;
  std::shared_ptr<const std::function<void()>> _notificationHandler;
};

}  // namespace

std::unique_ptr<TelephonyConnection> SocketTelephonyService::connect(
    std::function<void()> notificationHandler) {
  try {
    auto [connection, error] =
        SocketConnection::open(socketPath(_folder.path, protocol::socketName), _folder.access);
    if (!connection) {
      if (_monitor) _monitor->serverIsOutOfReach(error);
      return nullptr;
    }
    return std::make_unique<SocketTelephonyConnection>(std::move(connection), _replyTimeout, _monitor,
                                                       std::move(notificationHandler));
  } catch (const std::runtime_error& error) {
    logError("%s", error.what());
    if (_monitor) _monitor->failed(error.what());
    return nullptr;
  }
}

}  // namespace varnel
