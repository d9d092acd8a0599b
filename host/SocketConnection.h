#pragma once

#include <sys/un.h>

#include <QDeadlineTimer>
#include <QLocalSocket>
#include <QTimer>
#include <array>
#include <chrono>
#include <filesystem>
#include <functional>
#include <memory>
#include <optional>
#include <string_view>

#include "host/FileDescriptor.h"
#include "host/PeerAccess.h"
#include "host/PortFrame.h"

namespace varnel {

/// The path of the socket with this name. Throws std::runtime_error for a name that no socket can have: an
/// empty name, a name with a slash, or a name that makes the path longer than a socket address can be.
std::filesystem::path socketPath(const std::filesystem::path& folder, std::string_view name);

/// The address of a socket whose path `socketPath` has made.
sockaddr_un socketAddress(const std::filesystem::path& path);

/// The longest time that a frame may take from its first byte to its last.
inline constexpr std::chrono::milliseconds longestFrameTime = std::chrono::seconds(10);

/// One end of a local stream socket that carries frames.
class SocketConnection final {
 public:
  struct Opening {
    std::unique_ptr<SocketConnection> connection;  ///< null when it could not be made
    int error = 0;                                 ///< the system's; EPERM for an untrusted peer
  };
  /// Connects to the socket at this path, at once or not at all: it does not wait for a peer whose queue is
  /// full. The peer is the user who listens there.
  static Opening open(const std::filesystem::path& path, const PeerAccess& access = PeerAccess());

  /// Takes over a connected socket. It holds its place among the server's connections until it is destroyed.
  /// A frame that is not complete after `frameTime` ends the connection.
  explicit SocketConnection(FileDescriptor socket, std::shared_ptr<const void> place = nullptr,
                            std::chrono::milliseconds frameTime = longestFrameTime);
  SocketConnection(const SocketConnection&) = delete;
  SocketConnection& operator=(const SocketConnection&) = delete;
  /// Sends what can be sent without waiting.
  ~SocketConnection();

  /// False once the peer is known to have gone, or has sent what is no frame. Frames that came before can
  /// still be taken.
  bool isOpen() const;
  /// Checks the socket itself, so it is true as soon as the peer has gone.
  bool peerHasGone() const;

  /// The event loop calls the handler whenever there may be frames to take, or when the connection has ended.
  /// The handler may destroy the connection. An exception that leaves it ends the program.
  void setActivityHandler(std::function<void()> handler);
  /// Makes the event loop call the activity handler once.
  void wake();

  /// The next frame that has arrived; nothing when there is none. The payload is valid until the next call.
  std::optional<Frame> nextFrame();
  /// Queues a frame. The event loop and every wait send what is queued, as much as possible at a time. A peer
  /// that leaves no room is dropped. Does nothing once the connection has ended.
  void send(const Frame& frame);
  /// Sends a frame at once; no other may be queued. If the peer has gone, what it has left can still be read,
  /// which `send` may lose.
  void sendAtOnce(const Frame& frame);
  /// True while so little waits to be sent that the caller may queue more.
  bool hasRoom() const;
  /// True while something that was queued is not sent yet.
  bool hasUnsentBytes() const;

  /// The waits serve this socket only: nothing else happens meanwhile. They return true when what they wait
  /// for has come, and false when the time is up or the connection has ended.
  bool waitForRoom(const QDeadlineTimer& deadline);
  bool waitUntilSent(const QDeadlineTimer& deadline);
  bool waitForArrival(const QDeadlineTimer& deadline);

 private:
  bool waitUntilUnsent(qint64 limit, const QDeadlineTimer& deadline);
  void callActivityHandler() noexcept;
  bool feedReader();
  void watchFrameTime();

  std::shared_ptr<const void> _place;
  std::unique_ptr<QLocalSocket> _socket;
  QTimer _frameTime;        // runs while a frame is incomplete
  bool _isOverdue = false;  // true once an incomplete frame has used up its time
  FrameReader _reader;
  std::array<char, 65536> _chunk;
  Bytes _outgoing;  // one frame while it is being queued; kept to reuse its memory
  std::function<void()> _activityHandler;
};

}  // namespace varnel
