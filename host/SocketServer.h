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

/// Why a socket could not be made: a live process has its name.
class SocketNameTaken : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

/// What a named socket allows its peers.
struct SocketLimits {
  std::size_t connections = 64;  ///< open at a time
  std::chrono::milliseconds frameTime = longestFrameTime;
  /// How often the socket and its lock are looked at and kept fresh, so that no cleaner takes them for
  /// leftovers.
  std::chrono::milliseconds lookInterval = std::chrono::minutes(1);
};

/// Which file a name or a descriptor stands for.
struct SocketFile {
  dev_t device = 0;
  ino_t inode = 0;

  bool operator==(const SocketFile&) const = default;
};

/// The end of a named local socket that others connect to. A socket that a dead process left behind is taken
/// over. Peers of other users are turned away, and so is whoever comes when there is no room, after the bytes
/// of the refusal. Socket and lock are made anew when somebody has removed them.
class SocketServer final {
 public:
  using ConnectionHandler = std::function<void(std::unique_ptr<SocketConnection>)>;

  /// Listens at once; the event loop hands each connection to the handler. Throws SocketNameTaken, and
  /// std::runtime_error when the socket cannot be made for another reason.
  SocketServer(const std::filesystem::path& path, ConnectionHandler handler, const SocketLimits& limits = {},
               Bytes refusal = {});
  SocketServer(const SocketServer&) = delete;
  SocketServer& operator=(const SocketServer&) = delete;
  /// Takes socket and lock away.
  ~SocketServer();

 private:
  // The right to a name: a lock on a file beside the socket, which ends with the process however that ends.
  class NameLock {
   public:
    explicit NameLock(const std::filesystem::path& socketPath);
    NameLock(const NameLock&) = delete;
    NameLock& operator=(const NameLock&) = delete;
    ~NameLock();

    // Makes the file fresh, or anew when it has gone. Throws as the constructor does.
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
  NameLock _lock;         // held until the socket is gone
  FileDescriptor _spare;  // given up for a moment to turn somebody away when there are no others
  FileDescriptor _listening;
  std::optional<SocketFile> _socketFile;
  std::unique_ptr<QSocketNotifier> _notifier;
  QTimer _look;
  std::shared_ptr<const int> _places;  // each connection holds one more reference
  QElapsedTimer _sinceRefusalWasTold;
};

}  // namespace varnel
