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

}  // namespace

FileBeside::~FileBeside() {
  if (!_path.empty()) ::unlink(_path.c_str());
}

std::error_code FileBeside::make() {
  constexpr int flags = O_WRONLY | O_APPEND | O_CREAT | O_EXCL | O_NOFOLLOW | O_CLOEXEC;
  const std::string name = ".varnel-" + std::to_string(::getpid()) + '-';
  // Files that killed processes left behind stay: nobody knows whether their owner has really ended.
  constexpr int mostAttempts = 1000;
  for (int attempt = 0; attempt < mostAttempts; ++attempt) {
    const std::filesystem::path path = folderOf(_target) / (name + std::to_string(attempt));
    _file = FileDescriptor(::open(path.c_str(), flags, 0600));
    if (_file.isOpen()) {
      _path = path;
      return {};
    }
    if (errno != EEXIST) break;
  }
  return lastSystemError();
}

std::error_code FileBeside::takePlace() {
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
