#pragma once

#include <termios.h>

#include <QSocketNotifier>
#include <functional>
#include <memory>

namespace varnel {

/// Turns keys that are typed at the terminal into calls from the event loop, each at once and without being
/// shown. Does nothing where standard input is no terminal, or is one in whose background the program was
/// started.
class KeyWatcher final {
 public:
  /// An exception that leaves the handler ends the program.
  explicit KeyWatcher(std::function<void(char key)> handler);
  KeyWatcher(const KeyWatcher&) = delete;
  KeyWatcher& operator=(const KeyWatcher&) = delete;
  /// Leaves the terminal as it was.
  ~KeyWatcher();

  /// False where no key will ever come.
  bool isWatching() const { return _notifier != nullptr; }

 private:
  void takeKeys() noexcept;

  termios _formerMode{};
  std::function<void(char)> _handler;
  std::unique_ptr<QSocketNotifier> _notifier;
};

}  // namespace varnel
