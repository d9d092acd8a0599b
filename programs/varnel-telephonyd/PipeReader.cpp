#include "programs/varnel-telephonyd/PipeReader.h"

#include <poll.h>
#include <pthread.h>
#include <sys/eventfd.h>
#include <unistd.h>

#include <cerrno>
#include <condition_variable>
#include <csignal>
#include <mutex>
#include <system_error>
#include <thread>
#include <utility>

#include "host/FileDescriptor.h"
#include "host/captures/Capture.h"

namespace varnel {

namespace {

// A record that is left out is longer than 1 MiB, so there are few lines, unless somebody makes them.
constexpr std::size_t mostLines = 16;

// The bytes of a pipe. Reading ends when the stop event is set, also while it waits.
class PipeBytes final : public ByteSource {
 public:
  PipeBytes(int pipe, int stopEvent, std::string name, bool& hasWaited)
      : _pipe(pipe), _stopEvent(stopEvent), _name(std::move(name)), _hasWaited(hasWaited) {}

  std::size_t read(std::span<std::uint8_t> room) override {
    for (;;) {
      if (!waitForBytes()) return 0;
      const ssize_t count = ::read(_pipe, room.data(), room.size());
      if (count < 0 && (errno == EINTR || errno == EAGAIN)) continue;
      if (count < 0)
        throw CaptureError("cannot read " + _name + ": " + std::generic_category().message(errno));
      _bytesRead += static_cast<std::uint64_t>(count);
      return static_cast<std::size_t>(count);
    }
  }
  std::uint64_t bytesRead() const override { return _bytesRead; }
  std::optional<std::uint64_t> fileSize() const override { return std::nullopt; }

 private:
  // False when it is time to stop.
  bool waitForBytes() {
    pollfd files[] = {{.fd = _pipe, .events = POLLIN, .revents = 0},
                      {.fd = _stopEvent, .events = POLLIN, .revents = 0}};
    int timeout_ms = 0;
    for (;;) {
      const int ready = ::poll(files, std::size(files), timeout_ms);
      if (ready < 0 && errno != EINTR)
        throw CaptureError("cannot wait for " + _name + ": " + std::generic_category().message(errno));
      if (ready > 0) return files[1].revents == 0;
      if (ready == 0) _hasWaited = true;
      timeout_ms = -1;
    }
  }

  const int _pipe;
  const int _stopEvent;
  const std::string _name;
  bool& _hasWaited;
  std::uint64_t _bytesRead = 0;
};

}  // namespace

struct PipeReader::Shared {
  const int pipe;
  const std::string name;
  const FileDescriptor stopEvent{::eventfd(0, EFD_CLOEXEC)};
  std::function<void()> arrived{};
  std::thread thread{};

  // Of the thread, once it runs.
  std::unique_ptr<Capture> capture{};
  bool hasWaited = false;
  std::vector<std::string> lines{};
  std::size_t otherLines = 0;

  std::mutex mutex{};  // guards all members below
  std::condition_variable changed{};
  bool isRequested = false;
  bool isEnding = false;
  std::optional<RecordReading> reading{};

  void open() {
    if (capture) return;
    capture = openCapture(CaptureInput{
        .bytes = ByteWindow(std::make_unique<PipeBytes>(pipe, stopEvent.number(), name, hasWaited)),
        .name = name,
        .tell = [this](const std::string& line) { keep(line); }});
  }

  void keep(const std::string& line) {
    if (lines.size() < mostLines) {
      lines.push_back(line);
    } else {
      ++otherLines;
    }
  }

  RecordReading read() {
    RecordReading result;
    hasWaited = false;
    try {
      open();
      CaptureRecord record;
      if (capture->next(record)) {
        result.time = record.time;
        result.message.assign(record.message.begin(), record.message.end());
        result.subscription = record.subscription;
      } else {
        result.isEnd = true;
      }
    } catch (const CaptureError& error) {
      result.isEnd = true;
      result.error = error.what();
    }
    result.wasAwaited = hasWaited;
    result.lines = std::exchange(lines, {});
    if (const std::size_t others = std::exchange(otherLines, 0); others > 0)
      result.lines.push_back(std::to_string(others) + " more records of " + name + " are left out");
    return result;
  }

  void run() {
    std::unique_lock lock(mutex);
    for (;;) {
      changed.wait(lock, [this] { return isRequested || isEnding; });
      if (isEnding) return;
      isRequested = false;
      lock.unlock();
      RecordReading result = read();
      lock.lock();
      if (isEnding) return;
      reading = std::move(result);
      lock.unlock();
      arrived();
      lock.lock();
    }
  }
};

PipeReader::PipeReader(int descriptor, std::string name)
    : _shared(new Shared{.pipe = descriptor, .name = std::move(name)}) {
  if (!_shared->stopEvent.isOpen())
    throw std::system_error(errno, std::generic_category(), "cannot make an event for " + _shared->name);
}

PipeReader::~PipeReader() {
  if (!_shared->thread.joinable()) return;
  {
    const std::lock_guard lock(_shared->mutex);
    _shared->isEnding = true;
    _shared->changed.notify_one();
  }
  ::eventfd_write(_shared->stopEvent.number(), 1);
  _shared->thread.join();
}

bool PipeReader::isReadable() const {
  pollfd file{.fd = _shared->pipe, .events = POLLIN, .revents = 0};
  return ::poll(&file, 1, 0) > 0;
}

std::optional<std::string> PipeReader::technology() {
  _shared->open();
  return _shared->capture->technology();
}

// The main thread takes all signals.
void PipeReader::start(std::function<void()> arrived) {
  _shared->arrived = std::move(arrived);
  sigset_t all, before;
  ::sigfillset(&all);
  ::pthread_sigmask(SIG_SETMASK, &all, &before);
  _shared->thread = std::thread([shared = _shared.get()] { shared->run(); });
  ::pthread_sigmask(SIG_SETMASK, &before, nullptr);
}

void PipeReader::request() {
  const std::lock_guard lock(_shared->mutex);
  _shared->isRequested = true;
  _shared->changed.notify_one();
}

std::optional<RecordReading> PipeReader::take() {
  const std::lock_guard lock(_shared->mutex);
  return std::exchange(_shared->reading, std::nullopt);
}

}  // namespace varnel
