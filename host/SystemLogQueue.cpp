#include "host/SystemLogQueue.h"

#include <pthread.h>
#include <sys/socket.h>
#include <sys/un.h>
#include <syslog.h>
#include <unistd.h>

#include <cerrno>
#include <condition_variable>
#include <csignal>
#include <cstring>
#include <mutex>
#include <thread>
#include <utility>
#include <vector>

#include "base/Log.h"

namespace varnel {

namespace {

using Clock = std::chrono::steady_clock;

constexpr std::size_t mostLines = 4096;
constexpr std::size_t mostBytes = 1 << 20;
constexpr std::chrono::milliseconds patience{500};

struct Line {
  int priority;
  std::string text;
};

bool somebodyListens(const std::filesystem::path& path) {
  sockaddr_un address{};
  address.sun_family = AF_UNIX;
  if (path.native().size() >= sizeof address.sun_path) return false;
  std::memcpy(address.sun_path, path.c_str(), path.native().size());
  const int probe = ::socket(AF_UNIX, SOCK_DGRAM | SOCK_NONBLOCK | SOCK_CLOEXEC, 0);
  if (probe < 0) return false;
  const bool isHeard = ::connect(probe, reinterpret_cast<const sockaddr*>(&address), sizeof address) == 0 ||
                       errno == EPROTOTYPE;  // a listener on a stream socket
  ::close(probe);
  return isHeard;
}

// The main thread takes all signals.
std::thread threadWithoutSignals(std::function<void()> body) {
  sigset_t all, before;
  ::sigfillset(&all);
  ::pthread_sigmask(SIG_SETMASK, &all, &before);
  std::thread thread(std::move(body));
  ::pthread_sigmask(SIG_SETMASK, &before, nullptr);
  return thread;
}

}  // namespace

struct SystemLogQueue::Shared {
  explicit Shared(Options given) : options(std::move(given)) {}

  const Options options;
  std::thread thread;
  std::mutex mutex;  // guards all members below
  std::condition_variable changed;
  std::condition_variable drained;
  std::vector<Line> waiting;
  std::size_t waitingBytes = 0;
  std::size_t lost = 0;
  bool isHeard = false;
  bool isWriting = false;
  bool isEnding = false;
  bool hasEnded = false;

  bool hasWork() const { return !waiting.empty() || lost > 0; }

  void write(int priority, const std::string& text) const {
    if (options.write) return options.write(priority, text);
    ::syslog(priority, "%s", text.c_str());
  }

  // Writes what is waiting, without holding the lock.
  void writeWaiting(std::unique_lock<std::mutex>& lock) {
    const auto lines = std::exchange(waiting, {});
    const std::size_t lostLines = std::exchange(lost, 0);
    waitingBytes = 0;
    isWriting = true;
    lock.unlock();
    for (const Line& line : lines) write(line.priority, line.text);
    if (lostLines > 0) {
      write(logWarningPriority,
            std::to_string(lostLines) + " log lines were lost: the system log takes them too slowly");
    }
    lock.lock();
    isWriting = false;
    if (!hasWork()) drained.notify_all();
  }

  void probe() {
    isHeard = somebodyListens(options.listener);
    if (options.onProbe) options.onProbe(isHeard);
  }
};

SystemLogQueue::SystemLogQueue(Options options) : _shared(std::make_shared<Shared>(std::move(options))) {
  _shared->probe();
  _shared->thread = threadWithoutSignals([shared = _shared] { run(shared); });
}

SystemLogQueue::~SystemLogQueue() {
  std::unique_lock lock(_shared->mutex);
  _shared->isEnding = true;
  _shared->changed.notify_one();
  const bool hasEnded = _shared->drained.wait_for(lock, patience, [this] { return _shared->hasEnded; });
  lock.unlock();
  if (hasEnded) {
    _shared->thread.join();
  } else {
    _shared->thread.detach();
  }
}

void SystemLogQueue::add(int priority, std::string_view text) {
  const std::lock_guard lock(_shared->mutex);
  if (!_shared->isHeard) return;
  if (_shared->waiting.size() == mostLines || mostBytes - _shared->waitingBytes < text.size()) {
    ++_shared->lost;
    return;
  }
  _shared->waitingBytes += text.size();
  _shared->waiting.push_back({priority, std::string(text)});
  _shared->changed.notify_one();
}

void SystemLogQueue::drain() {
  std::unique_lock lock(_shared->mutex);
  _shared->drained.wait_for(lock, patience, [this] { return !_shared->hasWork() && !_shared->isWriting; });
}

void SystemLogQueue::run(const std::shared_ptr<Shared>& shared) {
  Shared& s = *shared;
  ::openlog(s.options.programName.c_str(), LOG_PID, LOG_USER);
  std::unique_lock lock(s.mutex);
  for (auto nextProbe = Clock::now() + s.options.probeInterval; !s.isEnding || s.hasWork();) {
    s.changed.wait_until(lock, nextProbe, [&s] { return s.isEnding || s.hasWork(); });
    if (s.hasWork()) s.writeWaiting(lock);
    if (s.isEnding || Clock::now() < nextProbe) continue;
    s.probe();
    nextProbe = Clock::now() + s.options.probeInterval;
  }
  // Only this thread uses syslog(3), so this call cannot wait for another one that is stuck.
  ::closelog();
  s.hasEnded = true;
  s.drained.notify_all();
}

}  // namespace varnel
