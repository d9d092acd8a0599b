#include "host/SocketConnection.h"

#include <poll.h>
#include <sys/socket.h>
#include <sys/un.h>

#include <algorithm>
#include <cerrno>
#include <stdexcept>
#include <string>
#include <utility>

#include "base/Log.h"

namespace varnel {

namespace {

// Leaves room for the final zero and for one more byte.
constexpr std::size_t longestPath = sizeof(sockaddr_un::sun_path) - 2;
// The most bytes that may wait to be taken, and the most that may wait to be sent.
constexpr qint64 readBufferSize = 1 << 20;
constexpr qint64 sendBufferSize = 4 << 20;

}  // namespace

sockaddr_un socketAddress(const std::filesystem::path& path) {
  sockaddr_un address{};
  address.sun_family = AF_UNIX;
  path.native().copy(address.sun_path, sizeof address.sun_path - 1);
  return address;
}

std::filesystem::path socketPath(const std::filesystem::path& folder, std::string_view name) {
  if (name.empty() || name.find('/') != std::string_view::npos || name.find('\0') != std::string_view::npos)
    throw std::runtime_error("\"" + std::string(name) + "\" cannot be the name of a socket");
  std::filesystem::path path = folder / name;
  if (path.native().size() > longestPath) {
    throw std::runtime_error("the socket's path " + path.string() + " is longer than " +
                             std::to_string(longestPath) +
                             " bytes: choose a runtime folder with a shorter one, with --runtime-dir");
  }
  return path;
}

SocketConnection::Opening SocketConnection::open(const std::filesystem::path& path,
                                                 const PeerAccess& access) {
  FileDescriptor socket(::socket(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC | SOCK_NONBLOCK, 0));
  const sockaddr_un address = socketAddress(path);
  if (::connect(socket.number(), reinterpret_cast<const sockaddr*>(&address), sizeof address) != 0)
    return {nullptr, errno};
  const auto peer = peerOf(socket.number());
  if (!peer || !access.accepts(*peer)) return {nullptr, EPERM};
  return {std::make_unique<SocketConnection>(std::move(socket)), 0};
}

SocketConnection::SocketConnection(FileDescriptor socket, std::shared_ptr<const void> place,
                                   std::chrono::milliseconds frameTime)
    : _place(std::move(place)), _socket(std::make_unique<QLocalSocket>()) {
  _socket->setSocketDescriptor(socket.release());
  // Without a limit a flood would fill the memory while its reader is busy.
  _socket->setReadBufferSize(readBufferSize);
  // The call is queued for two reasons: a handler that destroys the socket must not do so inside the socket's
  // own code, and a wait for this socket must not have its frames handled elsewhere.
  const auto handleActivity = [this] { callActivityHandler(); };
  QObject::connect(_socket.get(), &QLocalSocket::readyRead, _socket.get(), handleActivity,
                   Qt::QueuedConnection);
  QObject::connect(_socket.get(), &QLocalSocket::disconnected, _socket.get(), handleActivity,
                   Qt::QueuedConnection);
  _frameTime.setSingleShot(true);
  _frameTime.setInterval(frameTime);
  _frameTime.callOnTimeout(_socket.get(), [this] {
    _isOverdue = true;
    wake();
  });
}

SocketConnection::~SocketConnection() {
  _activityHandler = nullptr;
  while (_socket->flush()) {
  }
}

bool SocketConnection::isOpen() const { return _socket->state() == QLocalSocket::ConnectedState; }

bool SocketConnection::peerHasGone() const {
  if (!isOpen()) return true;
  pollfd socket{static_cast<int>(_socket->socketDescriptor()), POLLRDHUP, 0};
  return ::poll(&socket, 1, 0) > 0;
}

void SocketConnection::setActivityHandler(std::function<void()> handler) {
  _activityHandler = std::move(handler);
}

void SocketConnection::wake() {
  QMetaObject::invokeMethod(
      _socket.get(), [this] { callActivityHandler(); }, Qt::QueuedConnection);
}

void SocketConnection::callActivityHandler() noexcept {
  const auto handler = _activityHandler;  // a copy: the handler may destroy this connection
  if (handler) handler();
}

std::optional<Frame> SocketConnection::nextFrame() {
  while (true) {
    if (const auto frame = _reader.next()) {
      _frameTime.stop();
      _isOverdue = false;
      return frame;
    }
    if (_reader.isFaulty() && isOpen()) {
      logWarning("A peer has sent what is no frame: the connection ends");
      _socket->abort();
    }
    if (!isOpen() && _socket->bytesAvailable() == 0) return std::nullopt;
    if (feedReader()) continue;
    // What came while this program was held up still counts.
    if (_isOverdue && _socket->waitForReadyRead(0)) continue;
    watchFrameTime();
    return std::nullopt;
  }
}

bool SocketConnection::feedReader() {
  const qint64 count = _socket->read(_chunk.data(), static_cast<qint64>(_chunk.size()));
  if (count <= 0) return false;
  _reader.feed({reinterpret_cast<const std::uint8_t*>(_chunk.data()), static_cast<std::size_t>(count)});
  return true;
}

void SocketConnection::watchFrameTime() {
  if (!_reader.hasUnfinishedFrame()) return;
  if (_isOverdue) {
    logWarning("A peer's frame was not whole in time: the connection ends");
    _socket->abort();
  } else if (!_frameTime.isActive()) {
    _frameTime.start();
  }
}

void SocketConnection::send(const Frame& frame) {
  if (!isOpen()) return;
  if (!hasRoom()) {
    logWarning("A peer does not read what it is sent: the connection ends");
    return _socket->abort();
  }
  _outgoing.clear();
  appendFrame(_outgoing, frame);
  _socket->write(reinterpret_cast<const char*>(_outgoing.data()), static_cast<qint64>(_outgoing.size()));
}

void SocketConnection::sendAtOnce(const Frame& frame) {
  if (!isOpen()) return;
  _outgoing.clear();
  appendFrame(_outgoing, frame);
  const ssize_t sent = ::send(static_cast<int>(_socket->socketDescriptor()), _outgoing.data(),
                              _outgoing.size(), MSG_NOSIGNAL | MSG_DONTWAIT);
  // What the peer has left can still be read. A failed write of the toolkit's would discard it.
  if (sent < 0 && (errno == EPIPE || errno == ECONNRESET)) return;
  const auto begin = static_cast<std::size_t>(std::max<ssize_t>(sent, 0));
  _socket->write(reinterpret_cast<const char*>(_outgoing.data() + begin),
                 static_cast<qint64>(_outgoing.size() - begin));
}

bool SocketConnection::hasRoom() const { return _socket->bytesToWrite() < sendBufferSize; }

bool SocketConnection::hasUnsentBytes() const { return _socket->bytesToWrite() > 0; }

bool SocketConnection::waitForRoom(const QDeadlineTimer& deadline) {
  return waitUntilUnsent(sendBufferSize - 1, deadline);
}

bool SocketConnection::waitUntilSent(const QDeadlineTimer& deadline) { return waitUntilUnsent(0, deadline); }

bool SocketConnection::waitUntilUnsent(qint64 limit, const QDeadlineTimer& deadline) {
  while (isOpen() && _socket->bytesToWrite() > limit) {
    if (deadline.hasExpired()) return false;
    _socket->waitForBytesWritten(static_cast<int>(deadline.remainingTime()));
  }
  return isOpen();
}

bool SocketConnection::waitForArrival(const QDeadlineTimer& deadline) {
  if (!isOpen() || deadline.hasExpired()) return false;
  return _socket->waitForReadyRead(static_cast<int>(deadline.remainingTime()));
}

}  // namespace varnel
