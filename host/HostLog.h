#pragma once

#include <chrono>
#include <filesystem>
#include <functional>
#include <memory>
#include <string>

#include "base/Log.h"
#include "host/SystemLogQueue.h"

namespace varnel {

/// The log of a program. Every line goes to syslog(3). Important lines also go to standard error as
/// `<P>text`, in order and before the call returns. It is the log's sink from construction to destruction.
/// While no process listens to the system log, lines that standard error does not take are not even
/// formatted.
class HostLog final : public LogSink {
 public:
  enum class SystemLog { Used, Unused };

  struct Options {
    std::string programName{};
    /// Lines of this priority number and lower go to standard error; -1 for none.
    int standardErrorLevel = -1;
    SystemLog systemLog = SystemLog::Used;
    /// The socket of the system log's listener.
    std::filesystem::path systemLogSocket = "/dev/log";
    /// How often the queue looks for the listener.
    std::chrono::milliseconds probeInterval = std::chrono::seconds(5);
    /// Replaces syslog(3). Runs on a separate thread.
    std::function<void(int priority, const std::string& text)> writeSystemLog{};
  };

  explicit HostLog(Options options);
  HostLog(const HostLog&) = delete;
  HostLog& operator=(const HostLog&) = delete;
  /// Waits at most half a second for syslog(3) to take the rest.
  ~HostLog() override;

  void write(int priority, std::string_view text) override;
  /// Waits until syslog(3) has taken every line, at most half a second.
  void giveTime();

 private:
  const int _standardErrorLevel;
  std::unique_ptr<SystemLogQueue> _systemLog;  // null when it is not used
};

}  // namespace varnel
