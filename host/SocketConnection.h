#pragma once

#include <sys/types.h>
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
#include "host/PortFrame.h"

namespace varnel {

/// Where the socket of that name stands. Throws std::runtime_error for a name that no socket can have: an
/// empty one, one with a slash, one that makes the path longer than socket addresses are.
std::filesystem::path socketPath(const std::filesystem::path& folder, std::string_view name);

/// The address of the socket at a path that `socketPath` has made.
sockaddr_un socketAddress(const std::filesystem::path& path);

/// Whether a process of the one user trusts a peer of the other: of the same user or of root.
constexpr bool isTrusted(uid_t peer, uid_t self) { return peer == self || peer == 0; }

/// How long a frame may take from its first byte to its last.
inline constexpr std::chrono::milliseconds longestFrameTime = std::chrono::seconds(10);

/// One end of a local stream socket that carries frames.
class SocketConnection final {
 public:
  struct Opening {
    std::unique_ptr<SocketConnection> connection;  ///< null when it could not be made
    int error = 0;                                 ///< the system's; EPERM for a peer who is not trusted
  };
  /// Connects to the socket at that path, at once or not at all: a peer whose queue is full is not waited
  /// for.
  static Opening open(const std::filesystem::path& path);

  /// Takes over a socket that is connected, and the place that it has among others until it goes. A frame
  /// that is not whole after that time ends the connection.
  explicit SocketConnection(FileDescriptor socket, std::shared_ptr<const void> place = nullptr,
                            std::chrono::milliseconds frameTime = longestFrameTime);
  SocketConnection(const SocketConnection&) = delete;
  SocketConnection& operator=(const SocketConnection&) = delete;
  /// What can go out without waiting still does.
  ~SocketConnection();

  /// True when the process at the other end is of a user whom this one trusts.
  bool hasTrustedPeer() const;
  /// False once the peer has gone, as far as that has been noticed, or has sent what is no frame. Frames that
  /// came before are still there to be taken.
  bool isOpen() const;
  /// Looks at the socket itself, so that it is true as soon as the peer has gone.
  bool peerHasGone() const;

  /// The event loop calls the handler whenever there may be frames to take or the connection has ended. The
  /// handler may destroy the connection. An exception that leaves it ends the program.
  void setActivityHandler(std::function<void()> handler);
  /// Has the event loop call the activity handler once.
  void wake();

  /// The next frame that has arrived; nothing when there is none. Its payload is good until the next call.
  std::optional<Frame> nextFrame();
  /// Queues a frame; the event loop and every wait send what is queued, as much as possible at a time.
  /// A peer that has left no room is dropped. Nothing happens once the connection has ended.
  void send(const Frame& frame);
  /// True while so little waits to be sent that more may be queued.
  bool hasRoom() const;

  /// The waits serve this socket alone: nothing else happens meanwhile. They return true when what they wait
  /// for has come, false when time is up or the connection has ended.
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
  QTimer _frameTime;        // runs while a frame is not whole
  bool _isOverdue = false;  // true once the frame that is not whole has had its time
  FrameReader _reader;
  std::array<char, 65536> _chunk;
  Bytes _outgoing;  // one frame while it is being queued; kept for its room
  std::function<void()> _activityHandler;
};

}  // namespace varnel
