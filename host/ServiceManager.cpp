#include "host/ServiceManager.h"

#include <sys/socket.h>
#include <sys/time.h>
#include <sys/un.h>

#include <cerrno>
#include <cstddef>
#include <cstdlib>
#include <system_error>

#include "base/Log.h"
#include "host/FileDescriptor.h"

namespace varnel {

namespace {

// A service manager that takes no datagrams must not hold the program up for longer.
constexpr timeval longestWait{5, 0};

// True when the name is that of a file, or, with "@", of an abstract socket, and an address has room for it.
bool isSocketName(std::string_view name) {
  return name.size() > 1 && (name[0] == '/' || name[0] == '@') && name.size() < sizeof(sockaddr_un::sun_path);
}

bool send(std::string_view name, std::string_view state) {
  sockaddr_un address{};
  address.sun_family = AF_UNIX;
  name.copy(address.sun_path, sizeof address.sun_path - 1);
  // The name of an abstract socket begins with a zero and ends with its last byte.
  if (name[0] == '@') address.sun_path[0] = '\0';
  const auto size = static_cast<socklen_t>(offsetof(sockaddr_un, sun_path) + name.size());
  const FileDescriptor socket(::socket(AF_UNIX, SOCK_DGRAM | SOCK_CLOEXEC, 0));
  ::setsockopt(socket.number(), SOL_SOCKET, SO_SNDTIMEO, &longestWait, sizeof longestWait);
  return ::sendto(socket.number(), state.data(), state.size(), MSG_NOSIGNAL,
                  reinterpret_cast<const sockaddr*>(&address), size) == static_cast<ssize_t>(state.size());
}

}  // namespace

void tellServiceManager(std::string_view state) {
  const char* const name = std::getenv("NOTIFY_SOCKET");
  if (!name || !*name) return;
  if (!isSocketName(name)) {
    logWarning("NOTIFY_SOCKET names no local socket: the service manager is not told \"%s\"", state);
  } else if (!send(name, state)) {
    logWarning("The service manager cannot be told \"%s\": %s", state,
               std::generic_category().message(errno));
  }
}

}  // namespace varnel
