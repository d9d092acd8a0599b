#include "widgets/Display.h"

#include <netdb.h>
#include <sys/socket.h>
#include <sys/un.h>
#include <unistd.h>

#include <QDir>
#include <QLibraryInfo>
#include <cstddef>
#include <cstdlib>
#include <memory>
#include <optional>
#include <string_view>

namespace varnel {

namespace {

constexpr int firstX11Port = 6000;

std::string environment(const char* name) {
  const char* value = std::getenv(name);
  return value ? value : "";
}

class Socket {
 public:
  explicit Socket(int family) : _descriptor(::socket(family, SOCK_STREAM | SOCK_CLOEXEC, 0)) {}
  Socket(const Socket&) = delete;
  Socket& operator=(const Socket&) = delete;
  ~Socket() {
    if (_descriptor >= 0) ::close(_descriptor);
  }
  bool connects(const sockaddr* address, socklen_t length) const {
    return _descriptor >= 0 && ::connect(_descriptor, address, length) == 0;
  }

 private:
  int _descriptor;
};

bool connectsToFile(const std::string& path) {
  sockaddr_un address{};
  address.sun_family = AF_UNIX;
  if (path.size() >= sizeof address.sun_path) return false;
  path.copy(address.sun_path, path.size());
  const auto length = static_cast<socklen_t>(offsetof(sockaddr_un, sun_path) + path.size());
  return Socket(AF_UNIX).connects(reinterpret_cast<const sockaddr*>(&address), length);
}

bool connectsToHost(const std::string& host, int port) {
  addrinfo hints{};
  hints.ai_socktype = SOCK_STREAM;
  addrinfo* found = nullptr;
  if (::getaddrinfo(host.c_str(), std::to_string(port).c_str(), &hints, &found) != 0) return false;
  const std::unique_ptr<addrinfo, decltype(&::freeaddrinfo)> addresses(found, ::freeaddrinfo);
  for (const addrinfo* next = found; next; next = next->ai_next) {
    if (Socket(next->ai_family).connects(next->ai_addr, next->ai_addrlen)) return true;
  }
  return false;
}

// The number in "HOST:NUMBER" or "HOST:NUMBER.SCREEN"; nothing for a name of another form.
std::optional<int> numberOfX11Display(std::string_view name) {
  const std::size_t colon = name.rfind(':');
  if (colon == std::string_view::npos) return std::nullopt;
  const std::string digits(name.substr(colon + 1, name.find('.', colon) - colon - 1));
  if (digits.empty() || digits.size() > 4 || digits.find_first_not_of("0123456789") != std::string::npos)
    return std::nullopt;
  return std::stoi(digits);
}

bool x11IsThere(const std::string& name) {
  const auto number = numberOfX11Display(name);
  if (!number) return false;
  const std::string host = name.substr(0, name.rfind(':'));
  if (!host.empty() && host != "unix") return connectsToHost(host, firstX11Port + *number);
  const std::string path = "/tmp/.X11-unix/X" + std::to_string(*number);
  // On Linux the server also listens on an abstract name, which begins with a zero byte.
  return connectsToFile(path) || connectsToFile(std::string(1, '\0') + path);
}

bool toolkitSpeaksWayland() {
  const QDir plugins(QLibraryInfo::path(QLibraryInfo::PluginsPath) + QStringLiteral("/platforms"));
  return !plugins.entryList({QStringLiteral("*wayland*")}, QDir::Files).isEmpty();
}

bool waylandIsThere(const std::string& name) {
  if (!toolkitSpeaksWayland()) return false;
  const bool isWholePath = name.starts_with('/');
  return connectsToFile(isWholePath ? name : environment("XDG_RUNTIME_DIR") + "/" + name);
}

}  // namespace

bool displayIsThere() {
  if (!environment("QT_QPA_PLATFORM").empty()) return true;
  const std::string wayland = environment("WAYLAND_DISPLAY");
  if (!wayland.empty() && waylandIsThere(wayland)) return true;
  const std::string x11 = environment("DISPLAY");
  return !x11.empty() && x11IsThere(x11);
}

std::string wantedDisplay() {
  for (const char* name : {"QT_QPA_PLATFORM", "WAYLAND_DISPLAY", "DISPLAY"}) {
    if (const std::string value = environment(name); !value.empty()) return name + ("=" + value);
  }
  return {};
}

}  // namespace varnel
