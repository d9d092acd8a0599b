#include "host/WholeFile.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <fstream>
#include <string>

#include "base/PropertyList.h"
#include "host/OutputFile.h"

namespace varnel {

namespace {

enum class NameError { IsLink = 1, IsNoFile };

// Errors for which the system has no code.
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

// What the new file needs to know about the file that it replaces.
struct Predecessor {
  std::error_code failure;  // why the old file must stay
  mode_t mode = ownerAlone;
};

Predecessor predecessorAt(const std::filesystem::path& path) {
  struct stat status {};
  if (::lstat(path.c_str(), &status) != 0)
    return {.failure = errno == ENOENT ? std::error_code() : lastSystemError()};
  if (S_ISLNK(status.st_mode)) return {.failure = errorOf(NameError::IsLink)};
  if (S_ISDIR(status.st_mode)) return {.failure = std::make_error_code(std::errc::is_a_directory)};
  if (!S_ISREG(status.st_mode)) return {.failure = errorOf(NameError::IsNoFile)};
  // Renaming would replace even a file that is protected against writing.
  if (::faccessat(AT_FDCWD, path.c_str(), W_OK, AT_EACCESS) != 0) return {.failure = lastSystemError()};
  return {.failure = {}, .mode = status.st_mode & static_cast<mode_t>(ALLPERMS)};
}

std::error_code synchronise(int descriptor) {
  // Some file systems cannot do that.
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

std::error_code WholeFileWriter::open() {
  const Predecessor predecessor = predecessorAt(_path);
  if (predecessor.failure) return predecessor.failure;
  _oldMode = predecessor.mode;
  return _file.make();
}

std::error_code WholeFileWriter::dateTo(const timespec& time) {
  const timespec times[] = {time, time};
  return ::futimens(_file.descriptor(), times) == 0 ? std::error_code() : lastSystemError();
}

std::error_code WholeFileWriter::finish() {
  const bool keepsMode = _mode == ReplacedMode::Kept && _oldMode != ownerAlone;
  if (keepsMode && ::fchmod(_file.descriptor(), _oldMode) != 0) return lastSystemError();
  if (const auto failure = synchronise(_file.descriptor())) return failure;
  return _file.takePlace();
}

std::error_code writeWholeFile(const std::filesystem::path& path, ByteView bytes, ReplacedMode mode) {
  WholeFileWriter file(path, mode);
  if (const auto failure = file.open()) return failure;
  if (const auto failure = file.write(bytes)) return failure;
  return file.finish();
}

std::error_code writeOutputFile(const std::filesystem::path& path, ByteView bytes) {
  OutputFile file(path);
  if (const auto failure = file.open()) return failure;
  if (const auto failure = file.write(bytes)) return failure;
  return file.finish();
}

std::error_code isLinkError() { return errorOf(NameError::IsLink); }

}  // namespace varnel
