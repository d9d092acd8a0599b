#include "host/ControlClient.h"

#include <stdexcept>
#include <vector>

namespace varnel {

void ControlClient::ask(const ControlRequest& request, Reply reply) {
  const bool isSent = connect();
  _waiting.push_back({std::move(reply), isSent});
  if (isSent) return _connection->send({0, FrameMark::Request, controlProtocol::writeRequest(request)});
  QMetaObject::invokeMethod(
      &_context, [this] { _connection ? takeReplies() : giveUpUnsent(); }, Qt::QueuedConnection);
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
  giveUpUnsent();
  while (const auto frame = _connection->nextFrame()) {
    if (frame->mark != FrameMark::Reply || _waiting.empty() || !_waiting.front().isSent) continue;
    const Reply take = std::move(_waiting.front().take);
    _waiting.pop_front();
    take(controlProtocol::readReply(frame->payload));
  }
  if (!_connection->isOpen()) giveUp();
}

// A later request may have found the server, so the connection stays.
void ControlClient::giveUpUnsent() {
  std::vector<Reply> unsent;
  for (; !_waiting.empty() && !_waiting.front().isSent; _waiting.pop_front())
    unsent.push_back(std::move(_waiting.front().take));
  for (const Reply& take : unsent) take(std::nullopt);
}

void ControlClient::giveUp() {
  _connection.reset();
  for (const Waiting& waiting : std::exchange(_waiting, {})) waiting.take(std::nullopt);
}

}  // namespace varnel
