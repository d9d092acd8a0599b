#include "host/SignalWatcher.h"

#include <pthread.h>
#include <sys/signalfd.h>
#include <unistd.h>

#include <cerrno>
#include <system_error>

namespace varnel {

namespace {

bool isIgnored(int signal) {
  struct sigaction action {};
  return ::sigaction(signal, nullptr, &action) == 0 && action.sa_handler == SIG_IGN;
}

}  // namespace

SignalWatcher::SignalWatcher(std::initializer_list<int> signals, std::function<void(int)> handler)
    : _handler(std::move(handler)) {
  sigset_t watched;
  ::sigemptyset(&watched);
  for (const int signal : signals) {
    if (signal != SIGHUP || !isIgnored(signal)) ::sigaddset(&watched, signal);
  }
  _descriptor = ::signalfd(-1, &watched, SFD_NONBLOCK | SFD_CLOEXEC);
  if (_descriptor < 0) throw std::system_error(errno, std::generic_category(), "cannot watch for signals");
  ::pthread_sigmask(SIG_BLOCK, &watched, &_formerMask);
  _notifier = std::make_unique<QSocketNotifier>(_descriptor, QSocketNotifier::Read);
  QObject::connect(_notifier.get(), &QSocketNotifier::activated, _notifier.get(), [this] { takeSignals(); });
}

SignalWatcher::~SignalWatcher() {
  _notifier.reset();
  ::close(_descriptor);
  ::pthread_sigmask(SIG_SETMASK, &_formerMask, nullptr);
}

void SignalWatcher::takeSignals() noexcept {
  signalfd_siginfo taken{};
  while (::read(_descriptor, &taken, sizeof taken) == sizeof taken)
    _handler(static_cast<int>(taken.ssi_signo));
}

}  // namespace varnel
