#include "host/OutputStream.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <charconv>
#include <optional>
#include <string>

namespace varnel {

namespace {

namespace fs = std::filesystem;

std::optional<int> numberIn(const std::string& text) {
  int number = 0;
  const auto [end, failure] = std::from_chars(text.data(), text.data() + text.size(), number);
  return failure == std::errc() && end == text.data() + text.size() ? std::optional(number) : std::nullopt;
}

// The open file that the path names through /proc, as /dev/stdout does. It is written at its current
// position; if it were opened again, writing would begin at its start.
std::optional<int> ownDescriptor(fs::path path) {
  constexpr int mostLinks = 8;
  const fs::path descriptors = "/proc/" + std::to_string(::getpid()) + "/fd";
  for (int links = 0; links < mostLinks; ++links) {
    std::error_code failure;
    const fs::path target = fs::read_symlink(path, failure);
    if (failure) return std::nullopt;
    if (fs::canonical(path.parent_path(), failure) == descriptors) return numberIn(path.filename());
    path = path.parent_path() / target;
  }
  return std::nullopt;
}

}  // namespace

std::error_code lastSystemError() { return {errno, std::generic_category()}; }

std::error_code writeAll(int descriptor, ByteView bytes) {
  while (!bytes.empty()) {
    const ssize_t written = ::write(descriptor, bytes.data(), bytes.size());
    if (written < 0 && errno == EINTR) continue;
    if (written < 0) return lastSystemError();
    if (written == 0) return std::make_error_code(std::errc::io_error);
    bytes = bytes.subspan(static_cast<std::size_t>(written));
  }
  return {};
}

bool isStream(const fs::path& path) {
  struct stat status {};
  if (::stat(path.c_str(), &status) != 0 || S_ISDIR(status.st_mode)) return false;
  return !S_ISREG(status.st_mode) || ownDescriptor(path);
}

FileDescriptor openStream(const fs::path& path) {
  if (const auto number = ownDescriptor(path)) return FileDescriptor(::fcntl(*number, F_DUPFD_CLOEXEC, 0));
  return FileDescriptor(::open(path.c_str(), O_WRONLY | O_NOCTTY | O_CLOEXEC));
}

}  // namespace varnel
