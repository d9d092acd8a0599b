#include "host/HostLog.h"

#include <gtest/gtest.h>

#include <mutex>
#include <vector>

#include "tests/support/Process.h"
#include "tests/support/RawSocket.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;

class HostLogTest : public testing::Test {
 protected:
  HostLog::Options options(int level) {
    return {.programName = "tests",
            .standardErrorLevel = level,
            .systemLogSocket = _folder.file("log"),
            .probeInterval = 20ms,
            .writeSystemLog = [this](int priority, const std::string& text) {
              const std::lock_guard lock(_mutex);
              _systemLog += std::to_string(priority) + ":" + text + "|";
            }};
  }
  std::string systemLog() {
    const std::lock_guard lock(_mutex);
    return _systemLog;
  }

  TemporaryFolder _folder;

 private:
  std::mutex _mutex;
  std::string _systemLog;
};

TEST_F(HostLogTest, WritesImportantLinesToStandardErrorBeforeTheCallReturns) {
  const HostLog log(options(3));
  testing::internal::CaptureStderr();
  logError("first %d", 1);
  logWarning("not that important");
  logError("a newline at the end is not doubled\n");
  logError("but two\n\n stay two\n\n");
  logError("");
  EXPECT_EQ(testing::internal::GetCapturedStderr(),
            "<3>first 1\n<3>a newline at the end is not doubled\n<3>but two\n\n stay two\n\n<3>\n");
}

TEST_F(HostLogTest, TheExportsOwnPriorityIsPassedOn) {
  const RawSocket listener = RawSocket::receivingAt(_folder.file("log"));
  HostLog log(options(16));
  testing::internal::CaptureStderr();
  logLine(logExportFailurePriority, "export");
  EXPECT_EQ(testing::internal::GetCapturedStderr(), "<16>export\n");
  log.giveTime();
  EXPECT_EQ(systemLog(), "16:export|");
}

TEST_F(HostLogTest, EveryLineGoesToTheSystemLog) {
  const RawSocket listener = RawSocket::receivingAt(_folder.file("log"));
  {
    const HostLog log(options(-1));
    testing::internal::CaptureStderr();
    logError("one");
    logLine(7, "two");
    logLine(logExportFailurePriority, "three");
    EXPECT_EQ(testing::internal::GetCapturedStderr(), "");
  }
  EXPECT_EQ(systemLog(), "3:one|7:two|16:three|");
}

TEST_F(HostLogTest, TakesOnlyWhatStandardErrorWantsWhileNobodyListens) {
  const HostLog log(options(3));
  EXPECT_TRUE(logTakes(3));
  EXPECT_FALSE(logTakes(4));
  const RawSocket listener = RawSocket::receivingAt(_folder.file("log"));
  EXPECT_TRUE(eventually([] { return logTakes(16); }));
}

TEST_F(HostLogTest, TakesNothingWhenNobodyWantsAnything) {
  {
    const HostLog log(options(-1));
    EXPECT_FALSE(logTakes(0));
  }
  const HostLog log({.programName = "tests", .systemLog = HostLog::SystemLog::Unused});
  EXPECT_FALSE(logTakes(0));
}

TEST_F(HostLogTest, IsTheSinkAsLongAsItLives) {
  const RawSocket listener = RawSocket::receivingAt(_folder.file("log"));
  {
    const HostLog log(options(3));
    EXPECT_EQ(logSink(), &log);
  }
  EXPECT_EQ(logSink(), nullptr);
  EXPECT_FALSE(logTakes(0));
  std::this_thread::sleep_for(50ms);
  EXPECT_FALSE(logTakes(0));
}

}  // namespace
}  // namespace varnel
