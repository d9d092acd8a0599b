#include "host/captures/ByteSource.h"

#include <fcntl.h>
#include <poll.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <system_error>

#include "host/captures/CaptureRecord.h"

namespace varnel {

namespace {

constexpr int pause_ms = 100;

std::string lastSystemError() { return std::generic_category().message(errno); }

class FileSource final : public ByteSource {
 public:
  FileSource(const std::string& path, AtEndOfFile atEnd) : _name(captureName(path)), _atEnd(atEnd) {
    if (path != "-") _file = ::open(path.c_str(), O_RDONLY | O_CLOEXEC | O_NOCTTY);
    if (_file < 0) throw CaptureError("cannot open " + _name + ": " + lastSystemError());
    if (hasMode(S_IFDIR)) {
      close();
      throw CaptureError(_name + " is a folder; name a capture in it");
    }
  }
  FileSource(const FileSource&) = delete;
  FileSource& operator=(const FileSource&) = delete;
  ~FileSource() override { close(); }

  std::size_t read(std::span<std::uint8_t> room) override {
    for (;;) {
      const ssize_t count = ::read(_file, room.data(), room.size());
      if (count > 0) {
        _bytesRead += static_cast<std::uint64_t>(count);
        return static_cast<std::size_t>(count);
      }
      if (count == 0 && !mayGrow()) return 0;
      // A terminal whose other side has gone reports this error when it is read.
      if (count < 0 && errno == EIO && ::isatty(_file)) return 0;
      if (count < 0 && errno != EINTR && errno != EAGAIN)
        throw CaptureError("cannot read " + _name + ": " + lastSystemError());
      if (count == 0 || errno == EAGAIN) waitForMore(count == 0);
    }
  }

  std::uint64_t bytesRead() const override { return _bytesRead; }

  std::optional<std::uint64_t> fileSize() const override {
    struct stat status {};
    if (::fstat(_file, &status) != 0 || !S_ISREG(status.st_mode)) return std::nullopt;
    return static_cast<std::uint64_t>(status.st_size);
  }

 private:
  bool hasMode(unsigned mode) const {
    struct stat status {};
    return ::fstat(_file, &status) == 0 && (status.st_mode & S_IFMT) == mode;
  }
  bool mayGrow() const { return _atEnd == AtEndOfFile::WaitForMore && hasMode(S_IFREG); }

  // A file can always be read, even at its end. So only waiting for a while helps.
  void waitForMore(bool isAtEndOfFile) const {
    pollfd file{.fd = isAtEndOfFile ? -1 : _file, .events = POLLIN, .revents = 0};
    ::poll(&file, 1, isAtEndOfFile ? pause_ms : -1);
  }

  void close() const {
    if (_file != STDIN_FILENO) ::close(_file);
  }

  std::string _name;
  AtEndOfFile _atEnd;
  int _file = STDIN_FILENO;
  std::uint64_t _bytesRead = 0;
};

}  // namespace

std::unique_ptr<ByteSource> openFile(const std::string& path, AtEndOfFile atEnd) {
  return std::make_unique<FileSource>(path, atEnd);
}

std::string captureName(const std::string& path) { return path == "-" ? "standard input" : path; }

}  // namespace varnel
