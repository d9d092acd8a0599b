#include "host/KeyWatcher.h"

#include <unistd.h>

#include <cstddef>

namespace varnel {

namespace {

// The system stops a process in the background of a terminal that reads from it or changes its mode.
bool hasTheTerminal() { return ::tcgetpgrp(STDIN_FILENO) == ::getpgrp(); }

}  // namespace

KeyWatcher::KeyWatcher(std::function<void(char key)> handler) : _handler(std::move(handler)) {
  if (!hasTheTerminal() || ::tcgetattr(STDIN_FILENO, &_formerMode) != 0) return;
  termios keyByKey = _formerMode;
  keyByKey.c_lflag &= ~static_cast<tcflag_t>(ICANON | ECHO);
  keyByKey.c_cc[VMIN] = 0;
  keyByKey.c_cc[VTIME] = 0;
  ::tcsetattr(STDIN_FILENO, TCSANOW, &keyByKey);
  _notifier = std::make_unique<QSocketNotifier>(STDIN_FILENO, QSocketNotifier::Read);
  QObject::connect(_notifier.get(), &QSocketNotifier::activated, _notifier.get(), [this] { takeKeys(); });
}

KeyWatcher::~KeyWatcher() {
  if (_notifier && hasTheTerminal()) ::tcsetattr(STDIN_FILENO, TCSANOW, &_formerMode);
}

void KeyWatcher::takeKeys() noexcept {
  if (!hasTheTerminal()) return;
  char keys[64];
  const ssize_t count = ::read(STDIN_FILENO, keys, sizeof keys);
  if (count <= 0) {  // the terminal has gone
    _notifier->setEnabled(false);
    return;
  }
  for (std::size_t i = 0; i < static_cast<std::size_t>(count); ++i) _handler(keys[i]);
}

}  // namespace varnel
