#include "host/HostLog.h"

#include <unistd.h>

#include <cerrno>
#include <limits>
#include <utility>

namespace varnel {

namespace {

constexpr int noLevel = -1;
constexpr int everyLevel = std::numeric_limits<int>::max();

// One call writes the whole line, so that lines of several processes on one terminal do not mix.
void writeStandardError(int priority, std::string_view text) {
  std::string line = '<' + std::to_string(priority) + '>';
  line += text;
  if (!line.ends_with('\n')) line += '\n';
  for (std::string_view rest = line; !rest.empty();) {
    const ssize_t written = ::write(STDERR_FILENO, rest.data(), rest.size());
    if (written < 0 && errno == EINTR) continue;
    if (written < 0) return;
    rest.remove_prefix(static_cast<std::size_t>(written));
  }
}

}  // namespace

HostLog::HostLog(Options options) : _standardErrorLevel(options.standardErrorLevel) {
  setLogSink(this, _standardErrorLevel);
  if (options.systemLog == SystemLog::Unused) return;
  _systemLog = std::make_unique<SystemLogQueue>(SystemLogQueue::Options{
      .programName = std::move(options.programName),
      .listener = std::move(options.systemLogSocket),
      .probeInterval = options.probeInterval,
      .write = std::move(options.writeSystemLog),
      .onProbe = [level = _standardErrorLevel](
                     bool isHeard) { setHighestLogPriority(isHeard ? everyLevel : level); },
  });
}

HostLog::~HostLog() {
  _systemLog.reset();  // first: its thread changes which priorities are taken
  setLogSink(nullptr, noLevel);
}

void HostLog::write(int priority, std::string_view text) {
  if (priority <= _standardErrorLevel) writeStandardError(priority, text);
  if (_systemLog) _systemLog->add(priority, text);
}

void HostLog::giveTime() {
  if (_systemLog) _systemLog->drain();
}

}  // namespace varnel
