#pragma once

#include <chrono>
#include <filesystem>
#include <functional>
#include <memory>
#include <string>

#include "base/Log.h"
#include "host/SystemLogQueue.h"

namespace varnel {

/// The log of a program: every line goes to syslog(3), the important ones also to standard error, as
/// `<P>text`, in order and before the call returns. It is the log's sink from its construction to its
/// destruction. While nobody listens to the system log, lines that standard error does not want are not even
/// formatted.
class HostLog final : public LogSink {
 public:
  enum class SystemLog { Used, Unused };

  struct Options {
    std::string programName{};
    /// Lines of that priority number and lower go to standard error; -1 for none.
    int standardErrorLevel = -1;
    SystemLog systemLog = SystemLog::Used;
    /// Where the system log's listener has its socket.
    std::filesystem::path systemLogSocket = "/dev/log";
    /// How often the listener is looked for.
    std::chrono::milliseconds probeInterval = std::chrono::seconds(5);
    /// What takes the place of syslog(3), on a thread of its own.
    std::function<void(int priority, const std::string& text)> writeSystemLog{};
  };

  explicit HostLog(Options options);
  HostLog(const HostLog&) = delete;
  HostLog& operator=(const HostLog&) = delete;
  /// Waits half a second at most for syslog(3) to take what is left.
  ~HostLog() override;

  void write(int priority, std::string_view text) override;
  /// Waits until syslog(3) has taken every line, half a second at most.
  void giveTime();

 private:
  const int _standardErrorLevel;
  std::unique_ptr<SystemLogQueue> _systemLog;  // null when it is not used
};

}  // namespace varnel
