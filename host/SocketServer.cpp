#include "host/SocketServer.h"

#include <fcntl.h>
#include <sys/file.h>
#include <unistd.h>

#include <QFile>
#include <cerrno>
#include <system_error>

namespace varnel {

SocketServer::NameLock::NameLock(const std::filesystem::path& socketPath) {
  // The file stays when the lock goes: removing it would let two processes lock two files of one name.
  const std::string path = socketPath.string() + ".lock";
  _file = ::open(path.c_str(), O_RDWR | O_CREAT | O_CLOEXEC | O_NOFOLLOW, 0600);
  if (_file < 0) throw std::system_error(errno, std::generic_category(), "cannot open " + path);
  if (::flock(_file, LOCK_EX | LOCK_NB) == 0) return;
  const int error = errno;
  ::close(_file);
  if (error == EWOULDBLOCK) throw SocketNameTaken("another process serves " + socketPath.string());
  throw std::system_error(error, std::generic_category(), "cannot lock " + path);
}

SocketServer::NameLock::~NameLock() { ::close(_file); }

SocketServer::SocketServer(const std::filesystem::path& path, ConnectionHandler handler)
    : _lock(path), _handler(std::move(handler)) {
  _server.setSocketOptions(QLocalServer::UserAccessOption);
  QObject::connect(&_server, &QLocalServer::newConnection, &_server, [this] { acceptConnections(); });
  // Whatever socket is there now is a dead process's: the lock is ours.
  QLocalServer::removeServer(QFile::decodeName(path.c_str()));
  if (!_server.listen(QFile::decodeName(path.c_str()))) {
    throw std::runtime_error("cannot listen on " + path.string() + ": " +
                             _server.errorString().toStdString());
  }
}

void SocketServer::acceptConnections() noexcept {
  while (QLocalSocket* const socket = _server.nextPendingConnection()) {
    socket->setParent(nullptr);
    auto connection = std::make_unique<SocketConnection>(std::unique_ptr<QLocalSocket>(socket));
    if (connection->hasTrustedPeer()) _handler(std::move(connection));
  }
}

}  // namespace varnel
