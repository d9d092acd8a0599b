#pragma once

#include <QLocalServer>
#include <filesystem>
#include <functional>
#include <memory>
#include <stdexcept>
#include <string>

#include "host/SocketConnection.h"

namespace varnel {

/// Why a socket could not be made: a live process has its name.
class SocketNameTaken : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

/// The end of a named local socket that others connect to. A socket that a dead process left behind is taken
/// over; peers of other users are turned away.
class SocketServer final {
 public:
  using ConnectionHandler = std::function<void(std::unique_ptr<SocketConnection>)>;

  /// Listens at once; the event loop hands each connection to the handler. Throws SocketNameTaken, and
  /// std::runtime_error when the socket cannot be made for another reason.
  SocketServer(const std::filesystem::path& path, ConnectionHandler handler);

 private:
  // The right to a name: a lock on a file beside the socket, which ends with the process however that ends.
  class NameLock {
   public:
    explicit NameLock(const std::filesystem::path& socketPath);
    NameLock(const NameLock&) = delete;
    NameLock& operator=(const NameLock&) = delete;
    ~NameLock();

   private:
    int _file;
  };

  void acceptConnections() noexcept;

  NameLock _lock;  // held until the socket is gone
  ConnectionHandler _handler;
  QLocalServer _server;
};

}  // namespace varnel
