#include "host/FileBeside.h"

#include <fcntl.h>
#include <unistd.h>

#include <cerrno>
#include <string>

#include "host/OutputStream.h"

namespace varnel {

namespace {

std::filesystem::path folderOf(const std::filesystem::path& file) {
  return file.has_parent_path() ? file.parent_path() : ".";
}

std::string nameOfDescriptor(int descriptor) { return "/proc/self/fd/" + std::to_string(descriptor); }

}  // namespace

FileBeside::~FileBeside() {
  if (!_path.empty()) ::unlink(_path.c_str());
}

// Calls `make` with names until it succeeds, or fails for another reason than that the name is taken.
template <class Make>
std::error_code FileBeside::withFreeName(Make make) {
  const std::string name = ".varnel-" + std::to_string(::getpid()) + '-';
  // Files that killed processes left behind stay: nobody knows whether their owner has really ended.
  constexpr int mostAttempts = 1000;
  for (int attempt = 0; attempt < mostAttempts; ++attempt) {
    const std::filesystem::path path = folderOf(_target) / (name + std::to_string(attempt));
    if (make(path)) {
      _path = path;
      return {};
    }
    if (errno != EEXIST) break;
  }
  return lastSystemError();
}

std::error_code FileBeside::make() {
  _file =
      FileDescriptor(::open(folderOf(_target).c_str(), O_WRONLY | O_APPEND | O_TMPFILE | O_CLOEXEC, 0600));
  // A file gets its name by its descriptor's own name.
  _hasNoName = _file.isOpen() && ::access(nameOfDescriptor(_file.number()).c_str(), F_OK) == 0;
  return _hasNoName ? std::error_code() : makeNamed();
}

std::error_code FileBeside::makeNamed() {
  constexpr int flags = O_WRONLY | O_APPEND | O_CREAT | O_EXCL | O_NOFOLLOW | O_CLOEXEC;
  return withFreeName([&](const std::filesystem::path& path) {
    _file = FileDescriptor(::open(path.c_str(), flags, 0600));
    return _file.isOpen();
  });
}

std::error_code FileBeside::giveName() {
  const std::string descriptor = nameOfDescriptor(_file.number());
  return withFreeName([&](const std::filesystem::path& path) {
    return ::linkat(AT_FDCWD, descriptor.c_str(), AT_FDCWD, path.c_str(), AT_SYMLINK_FOLLOW) == 0;
  });
}

// A link replaces no file, so the new file has a name of its own for a moment.
std::error_code FileBeside::takePlace() {
  if (_hasNoName) {
    if (const auto failure = giveName()) return failure;
    _hasNoName = false;
  }
  if (::rename(_path.c_str(), _target.c_str()) != 0) return lastSystemError();
  _path.clear();
  synchroniseFolder(folderOf(_target));
  return {};
}

void synchroniseFolder(const std::filesystem::path& folder) {
  const FileDescriptor descriptor(::open(folder.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC));
  // The file is whole and in its place. A failure would only mean that a power cut can still undo that.
  if (descriptor.isOpen()) ::fsync(descriptor.number());
}

}  // namespace varnel
