#include "terminal/TerminalOutput.h"

#include <fcntl.h>
#include <poll.h>
#include <pthread.h>
#include <termios.h>
#include <unistd.h>

#include <atomic>
#include <cerrno>
#include <iterator>

namespace varnel {

namespace {

constexpr int endingSignals[] = {SIGTERM, SIGHUP, SIGINT};

// A signal handler may touch nothing but plain memory.
std::atomic<int> nowhere{-1};
std::atomic<int> terminal{-1};  // another descriptor of standard output
std::atomic<int> lastSignal{0};
std::atomic<bool> standsStill{false};

struct sigaction formerActions[std::size(endingSignals)];

// A program in the background must not be stopped by this: SIGTTOU is blocked.
void dropWaitingOutput() { ::tcflush(terminal, TCOFLUSH); }

// ncurses writes again whatever was not written. So that has to go elsewhere.
void interrupt(int signal) {
  const int error = errno;
  lastSignal = signal;
  standsStill = true;
  dropWaitingOutput();
  ::dup2(nowhere, STDOUT_FILENO);
  errno = error;
}

bool takesOutput() {
  pollfd room{STDOUT_FILENO, POLLOUT, 0};
  return ::poll(&room, 1, 0) == 1 && (room.revents & POLLOUT) != 0;
}

}  // namespace

TerminalOutput::TerminalOutput() {
  nowhere = ::open("/dev/null", O_WRONLY | O_CLOEXEC);
  terminal = ::fcntl(STDOUT_FILENO, F_DUPFD_CLOEXEC, 3);
  lastSignal = 0;
  standsStill = false;
  sigset_t blocked;
  ::pthread_sigmask(SIG_SETMASK, nullptr, &blocked);
  ::sigemptyset(&_interrupting);
  if (nowhere < 0 || terminal < 0) return;
  for (std::size_t i = 0; i < std::size(endingSignals); ++i) {
    const int signal = endingSignals[i];
    if (::sigismember(&blocked, signal) != 1) continue;
    ::sigaddset(&_interrupting, signal);
    struct sigaction action {};
    action.sa_handler = interrupt;
    ::sigfillset(&action.sa_mask);
    ::sigaction(signal, &action, &formerActions[i]);
  }
}

TerminalOutput::~TerminalOutput() {
  for (std::size_t i = 0; i < std::size(endingSignals); ++i) {
    if (::sigismember(&_interrupting, endingSignals[i]) == 1)
      ::sigaction(endingSignals[i], &formerActions[i], nullptr);
  }
  ::close(nowhere.exchange(-1));
  ::close(terminal.exchange(-1));
}

TerminalOutput::Writing::Writing(const TerminalOutput& output) : _output(output) {
  ::pthread_sigmask(SIG_UNBLOCK, &_output._interrupting, &_formerMask);
}

TerminalOutput::Writing::~Writing() {
  ::pthread_sigmask(SIG_SETMASK, &_formerMask, nullptr);
  const int signal = lastSignal.exchange(0);
  if (signal == 0) return;
  ::dup2(terminal, STDOUT_FILENO);
  ::kill(::getpid(), signal);
}

void TerminalOutput::makeRoomToEnd() const {
  if (!takesOutput()) standsStill = true;
  dropWaitingOutput();
  if (!takesOutput()) ::dup2(nowhere, STDOUT_FILENO);
}

void TerminalOutput::dropTheRest() const {
  if (standsStill) ::dup2(nowhere, STDOUT_FILENO);
}

}  // namespace varnel
