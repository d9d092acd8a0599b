#include "host/RecordingFile.h"

#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <stdexcept>
#include <utility>

#include "host/FileBeside.h"
#include "host/OutputStream.h"
#include "host/WholeFile.h"

namespace varnel {

namespace {

namespace fs = std::filesystem;

// On a file system without locks the recording goes on without one.
bool isLockedElsewhere(int file) { return ::flock(file, LOCK_EX | LOCK_NB) != 0 && errno == EWOULDBLOCK; }

std::error_code whyFolderTakesNoFile(const fs::path& path) {
  const fs::path folder = path.has_parent_path() ? path.parent_path() : ".";
  return ::access(folder.c_str(), W_OK | X_OK) == 0 ? std::error_code() : lastSystemError();
}

off_t sizeOf(int file) {
  struct stat status {};
  return ::fstat(file, &status) == 0 ? status.st_size : 0;
}

}  // namespace

RecordingFile::RecordingFile(const std::string& path, ExistingRecording existing)
    : _path(path == "-" ? "/dev/stdout" : path),
      _name(path == "-" ? "standard output" : path),
      _ifExisting(existing),
      _isStream(path == "-" || isStream(_path)) {
  if (_isStream) {
    _file = path == "-" ? FileDescriptor(::fcntl(STDOUT_FILENO, F_DUPFD_CLOEXEC, 0)) : openStream(_path);
    if (!_file.isOpen()) fail(lastSystemError());
    return;
  }
  struct stat status {};
  if (::lstat(_path.c_str(), &status) == 0)
    openExisting();
  else if (errno != ENOENT)
    fail(lastSystemError());
  if (const auto failure = whyFolderTakesNoFile(_path)) fail(failure);
}

void RecordingFile::openExisting() {
  _existing = FileDescriptor(::open(_path.c_str(), O_WRONLY | O_NOFOLLOW | O_CLOEXEC));
  if (!_existing.isOpen()) fail(errno == ELOOP ? isLinkError() : lastSystemError());
  if (isLockedElsewhere(_existing.number()))
    throw std::runtime_error("another process records to " + _name + "; name another file");
  if (sizeOf(_existing.number()) > 0 && _ifExisting == ExistingRecording::Refused)
    throw std::runtime_error(_name +
                             " is there already, and not empty; name another file, or replace it with "
                             "--overwrite");
}

void RecordingFile::append(ByteView record) {
  if (!_file.isOpen()) {
    _existing.isOpen() ? replaceExisting(record) : make(record);
  } else if (const auto failure = writeAll(_file.number(), record)) {
    // Readers would take a part of a record for damage.
    if (!_isStream && ::ftruncate(_file.number(), _size) != 0) fail(lastSystemError());
    fail(failure);
  }
  _size += static_cast<off_t>(record.size());
}

void RecordingFile::make(ByteView record) {
  constexpr int flags = O_WRONLY | O_APPEND | O_CREAT | O_EXCL | O_NOFOLLOW | O_CLOEXEC;
  FileDescriptor file(::open(_path.c_str(), flags, 0600));
  if (!file.isOpen()) fail(lastSystemError());
  static_cast<void>(isLockedElsewhere(file.number()));  // takes the lock; no other process knows the file yet
  if (const auto failure = writeAll(file.number(), record)) {
    ::unlink(_path.c_str());
    fail(failure);
  }
  _file = std::move(file);
}

void RecordingFile::replaceExisting(ByteView record) {
  if (!isExistingInPlace()) fail(std::make_error_code(std::errc::file_exists));
  FileBeside file(_path);
  if (const auto failure = file.make()) fail(failure);
  static_cast<void>(isLockedElsewhere(file.descriptor()));
  if (const auto failure = writeAll(file.descriptor(), record)) fail(failure);
  if (const auto failure = file.takePlace()) fail(failure);
  _file = file.release();
  _existing = FileDescriptor();
}

// Much can have happened to the file since the program was started.
bool RecordingFile::isExistingInPlace() const {
  struct stat named {
  }, open{};
  if (::lstat(_path.c_str(), &named) != 0 || ::fstat(_existing.number(), &open) != 0) return false;
  const bool isSame = named.st_dev == open.st_dev && named.st_ino == open.st_ino;
  return isSame && (open.st_size == 0 || _ifExisting == ExistingRecording::Replaced);
}

void RecordingFile::fail(std::error_code failure) const {
  throw std::system_error(failure, "cannot record to " + _name);
}

}  // namespace varnel
