#pragma once

#include <gtest/gtest.h>
#include <poll.h>
#include <sys/socket.h>
#include <sys/un.h>
#include <unistd.h>

#include <chrono>
#include <cstddef>
#include <cstring>
#include <string>

#include "base/Bytes.h"

namespace varnel {

/// A local socket that sends exactly the bytes of the test.
class RawSocket {
 public:
  /// Connects to the socket at the path.
  static RawSocket connectedTo(const std::string& path) {
    RawSocket socket(::socket(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0));
    const sockaddr_un address = addressOf(path);
    if (::connect(socket._descriptor, reinterpret_cast<const sockaddr*>(&address), sizeof address) != 0)
      ADD_FAILURE() << "cannot connect to " << path << ": " << std::strerror(errno);
    return socket;
  }
  /// Listens at the path. `accept` takes the connections.
  static RawSocket listeningAt(const std::string& path) { return boundTo(path, SOCK_STREAM); }
  /// Receives datagrams at the path, as many as the kernel keeps.
  static RawSocket receivingAt(const std::string& path) { return boundTo(path, SOCK_DGRAM); }

  RawSocket(RawSocket&& other) noexcept : _descriptor(std::exchange(other._descriptor, -1)) {}
  RawSocket& operator=(RawSocket&& other) noexcept {
    std::swap(_descriptor, other._descriptor);
    return *this;
  }
  ~RawSocket() { close(); }

  RawSocket accept() const { return RawSocket(::accept4(_descriptor, nullptr, nullptr, SOCK_CLOEXEC)); }
  void close() {
    if (_descriptor >= 0) ::close(std::exchange(_descriptor, -1));
  }

  bool send(ByteView bytes) const {
    while (!bytes.empty()) {
      const ssize_t sent = ::send(_descriptor, bytes.data(), bytes.size(), MSG_NOSIGNAL);
      if (sent < 0) return false;
      bytes = bytes.subspan(static_cast<std::size_t>(sent));
    }
    return true;
  }
  /// Sends the bytes if the peer takes them at once; false when it does not take all of them.
  bool sendNow(ByteView bytes) const {
    return ::send(_descriptor, bytes.data(), bytes.size(), MSG_NOSIGNAL | MSG_DONTWAIT) ==
           static_cast<ssize_t>(bytes.size());
  }
  /// The next bytes that arrive within the time; empty when none arrive, or when the peer has gone.
  Bytes receive(std::chrono::milliseconds within = std::chrono::seconds(60)) const {
    Bytes bytes(65536);
    const ssize_t count = waits(within) ? ::recv(_descriptor, bytes.data(), bytes.size(), 0) : ssize_t{0};
    bytes.resize(count > 0 ? static_cast<std::size_t>(count) : 0);
    return bytes;
  }
  /// True when there is something to receive within the time, including the end of the peer.
  bool waits(std::chrono::milliseconds within) const {
    pollfd socket{_descriptor, POLLIN, 0};
    return ::poll(&socket, 1, static_cast<int>(within.count())) > 0;
  }

 private:
  explicit RawSocket(int descriptor) : _descriptor(descriptor) {}

  static RawSocket boundTo(const std::string& path, int type) {
    RawSocket socket(::socket(AF_UNIX, type | SOCK_CLOEXEC, 0));
    const sockaddr_un address = addressOf(path);
    if (::bind(socket._descriptor, reinterpret_cast<const sockaddr*>(&address), sizeOf(path)) != 0)
      ADD_FAILURE() << "cannot bind to " << path << ": " << std::strerror(errno);
    if (type == SOCK_STREAM) ::listen(socket._descriptor, 10);
    return socket;
  }

  // The name of an abstract socket, which begins with a zero, ends with its last byte.
  static socklen_t sizeOf(const std::string& path) {
    const bool isAbstract = path.starts_with('\0');
    return static_cast<socklen_t>(isAbstract ? offsetof(sockaddr_un, sun_path) + path.size()
                                             : sizeof(sockaddr_un));
  }

  static sockaddr_un addressOf(const std::string& path) {
    sockaddr_un address{};
    address.sun_family = AF_UNIX;
    path.copy(address.sun_path, sizeof address.sun_path - 1);
    return address;
  }

  int _descriptor;
};

}  // namespace varnel
