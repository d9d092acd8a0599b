#include "host/ServerControl.h"

#include <QDeadlineTimer>
#include <cerrno>
#include <stdexcept>
#include <system_error>

#include "host/SocketConnection.h"

namespace varnel {

namespace {

std::string whyOutOfReach(const std::filesystem::path& folder, int error) {
  const std::string place = " in " + folder.string();
  switch (error) {
    case ENOENT:
    case ECONNREFUSED:
      return "no telephony server serves" + place +
             "; start varnel-telephonyd, or name its folder with --runtime-dir";
    case EACCES:
    case EPERM:
      return "the telephony server" + place + " belongs to another user, who alone may control it";
    default:
      return "the telephony server" + place + " cannot be reached: " + std::generic_category().message(error);
  }
}

// The reply's bytes; empty when there is none in time.
Bytes replyFrom(SocketConnection& connection, const QDeadlineTimer& deadline) {
  do {
    while (const auto frame = connection.nextFrame())
      if (frame->mark == FrameMark::Reply) return Bytes(frame->payload.begin(), frame->payload.end());
  } while (connection.waitForArrival(deadline));
  return {};
}

}  // namespace

bool ServerControl::isThere() const {
  const auto [connection, error] =
      SocketConnection::open(socketPath(_folder.path, controlProtocol::socketName), _folder.access);
  return connection || (error != ENOENT && error != ECONNREFUSED);
}

ServerStatus ServerControl::ask(const ControlRequest& request) const {
  const QDeadlineTimer deadline(_replyTimeout);
  const auto [connection, error] =
      SocketConnection::open(socketPath(_folder.path, controlProtocol::socketName), _folder.access);
  if (!connection) throw std::runtime_error(whyOutOfReach(_folder.path, error));
  connection->send({0, FrameMark::Request, controlProtocol::writeRequest(request)});
  const Bytes bytes = replyFrom(*connection, deadline);
  const std::string server = "the telephony server in " + _folder.path.string();
  if (bytes.empty()) throw std::runtime_error(server + " does not answer; end it and start it again");
  const auto reply = controlProtocol::readReply(bytes);
  if (!reply) throw std::runtime_error(server + " cannot be understood; use programs of one version");
  if (const auto* const refusal = std::get_if<ControlRefusal>(&*reply))
    throw std::runtime_error(refusal->sentence);
  return std::get<ServerStatus>(*reply);
}

RuntimeFolder nearestControl(RuntimeFolder own, const std::filesystem::path& system) {
  if (ServerControl(own).isThere()) return own;
  const auto shared = sharedFolder(system);
  return shared && ServerControl(*shared).isThere() ? *shared : own;
}

}  // namespace varnel
