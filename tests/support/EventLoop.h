#pragma once

#include <QCoreApplication>
#include <QThread>
#include <atomic>
#include <chrono>
#include <functional>
#include <memory>

namespace varnel {

/// Runs the calling thread's event loop until the condition holds; false when the time is up first.
inline bool runUntil(const std::function<bool()>& condition,
                     std::chrono::milliseconds within = std::chrono::seconds(60)) {
  const auto deadline = std::chrono::steady_clock::now() + within;
  while (!condition()) {
    if (std::chrono::steady_clock::now() > deadline) return false;
    QCoreApplication::processEvents(QEventLoop::AllEvents, 5);
    QThread::usleep(200);
  }
  return true;
}

/// Runs the event loop for this long, for things that must not happen. For things that must happen, use
/// `runUntil`.
inline void runFor(std::chrono::milliseconds duration) {
  runUntil([] { return false; }, duration);
}

/// A peer with its own event loop, like another process.
class PeerThread {
 public:
  /// Sets the peer up on its thread and runs the event loop there. At the end, destroys what the function
  /// returned. The caller's event loop runs until the peer is set up.
  explicit PeerThread(std::function<std::shared_ptr<void>()> setUp)
      : _thread(QThread::create([this, setUp = std::move(setUp)] {
          const auto peer = setUp();
          _isReady = true;
          runUntil([this] { return _isEnding.load(); }, std::chrono::minutes(10));
        })) {
    _thread->start();
    runUntil([this] { return _isReady.load(); });
  }
  PeerThread(const PeerThread&) = delete;
  PeerThread& operator=(const PeerThread&) = delete;
  ~PeerThread() {
    _isEnding = true;
    _thread->wait();
  }

 private:
  std::atomic<bool> _isReady = false;
  std::atomic<bool> _isEnding = false;
  std::unique_ptr<QThread> _thread;
};

}  // namespace varnel
