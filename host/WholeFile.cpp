#include "host/WholeFile.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <fstream>
#include <string>

#include "base/PropertyList.h"
#include "host/FileBeside.h"
#include "host/OutputStream.h"

namespace varnel {

namespace {

enum class NameError { IsLink = 1, IsNoFile };

// What the system's own errors have no words for.
class NameErrors final : public std::error_category {
 public:
  const char* name() const noexcept override { return "file name"; }
  std::string message(int error) const override {
    return static_cast<NameError>(error) == NameError::IsLink
               ? "it is a symbolic link; name the file that it leads to"
               : "it is no regular file";
  }
};

std::error_code errorOf(NameError error) {
  static const NameErrors category;
  return {static_cast<int>(error), category};
}

constexpr mode_t ownerAlone = 0600;

// What the new file has to know of what stands at its place.
struct Predecessor {
  std::error_code failure;  // why it must stay
  mode_t mode = ownerAlone;
};

Predecessor predecessorAt(const std::filesystem::path& path) {
  struct stat status {};
  if (::lstat(path.c_str(), &status) != 0)
    return {.failure = errno == ENOENT ? std::error_code() : lastSystemError()};
  if (S_ISLNK(status.st_mode)) return {.failure = errorOf(NameError::IsLink)};
  if (S_ISDIR(status.st_mode)) return {.failure = std::make_error_code(std::errc::is_a_directory)};
  if (!S_ISREG(status.st_mode)) return {.failure = errorOf(NameError::IsNoFile)};
  // A new file would take the place of one that is protected against writing, too.
  if (::faccessat(AT_FDCWD, path.c_str(), W_OK, AT_EACCESS) != 0) return {.failure = lastSystemError()};
  return {.failure = {}, .mode = status.st_mode & static_cast<mode_t>(ALLPERMS)};
}

std::error_code synchronise(int descriptor) {
  // Some file systems have no way to do that.
  if (::fsync(descriptor) == 0 || errno == EINVAL || errno == ENOSYS) return {};
  return lastSystemError();
}

}  // namespace

std::optional<Bytes> readWholeFile(const std::filesystem::path& path) {
  std::error_code failure;
  const std::uintmax_t size = std::filesystem::file_size(path, failure);
  if (failure || size > fileLimits.size) return std::nullopt;
  Bytes bytes(size);
  std::ifstream file(path, std::ios::binary);
  if (!file.read(reinterpret_cast<char*>(bytes.data()), static_cast<std::streamsize>(size)))
    return std::nullopt;
  return bytes;
}

std::error_code writeWholeFile(const std::filesystem::path& path, ByteView bytes, ReplacedMode mode) {
  const Predecessor predecessor = predecessorAt(path);
  if (predecessor.failure) return predecessor.failure;
  FileBeside file(path);
  if (const auto failure = file.make()) return failure;
  if (const auto failure = writeAll(file.descriptor(), bytes)) return failure;
  const bool keepsMode = mode == ReplacedMode::Kept && predecessor.mode != ownerAlone;
  if (keepsMode && ::fchmod(file.descriptor(), predecessor.mode) != 0) return lastSystemError();
  if (const auto failure = synchronise(file.descriptor())) return failure;
  return file.takePlace();
}

std::error_code writeOutputFile(const std::filesystem::path& path, ByteView bytes) {
  if (!isStream(path)) return writeWholeFile(path, bytes);
  const FileDescriptor stream = openStream(path);
  return stream.isOpen() ? writeAll(stream.number(), bytes) : lastSystemError();
}

std::error_code isLinkError() { return errorOf(NameError::IsLink); }

}  // namespace varnel
