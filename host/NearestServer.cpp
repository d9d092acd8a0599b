#include "host/NearestServer.h"

#include <cerrno>
#include <utility>

#include "host/LinkMonitor.h"
#include "host/SocketConnection.h"
#include "host/TelephonyProtocol.h"

namespace varnel {

namespace {

bool hasServer(const RuntimeFolder& folder) {
  try {
    const auto [connection, error] =
        SocketConnection::open(socketPath(folder.path, telephonyProtocol::socketName), folder.access);
    return connection || error == EAGAIN;
  } catch (const std::runtime_error&) {  // the path is too long for a socket
    return false;
  }
}

// Why the viewer cannot use the folder; empty when it can, or when the folder is not there.
std::string obstacleOf(const std::filesystem::path& folder) {
  const auto group = groupThatIsMissing(folder);
  return group ? "the one in " + folder.string() + " serves members of the group " + *group : std::string();
}

}  // namespace

NearestServer::NearestServer(RuntimeFolder own, std::optional<std::filesystem::path> system,
                             LinkMonitor& monitor, std::chrono::milliseconds replyTimeout)
    : _own(std::move(own)), _system(std::move(system)), _monitor(monitor), _replyTimeout(replyTimeout) {
  use(_own, {});
}

void NearestServer::use(const RuntimeFolder& folder, std::string obstacle) {
  _monitor.looksInto(folder.path, std::move(obstacle));
  _link.emplace(folder, _replyTimeout, _monitor);
}

void NearestServer::moveTo(RuntimeFolder own, std::optional<std::filesystem::path> system) {
  _own = std::move(own);
  _system = std::move(system);
  _hasMoved = true;
  _monitor.displayIsGone();
}

void NearestServer::look() {
  const bool hasMoved = std::exchange(_hasMoved, false);
  if (!_system) {
    if (hasMoved) use(_own, {});
    return;
  }
  if (hasServer(_own)) return use(_own, {});
  const auto shared = sharedFolder(*_system);
  if (shared && hasServer(*shared)) return use(*shared, {});
  use(_own, shared ? obstacleOf(*_system) : std::string());
}

MessagePorts::LocalPortCreation NearestServer::createLocalPort(std::string_view name,
                                                               LocalPort::MessageHandler handler) {
  look();
  return _link->ports.createLocalPort(name, std::move(handler));
}

std::unique_ptr<RemotePort> NearestServer::createRemotePort(std::string_view name) {
  return _link->ports.createRemotePort(name);
}

std::unique_ptr<TelephonyConnection> NearestServer::connect(std::function<void()> notificationHandler) {
  return _link->service.connect(std::move(notificationHandler));
}

}  // namespace varnel
