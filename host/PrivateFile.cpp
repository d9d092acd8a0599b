#include "host/PrivateFile.h"

#include <fcntl.h>
#include <unistd.h>

#include <cerrno>

namespace varnel {

namespace {

bool writeAll(int file, ByteView bytes) {
  while (!bytes.empty()) {
    const ssize_t written = ::write(file, bytes.data(), bytes.size());
    if (written < 0 && errno == EINTR) continue;
    if (written < 0) return false;
    bytes = bytes.subspan(static_cast<std::size_t>(written));
  }
  return true;
}

}  // namespace

bool writePrivateFile(const std::filesystem::path& path, ByteView bytes) {
  const int file = ::open(path.c_str(), O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC, 0600);
  if (file < 0) return false;
  const bool isWritten = writeAll(file, bytes);
  // A full disk may show only now.
  return ::close(file) == 0 && isWritten;
}

}  // namespace varnel
