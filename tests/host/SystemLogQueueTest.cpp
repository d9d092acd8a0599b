#include "host/SystemLogQueue.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <atomic>
#include <condition_variable>
#include <mutex>
#include <vector>

#include "tests/support/Process.h"
#include "tests/support/RawSocket.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;
using Clock = std::chrono::steady_clock;
using testing::ElementsAre;

// A system log that keeps lines, and stops reading while a test says so. The queue's thread shares it, since
// the thread may outlive the test.
class FakeSystemLog : public std::enable_shared_from_this<FakeSystemLog> {
 public:
  std::function<void(int, const std::string&)> writer() {
    return [self = shared_from_this()](int priority, const std::string& text) {
      std::unique_lock lock(self->_mutex);
      self->_isBusy = true;
      self->_changed.notify_all();
      self->_changed.wait(lock, [&] { return self->_reads; });
      self->_lines.push_back(std::to_string(priority) + ":" + text);
    };
  }
  void stopReading() { setReads(false); }
  void readAgain() { setReads(true); }
  void waitUntilBusy() {
    std::unique_lock lock(_mutex);
    _changed.wait(lock, [&] { return _isBusy; });
  }
  std::vector<std::string> lines() {
    const std::lock_guard lock(_mutex);
    return _lines;
  }

 private:
  void setReads(bool reads) {
    const std::lock_guard lock(_mutex);
    _reads = reads;
    _changed.notify_all();
  }

  std::mutex _mutex;
  std::condition_variable _changed;
  bool _reads = true;
  bool _isBusy = false;
  std::vector<std::string> _lines;
};

class SystemLogQueueTest : public testing::Test {
 protected:
  SystemLogQueue::Options options() {
    return {.programName = "tests",
            .listener = _folder.file("log"),
            .probeInterval = 20ms,
            .write = _log->writer(),
            .onProbe = [this](bool isHeard) { _isHeard = isHeard; }};
  }

  TemporaryFolder _folder;
  std::shared_ptr<FakeSystemLog> _log = std::make_shared<FakeSystemLog>();
  std::atomic<bool> _isHeard = false;
};

TEST_F(SystemLogQueueTest, WritesLinesInOrderWithTheirPrioritiesAsTheyAre) {
  const RawSocket listener = RawSocket::receivingAt(_folder.file("log"));
  {
    SystemLogQueue queue(options());
    EXPECT_TRUE(_isHeard);
    queue.add(3, "one");
    queue.add(16, " two\n");
    queue.add(4, "%s three");
  }
  EXPECT_THAT(_log->lines(), ElementsAre("3:one", "16: two\n", "4:%s three"));
}

TEST_F(SystemLogQueueTest, DrainingWaitsForEveryLine) {
  const RawSocket listener = RawSocket::receivingAt(_folder.file("log"));
  SystemLogQueue queue(options());
  for (int i = 0; i < 1000; ++i) queue.add(3, "line");
  queue.drain();
  EXPECT_EQ(_log->lines().size(), 1000u);
}

TEST_F(SystemLogQueueTest, NoticesListenersThatComeAndGo) {
  SystemLogQueue queue(options());
  EXPECT_FALSE(_isHeard);
  queue.add(3, "unheard");
  {
    const RawSocket listener = RawSocket::receivingAt(_folder.file("log"));
    EXPECT_TRUE(eventually([&] { return _isHeard.load(); }));
    queue.add(3, "heard");
  }
  EXPECT_TRUE(eventually([&] { return !_isHeard; }));
  queue.drain();
  EXPECT_THAT(_log->lines(), ElementsAre("3:heard"));
}

TEST_F(SystemLogQueueTest, AListenerOnAStreamSocketCounts) {
  const RawSocket listener = RawSocket::listeningAt(_folder.file("log"));
  const SystemLogQueue queue(options());
  EXPECT_TRUE(_isHeard);
}

TEST_F(SystemLogQueueTest, CountsWhatDoesNotFitAndReportsItInOneLine) {
  const RawSocket listener = RawSocket::receivingAt(_folder.file("log"));
  SystemLogQueue queue(options());
  _log->stopReading();
  queue.add(3, "stuck");
  _log->waitUntilBusy();
  // A program that waited for the log here would wait forever.
  for (int i = 0; i < 5000; ++i) queue.add(3, "waiting");
  _log->readAgain();
  queue.drain();
  const auto lines = _log->lines();
  ASSERT_EQ(lines.size(), 1u + 4096u + 1u);
  EXPECT_EQ(lines.back(), "4:904 log lines were lost: the system log takes them too slowly");
}

TEST_F(SystemLogQueueTest, TheBytesThatWaitAreBoundedToo) {
  const RawSocket listener = RawSocket::receivingAt(_folder.file("log"));
  SystemLogQueue queue(options());
  _log->stopReading();
  queue.add(3, "stuck");
  _log->waitUntilBusy();
  const std::string quarter(262144, 'x');
  for (int i = 0; i < 6; ++i) queue.add(3, quarter);
  _log->readAgain();
  queue.drain();
  const auto lines = _log->lines();
  ASSERT_EQ(lines.size(), 1u + 4u + 1u);
  EXPECT_EQ(lines.back(), "4:2 log lines were lost: the system log takes them too slowly");
}

TEST_F(SystemLogQueueTest, AThreadThatIsStuckIsLeftBehind) {
  const RawSocket listener = RawSocket::receivingAt(_folder.file("log"));
  const auto start = Clock::now();
  {
    SystemLogQueue queue(options());
    _log->stopReading();
    queue.add(3, "stuck");
    queue.add(3, "behind it");
    queue.drain();
  }
  EXPECT_GE(Clock::now() - start, 900ms);
  _log->readAgain();
  EXPECT_TRUE(eventually([&] { return _log->lines().size() == 2; }));
}

}  // namespace
}  // namespace varnel
