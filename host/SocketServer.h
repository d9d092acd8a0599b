#pragma once

#include <sys/stat.h>

#include <QElapsedTimer>
#include <QSocketNotifier>
#include <QTimer>
#include <chrono>
#include <cstddef>
#include <filesystem>
#include <functional>
#include <memory>
#include <optional>
#include <stdexcept>
#include <string>

#include "host/FileDescriptor.h"
#include "host/SocketConnection.h"

namespace varnel {

/// A socket could not be made because a live process has its name.
class SocketNameTaken : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

/// The limits for the peers of a named socket.
struct SocketLimits {
  std::size_t connections = 64;  ///< open at the same time
  std::chrono::milliseconds frameTime = longestFrameTime;
  /// How long a client of the telephony service may stay when others find no room. A viewer needs a moment.
  std::chrono::milliseconds stay = std::chrono::seconds(2);
  /// How often the server checks and touches the socket and its lock, so that no program removes them as
  /// leftovers.
  std::chrono::milliseconds lookInterval = std::chrono::minutes(1);
};

/// Who may connect to a named socket.
struct SocketGate {
  PeerAccess access = PeerAccess();  ///< of the folder: members of its group may open the files
  /// Whether the name is this user's alone, in a folder of this user's. What other users have put there, is
  /// cleared away, but not what root has put there; and no other user may open the lock.
  bool ownsName = false;
  /// Whether a peer gets in. Empty: if the access accepts it.
  std::function<bool(const Peer&)> accepts = {};
  Bytes refusalOfStranger = {};  ///< what a peer gets that may not connect
  Bytes refusalWhenFull = {};    ///< what a peer gets that finds no room
  /// Called when there is no room; ends a connection if it can. Empty: none is ended.
  std::function<void()> makeRoom = {};
};

/// The file that a name or a descriptor stands for.
struct SocketFile {
  dev_t device = 0;
  ino_t inode = 0;

  bool operator==(const SocketFile&) const = default;
};

/// The listening end of a named local socket. It replaces a socket that a dead process left behind. When a
/// peer may not connect, or when there is no room, it sends the bytes of the refusal and closes the
/// connection; a log line says so, at most every ten seconds. When somebody has removed the socket or the
/// lock, it makes them again.
class SocketServer final {
 public:
  using ConnectionHandler = std::function<void(std::unique_ptr<SocketConnection>)>;

  /// Listens at once; the event loop passes each connection to the handler. Throws SocketNameTaken, and
  /// std::runtime_error when the socket cannot be made for another reason.
  SocketServer(const std::filesystem::path& path, ConnectionHandler handler, const SocketLimits& limits = {},
               SocketGate gate = {});
  SocketServer(const SocketServer&) = delete;
  SocketServer& operator=(const SocketServer&) = delete;
  /// Removes the socket and the lock.
  ~SocketServer();

 private:
  // The right to a name: a lock on a file beside the socket. It ends with the process, however the process
  // ends.
  class NameLock {
   public:
    NameLock(const std::filesystem::path& socketPath, const SocketGate& gate);
    NameLock(const NameLock&) = delete;
    NameLock& operator=(const NameLock&) = delete;
    ~NameLock();

    // Touches the file, or makes it again when it has gone. Throws like the constructor.
    void keep();

   private:
    void lock();
    FileDescriptor openOrMake() const;

    const std::filesystem::path _path;
    const std::filesystem::path _socketPath;
    const mode_t _mode;
    const bool _ownsName;
    FileDescriptor _file;
  };

  void listen();
  void keepName() noexcept;
  void acceptConnections() noexcept;
  bool acceptOne();
  bool admits(const FileDescriptor& socket);
  bool hasRoom() const;
  void refuseOne();
  // Limits how often one kind of refusal is logged.
  class Telling {
   public:
    bool isDue();

   private:
    QElapsedTimer _since;
  };
  void turnAway(const FileDescriptor& socket, const Bytes& refusal, Telling& telling,
                const std::string& reason);
  void waitForDescriptors();

  const std::filesystem::path _path;
  const ConnectionHandler _handler;
  const SocketLimits _limits;
  const SocketGate _gate;
  NameLock _lock;         // held until the socket is removed
  FileDescriptor _spare;  // closed for a moment to refuse a peer when no other descriptor is free
  FileDescriptor _listening;
  std::optional<SocketFile> _socketFile;
  std::unique_ptr<QSocketNotifier> _notifier;
  QTimer _look;
  std::shared_ptr<const int> _places;  // each connection holds one reference more
  Telling _tellingOfStrangers;
  Telling _tellingOfNoRoom;
};

/// Removes the sockets and locks of dead processes from a shared folder. Only the folder's owner can remove
/// those of other users.
void removeLeftovers(const std::filesystem::path& folder);

}  // namespace varnel
