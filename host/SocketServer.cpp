#include "host/SocketServer.h"

#include <fcntl.h>
#include <sys/file.h>
#include <sys/socket.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <system_error>
#include <utility>

#include "base/Log.h"

namespace varnel {

namespace {

namespace fs = std::filesystem;
using namespace std::chrono_literals;

constexpr int connectionQueue = 128;
// After this many the server lets the rest of the program run.
constexpr int connectionsAtATime = 64;
constexpr std::chrono::milliseconds refusalLineInterval = 10s;
constexpr std::chrono::milliseconds descriptorWait = 100ms;

SocketFile identityOf(const struct stat& status) { return {status.st_dev, status.st_ino}; }

std::optional<SocketFile> fileUnder(const fs::path& path) {
  struct stat status {};
  return ::lstat(path.c_str(), &status) == 0 ? std::optional(identityOf(status)) : std::nullopt;
}

std::optional<SocketFile> fileOf(const FileDescriptor& file) {
  struct stat status {};
  return ::fstat(file.number(), &status) == 0 ? std::optional(identityOf(status)) : std::nullopt;
}

[[noreturn]] void fail(const std::string& what, int error) {
  throw std::system_error(error, std::generic_category(), what);
}

[[noreturn]] void nameIsTaken(const fs::path& path) {
  throw SocketNameTaken("another process serves " + path.string());
}

FileDescriptor localSocket() {
  return FileDescriptor(::socket(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC | SOCK_NONBLOCK, 0));
}

// Whether a process listens there, of any user, even when it is busy.
bool isServed(const fs::path& path) {
  const FileDescriptor socket = localSocket();
  const sockaddr_un address = socketAddress(path);
  return ::connect(socket.number(), reinterpret_cast<const sockaddr*>(&address), sizeof address) == 0 ||
         errno == EAGAIN;
}

FileDescriptor spareDescriptor() { return FileDescriptor(::open("/dev/null", O_RDONLY | O_CLOEXEC)); }

}  // namespace

SocketServer::NameLock::NameLock(const fs::path& socketPath)
    : _path(socketPath.string() + ".lock"), _socketPath(socketPath) {
  lock();
}

void SocketServer::NameLock::lock() {
  // The owner removes the file when it ends. So the file that was opened can differ from the file that is
  // there once the lock is held.
  while (true) {
    FileDescriptor file(::open(_path.c_str(), O_RDWR | O_CREAT | O_CLOEXEC | O_NOFOLLOW, 0600));
    if (!file.isOpen()) fail("cannot open " + _path.string(), errno);
    if (::flock(file.number(), LOCK_EX | LOCK_NB) != 0) {
      if (errno == EWOULDBLOCK) nameIsTaken(_socketPath);
      fail("cannot lock " + _path.string(), errno);
    }
    if (fileOf(file) != fileUnder(_path)) continue;
    _file = std::move(file);
    return;
  }
}

void SocketServer::NameLock::keep() {
  if (fileOf(_file) == fileUnder(_path)) {
    ::futimens(_file.number(), nullptr);
  } else {
    lock();
  }
}

SocketServer::NameLock::~NameLock() {
  if (fileOf(_file) == fileUnder(_path)) ::unlink(_path.c_str());
}

SocketServer::SocketServer(const fs::path& path, ConnectionHandler handler, const SocketLimits& limits,
                           Bytes refusal)
    : _path(path),
      _handler(std::move(handler)),
      _limits(limits),
      _refusal(std::move(refusal)),
      _lock(path),
      _spare(spareDescriptor()),
      _places(std::make_shared<const int>(0)) {
  // A program that cleans up may have removed a live server's lock file.
  if (isServed(path)) nameIsTaken(path);
  listen();
  _look.callOnTimeout([this] { keepName(); });
  _look.start(limits.lookInterval);
}

SocketServer::~SocketServer() {
  if (_socketFile && _socketFile == fileUnder(_path)) ::unlink(_path.c_str());
}

void SocketServer::listen() {
  // The lock is ours, so whatever is there now belongs to a dead process.
  ::unlink(_path.c_str());
  FileDescriptor socket = localSocket();
  const sockaddr_un address = socketAddress(_path);
  // The socket's file gets the socket's mode without the umask, so no other user ever sees it open.
  if (!socket.isOpen() || ::fchmod(socket.number(), 0600) != 0 ||
      ::bind(socket.number(), reinterpret_cast<const sockaddr*>(&address), sizeof address) != 0 ||
      ::listen(socket.number(), connectionQueue) != 0)
    fail("cannot listen on " + _path.string(), errno);
  _socketFile = fileUnder(_path);
  _notifier = std::make_unique<QSocketNotifier>(socket.number(), QSocketNotifier::Read);
  QObject::connect(_notifier.get(), &QSocketNotifier::activated, _notifier.get(),
                   [this] { acceptConnections(); });
  _listening = std::move(socket);
}

void SocketServer::keepName() noexcept {
  try {
    _lock.keep();
    if (fileUnder(_path) == _socketFile) {
      ::utimensat(AT_FDCWD, _path.c_str(), nullptr, AT_SYMLINK_NOFOLLOW);
      return;
    }
    logWarning("Somebody has removed the socket %s: it is made anew", _path.string());
    if (isServed(_path)) nameIsTaken(_path);
    listen();
  } catch (const std::runtime_error& error) {
    logError("The socket %s cannot be kept: %s", _path.string(), error.what());
  }
}

void SocketServer::acceptConnections() noexcept {
  for (int count = 0; count < connectionsAtATime; ++count) {
    if (!acceptOne()) return;
  }
}

// False when no connection is waiting, or when there is no descriptor for it.
bool SocketServer::acceptOne() {
  FileDescriptor socket(::accept4(_listening.number(), nullptr, nullptr, SOCK_CLOEXEC | SOCK_NONBLOCK));
  if (!socket.isOpen()) {
    if (errno == ECONNABORTED || errno == EINTR) return true;
    if (errno == EMFILE || errno == ENFILE) refuseOne();
    return false;
  }
  const auto open = static_cast<std::size_t>(_places.use_count() - 1);
  if (open >= _limits.connections) {
    turnAway(socket, "as many are open as there may be");
    return true;
  }
  auto connection = std::make_unique<SocketConnection>(std::move(socket), _places, _limits.frameTime);
  if (connection->hasTrustedPeer()) _handler(std::move(connection));
  return true;
}

// There is no descriptor left. Accepts and refuses the next connection with the spare one; otherwise it would
// wake this program again and again.
void SocketServer::refuseOne() {
  _spare = FileDescriptor();
  FileDescriptor socket(::accept4(_listening.number(), nullptr, nullptr, SOCK_CLOEXEC | SOCK_NONBLOCK));
  if (socket.isOpen()) turnAway(socket, "this program may open no more files");
  const bool wasAccepted = socket.isOpen();
  socket = FileDescriptor();
  _spare = spareDescriptor();
  if (!wasAccepted || !_spare.isOpen()) waitForDescriptors();
}

void SocketServer::turnAway(const FileDescriptor& socket, const char* reason) {
  // A peer that cannot take the refusal learns it from the end of the connection.
  static_cast<void>(::send(socket.number(), _refusal.data(), _refusal.size(), MSG_NOSIGNAL));
  if (_sinceRefusalWasTold.isValid() && !_sinceRefusalWasTold.hasExpired(refusalLineInterval.count())) return;
  _sinceRefusalWasTold.start();
  logWarning("Connections to %s are refused: %s", _path.string(), reason);
}

void SocketServer::waitForDescriptors() {
  _notifier->setEnabled(false);
  QTimer::singleShot(descriptorWait, _notifier.get(), [this] {
    if (!_spare.isOpen()) _spare = spareDescriptor();
    _notifier->setEnabled(true);
  });
}

}  // namespace varnel
