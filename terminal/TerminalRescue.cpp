#include "terminal/TerminalRescue.h"

#include <fcntl.h>
#include <unistd.h>

#include <algorithm>
#include <atomic>
#include <cerrno>
#include <csignal>
#include <cstddef>

namespace varnel::TerminalRescue {

namespace {

constexpr int fatalSignals[] = {SIGABRT, SIGSEGV, SIGBUS, SIGFPE, SIGILL, SIGQUIT, SIGSYS, SIGTRAP, SIGXCPU};

// A signal handler may touch nothing but plain memory.
constexpr std::size_t longestLeaving = 512;
char leaving[longestLeaving];
std::atomic<std::size_t> leavingSize{0};
termios formerMode;
std::atomic<bool> isArmed{false};
std::atomic<int> heldFile{-1};

void writeAll(const char* bytes, std::size_t size) {
  while (size > 0) {
    const ssize_t written = ::write(STDOUT_FILENO, bytes, size);
    if (written < 0 && errno == EINTR) continue;
    if (written <= 0) return;
    bytes += written;
    size -= static_cast<std::size_t>(written);
  }
}

void writeHeldLines() {
  const int file = heldFile.exchange(-1);
  if (file < 0) return;
  char piece[1024];
  off_t at = 0;
  for (;;) {
    const ssize_t count = ::pread(file, piece, sizeof piece, at);
    if (count <= 0) return;
    writeAll(piece, static_cast<std::size_t>(count));
    at += count;
  }
}

void rescue(int signal) {
  if (isArmed.exchange(false)) {
    writeAll(leaving, leavingSize);
    ::tcsetattr(STDIN_FILENO, TCSANOW, &formerMode);
  }
  writeHeldLines();
  // The handler was removed when it was called, so this has the usual effect.
  ::raise(signal);
}

}  // namespace

void arm(const termios& mode, const std::string& leave) {
  formerMode = mode;
  leavingSize = std::min(leave.size(), longestLeaving);
  std::copy_n(leave.begin(), leavingSize.load(), leaving);
  isArmed = true;
  struct sigaction action {};
  action.sa_handler = rescue;
  action.sa_flags = static_cast<int>(SA_RESETHAND | SA_NODEFER);
  ::sigemptyset(&action.sa_mask);
  for (const int signal : fatalSignals) {
    struct sigaction former {};
    if (::sigaction(signal, nullptr, &former) == 0 && former.sa_handler != SIG_IGN)
      ::sigaction(signal, &action, nullptr);
  }
}

void disarm() { isArmed = false; }

void setHeldFile(int descriptor) { heldFile = descriptor; }

}  // namespace varnel::TerminalRescue
