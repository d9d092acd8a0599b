#pragma once

#include <termios.h>

#include <QSocketNotifier>
#include <functional>
#include <memory>

namespace varnel {

/// Calls the handler from the event loop for each key that is typed at the terminal. The terminal does not
/// show the key. Does nothing when standard input is no terminal, or when the program was started in the
/// background of its terminal.
class KeyWatcher final {
 public:
  /// An exception that leaves the handler ends the program.
  explicit KeyWatcher(std::function<void(char key)> handler);
  KeyWatcher(const KeyWatcher&) = delete;
  KeyWatcher& operator=(const KeyWatcher&) = delete;
  /// Restores the terminal's mode.
  ~KeyWatcher();

  /// False when no key can ever come.
  bool isWatching() const { return _notifier != nullptr; }

 private:
  void takeKeys() noexcept;

  termios _formerMode{};
  std::function<void(char)> _handler;
  std::unique_ptr<QSocketNotifier> _notifier;
};

}  // namespace varnel
