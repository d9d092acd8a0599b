#include "host/ControlClient.h"

#include <stdexcept>

namespace varnel {

void ControlClient::ask(const ControlRequest& request, Reply reply) {
  _waiting.push_back(std::move(reply));
  if (connect()) {
    _connection->send({0, FrameMark::Request, controlProtocol::writeRequest(request)});
  } else {
    QMetaObject::invokeMethod(
        &_context, [this] { giveUp(); }, Qt::QueuedConnection);
  }
}

bool ControlClient::connect() {
  if (_connection) return _connection->isOpen();
  try {
    _connection =
        SocketConnection::open(socketPath(_folder.path, controlProtocol::socketName), _folder.access)
            .connection;
  } catch (const std::runtime_error&) {  // the path is too long for a socket
    return false;
  }
  if (!_connection) return false;
  _connection->setActivityHandler([this] { takeReplies(); });
  return true;
}

void ControlClient::takeReplies() {
  while (const auto frame = _connection->nextFrame()) {
    if (frame->mark != FrameMark::Reply || _waiting.empty()) continue;
    const Reply take = std::move(_waiting.front());
    _waiting.pop_front();
    take(controlProtocol::readReply(frame->payload));
  }
  if (!_connection->isOpen()) giveUp();
}

void ControlClient::giveUp() {
  _connection.reset();
  for (const Reply& take : std::exchange(_waiting, {})) take(std::nullopt);
}

}  // namespace varnel
