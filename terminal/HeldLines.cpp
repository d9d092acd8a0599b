#include "terminal/HeldLines.h"

#include <fcntl.h>
#include <sys/mman.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <system_error>

#include "terminal/TerminalRescue.h"

namespace varnel {

namespace {

constexpr std::size_t mostShown = std::size_t{64} * 1024;

void writeAll(int descriptor, std::string_view text) {
  while (!text.empty()) {
    const ssize_t written = ::write(descriptor, text.data(), text.size());
    if (written < 0 && errno == EINTR) continue;
    if (written <= 0) return;
    text.remove_prefix(static_cast<std::size_t>(written));
  }
}

bool isSameTerminal(int one, int other) {
  struct stat first {};
  struct stat second {};
  return ::isatty(one) == 1 && ::fstat(one, &first) == 0 && ::fstat(other, &second) == 0 &&
         first.st_rdev == second.st_rdev;
}

std::size_t sizeOf(int file) {
  struct stat status {};
  return ::fstat(file, &status) == 0 ? static_cast<std::size_t>(status.st_size) : 0;
}

}  // namespace

HeldLines::HeldLines() : _file(::memfd_create("varnel-held-lines", MFD_CLOEXEC)) {
  // Whoever writes, writes at the end.
  if (_file < 0 || ::fcntl(_file, F_SETFL, O_APPEND) != 0)
    throw std::system_error(errno, std::generic_category(), "cannot hold back lines");
  if (isSameTerminal(STDERR_FILENO, STDOUT_FILENO)) {
    _standardError = ::fcntl(STDERR_FILENO, F_DUPFD_CLOEXEC, 3);
    if (_standardError >= 0) ::dup2(_file, STDERR_FILENO);
  }
  TerminalRescue::setHeldFile(_file);
}

HeldLines::~HeldLines() {
  if (_standardError >= 0) {
    ::dup2(_standardError, STDERR_FILENO);
    ::close(_standardError);
  }
  TerminalRescue::setHeldFile(-1);
  trim();
  writeAll(STDOUT_FILENO, tail(sizeOf(_file)));
  ::close(_file);
}

std::streamsize HeldLines::Buffer::xsputn(const char* text, std::streamsize count) {
  _held.add({text, static_cast<std::size_t>(count)});
  return count;
}

int HeldLines::Buffer::overflow(int character) {
  if (character == traits_type::eof()) return traits_type::not_eof(character);
  const char text = traits_type::to_char_type(character);
  _held.add({&text, 1});
  return character;
}

void HeldLines::add(std::string_view text) {
  writeAll(_file, text);
  if (sizeOf(_file) > 2 * most) trim();
}

std::string HeldLines::tail(std::size_t bytes) const {
  const std::size_t size = sizeOf(_file);
  std::string text(std::min(bytes, size), '\0');
  const ssize_t count = ::pread(_file, text.data(), text.size(), static_cast<off_t>(size - text.size()));
  text.resize(static_cast<std::size_t>(std::max<ssize_t>(0, count)));
  // Only whole lines.
  if (text.size() < size) text.erase(0, text.find('\n') + 1);
  return text;
}

std::string HeldLines::last() const { return tail(mostShown); }

void HeldLines::trim() {
  const std::size_t size = sizeOf(_file);
  if (size <= most) return;
  const std::string kept = tail(most / 2);
  _dropped += size - kept.size();
  if (::ftruncate(_file, 0) != 0) return;
  add("(" + std::to_string(_dropped) + " bytes of older lines are left out)\n");
  add(kept);
}

}  // namespace varnel
