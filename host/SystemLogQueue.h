#pragma once

#include <chrono>
#include <filesystem>
#include <functional>
#include <memory>
#include <string>
#include <string_view>

namespace varnel {

/// The way to syslog(3), which blocks for good when its listener stops reading: a bounded queue and a thread
/// of its own. Lines that do not fit are counted, and their number is written when there is room again.
class SystemLogQueue final {
 public:
  struct Options {
    std::string programName{};
    /// Where the system log's listener has its socket.
    std::filesystem::path listener = "/dev/log";
    /// How often the listener is looked for.
    std::chrono::milliseconds probeInterval = std::chrono::seconds(5);
    /// What writes a line, syslog(3) when empty. Called on the thread.
    std::function<void(int priority, const std::string& text)> write{};
    /// Told whether somebody listens: when the queue is made, and on the thread after each look until the
    /// queue is destroyed.
    std::function<void(bool isHeard)> onProbe{};
  };

  explicit SystemLogQueue(Options options);
  SystemLogQueue(const SystemLogQueue&) = delete;
  SystemLogQueue& operator=(const SystemLogQueue&) = delete;
  /// Gives the thread half a second for what waits; a thread that is stuck is left behind.
  ~SystemLogQueue();

  /// Queues a line while somebody listens. Never blocks.
  void add(int priority, std::string_view text);
  /// Waits until every line is written, half a second at most.
  void drain();

 private:
  struct Shared;
  static void run(const std::shared_ptr<Shared>& shared);

  std::shared_ptr<Shared> _shared;  // with the thread, which may outlive this object
};

}  // namespace varnel
