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

// Those whose default ends the program, without the real-time signals. Where the event loop takes one of
// them, it is blocked, so that this has no effect.
constexpr int fatalSignals[] = {SIGABRT, SIGSEGV,   SIGBUS,  SIGFPE,  SIGILL,   SIGQUIT, SIGSYS,
                                SIGTRAP, SIGXCPU,   SIGXFSZ, SIGALRM, SIGPROF,  SIGIO,   SIGPWR,
                                SIGPIPE, SIGVTALRM, SIGUSR1, SIGUSR2, SIGSTKFLT};

// A program whose stack has overflowed has none for the handler.
alignas(16) char handlerStack[std::size_t{64} * 1024];

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
    // What was typed, and what the mouse has sent, must not reach the shell.
    ::tcflush(STDIN_FILENO, TCIFLUSH);
    ::tcsetattr(STDIN_FILENO, TCSANOW, &formerMode);
  }
  writeHeldLines();
  // The handler was removed when it was called, so this has the usual effect.
  ::raise(signal);
}

void prepareHandlerStack() {
  stack_t stack{};
  if (::sigaltstack(nullptr, &stack) != 0 || (stack.ss_flags & SS_DISABLE) == 0) return;
  stack = {};
  stack.ss_sp = handlerStack;
  stack.ss_size = sizeof handlerStack;
  ::sigaltstack(&stack, nullptr);
}

void rescueAt(int signal) {
  struct sigaction action {};
  if (::sigaction(signal, nullptr, &action) != 0 || action.sa_handler == SIG_IGN) return;
  action = {};
  action.sa_handler = rescue;
  action.sa_flags = static_cast<int>(SA_RESETHAND | SA_NODEFER | SA_ONSTACK);
  ::sigemptyset(&action.sa_mask);
  ::sigaction(signal, &action, nullptr);
}

}  // namespace

void arm(const termios& mode, const std::string& leave) {
  formerMode = mode;
  leavingSize = std::min(leave.size(), longestLeaving);
  std::copy_n(leave.begin(), leavingSize.load(), leaving);
  isArmed = true;
  prepareHandlerStack();
  for (const int signal : fatalSignals) rescueAt(signal);
  for (int signal = SIGRTMIN; signal <= SIGRTMAX; ++signal) rescueAt(signal);
}

void disarm() { isArmed = false; }

void setHeldFile(int descriptor) { heldFile = descriptor; }

}  // namespace varnel::TerminalRescue
