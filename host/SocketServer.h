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
  /// How often the server checks and touches the socket and its lock, so that no program removes them as
  /// leftovers.
  std::chrono::milliseconds lookInterval = std::chrono::minutes(1);
};

/// The file that a name or a descriptor stands for.
struct SocketFile {
  dev_t device = 0;
  ino_t inode = 0;

  bool operator==(const SocketFile&) const = default;
};

/// The listening end of a named local socket. It replaces a socket that a dead process left behind. It
/// refuses peers of other users. When there is no room, it sends the bytes of the refusal and closes the
/// connection. When somebody has removed the socket or the lock, it makes them again.
class SocketServer final {
 public:
  using ConnectionHandler = std::function<void(std::unique_ptr<SocketConnection>)>;

  /// Listens at once; the event loop passes each connection to the handler. Throws SocketNameTaken, and
  /// std::runtime_error when the socket cannot be made for another reason.
  SocketServer(const std::filesystem::path& path, ConnectionHandler handler, const SocketLimits& limits = {},
               Bytes refusal = {});
  SocketServer(const SocketServer&) = delete;
  SocketServer& operator=(const SocketServer&) = delete;
  /// Removes the socket and the lock.
  ~SocketServer();

 private:
  // The right to a name: a lock on a file beside the socket. It ends with the process, however the process
  // ends.
  class NameLock {
   public:
    explicit NameLock(const std::filesystem::path& socketPath);
    NameLock(const NameLock&) = delete;
    NameLock& operator=(const NameLock&) = delete;
    ~NameLock();

    // Touches the file, or makes it again when it has gone. Throws like the constructor.
    void keep();

   private:
    void lock();

    const std::filesystem::path _path;
    const std::filesystem::path _socketPath;
    FileDescriptor _file;
  };

  void listen();
  void keepName() noexcept;
  void acceptConnections() noexcept;
  bool acceptOne();
  void refuseOne();
  void turnAway(const FileDescriptor& socket, const char* reason);
  void waitForDescriptors();

  const std::filesystem::path _path;
  const ConnectionHandler _handler;
  const SocketLimits _limits;
  const Bytes _refusal;
  NameLock _lock;         // held until the socket is removed
  FileDescriptor _spare;  // closed for a moment to refuse a peer when no other descriptor is free
  FileDescriptor _listening;
  std::optional<SocketFile> _socketFile;
  std::unique_ptr<QSocketNotifier> _notifier;
  QTimer _look;
  std::shared_ptr<const int> _places;  // each connection holds one reference more
  QElapsedTimer _sinceRefusalWasTold;
};

}  // namespace varnel
