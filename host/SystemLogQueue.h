#pragma once

#include <chrono>
#include <filesystem>
#include <functional>
#include <memory>
#include <string>
#include <string_view>

namespace varnel {

/// A bounded queue and a thread for syslog(3), which blocks forever when its listener stops reading. Lines
/// that do not fit are counted, and a line tells their number when there is room again.
class SystemLogQueue final {
 public:
  struct Options {
    std::string programName{};
    /// The socket of the system log's listener.
    std::filesystem::path listener = "/dev/log";
    /// How often the thread looks for the listener.
    std::chrono::milliseconds probeInterval = std::chrono::seconds(5);
    /// Writes a line on the thread; syslog(3) when empty.
    std::function<void(int priority, const std::string& text)> write{};
    /// Learns whether a process listens: when the queue is made, and then on the thread after each look,
    /// until the queue is destroyed.
    std::function<void(bool isHeard)> onProbe{};
  };

  explicit SystemLogQueue(Options options);
  SystemLogQueue(const SystemLogQueue&) = delete;
  SystemLogQueue& operator=(const SystemLogQueue&) = delete;
  /// Waits half a second for the thread to write what is waiting. Leaves a thread behind that is stuck.
  ~SystemLogQueue();

  /// Queues a line if a process listens. Never blocks.
  void add(int priority, std::string_view text);
  /// Waits until every line is written, at most half a second.
  void drain();

 private:
  struct Shared;
  static void run(const std::shared_ptr<Shared>& shared);

  std::shared_ptr<Shared> _shared;  // shared with the thread, which may outlive this object
};

}  // namespace varnel
