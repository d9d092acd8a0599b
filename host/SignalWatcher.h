#pragma once

#include <QSocketNotifier>
#include <csignal>
#include <functional>
#include <initializer_list>
#include <memory>

namespace varnel {

/// Calls the handler from the event loop for each signal. While this object lives, the signals have no other
/// effect. If the program was started with hang-ups ignored, as by nohup(1), they stay ignored.
class SignalWatcher final {
 public:
  /// An exception that leaves the handler ends the program. Throws std::system_error when the system lacks
  /// resources. Other threads must not take signals.
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
