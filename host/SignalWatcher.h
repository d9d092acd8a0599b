#pragma once

#include <QSocketNotifier>
#include <csignal>
#include <functional>
#include <initializer_list>
#include <memory>

namespace varnel {

/// Turns signals into calls from the event loop. As long as it lives they do nothing else. A hang-up stays
/// ignored where the program was started to ignore it, as nohup(1) does.
class SignalWatcher final {
 public:
  /// An exception that leaves the handler ends the program. Throws std::system_error when the system lacks
  /// what it takes. Other threads must not take signals.
  SignalWatcher(std::initializer_list<int> signals, std::function<void(int signal)> handler);
  SignalWatcher(const SignalWatcher&) = delete;
  SignalWatcher& operator=(const SignalWatcher&) = delete;
  ~SignalWatcher();

 private:
  void takeSignals() noexcept;

  sigset_t _formerMask;
  int _descriptor;
  std::function<void(int)> _handler;
  std::unique_ptr<QSocketNotifier> _notifier;
};

}  // namespace varnel
