#include "host/ChildServer.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cerrno>
#include <csignal>
#include <cstdlib>
#include <fstream>
#include <memory>

#include "host/EndingServers.h"
#include "host/ServerControl.h"
#include "tests/support/EventLoop.h"
#include "tests/support/Process.h"

namespace varnel {
namespace {

namespace fs = std::filesystem;
using testing::EndsWith;
using testing::HasSubstr;

// Real servers in private folders below a folder of the test.
class ChildServerTest : public testing::Test {
 protected:
  ChildServerTest() { ::setenv("XDG_RUNTIME_DIR", _session.path().c_str(), 1); }

  void start(const std::vector<std::string>& arguments,
             const std::string& program = VARNEL_TELEPHONYD_PROGRAM) {
    _server = std::make_unique<ChildServer>(
        program, arguments,
        ChildServer::Handlers{.ready = [this] { ++_timesReady; },
                              .ended = [this](const std::string& why) { _why = why; }});
  }
  bool waitUntilReady() {
    return runUntil([this] { return _timesReady > 0; });
  }
  bool waitUntilEnded() {
    return runUntil([this] { return _why.has_value(); });
  }
  static bool isRunning(qint64 process) { return ::kill(static_cast<pid_t>(process), 0) == 0; }

  TemporaryFolder _session;
  std::unique_ptr<ChildServer> _server;
  int _timesReady = 0;
  std::optional<std::string> _why;
};

TEST_F(ChildServerTest, CanBeConnectedToWhenItIsReady) {
  start({"--simulate", "kalvi-lte"});
  EXPECT_FALSE(_server->isReady());
  ASSERT_TRUE(waitUntilReady());
  EXPECT_TRUE(_server->isReady());
  EXPECT_EQ(ServerControl(_server->folder()).status().technology, "kalvi-lte");
  EXPECT_EQ(_timesReady, 1);
  EXPECT_FALSE(_why);
}

TEST_F(ChildServerTest, EndsWithTheObjectAndLeavesNothing) {
  start({"--simulate", "kalvi-lte"});
  ASSERT_TRUE(waitUntilReady());
  const qint64 process = _server->processId();
  EXPECT_TRUE(isRunning(process));
  _server.reset();
  EXPECT_FALSE(isRunning(process));
  EXPECT_TRUE(fs::is_empty(_session.path()));
  EXPECT_FALSE(_why);
}

TEST_F(ChildServerTest, AServerThatTakesNoSignalsIsKilled) {
  start({"--simulate", "kalvi-lte"});
  ASSERT_TRUE(waitUntilReady());
  const qint64 process = _server->processId();
  ::kill(static_cast<pid_t>(process), SIGSTOP);
  _server.reset();
  EXPECT_FALSE(isRunning(process));
  EXPECT_TRUE(fs::is_empty(_session.path()));
}

TEST_F(ChildServerTest, TheEndIsNotWaitedFor) {
  start({"--simulate", "kalvi-lte"});
  ASSERT_TRUE(waitUntilReady());
  const qint64 process = _server->processId();
  EndingServers ending;
  ending.add(std::move(_server));
  EXPECT_EQ(ending.size(), 1u);
  EXPECT_TRUE(runUntil([&] { return ending.size() == 0; }));
  EXPECT_FALSE(isRunning(process));
  EXPECT_TRUE(fs::is_empty(_session.path()));
  EXPECT_FALSE(_why) << "it did not end by itself";
}

TEST_F(ChildServerTest, AServerThatTakesNoSignalsIsKilledWithoutWaiting) {
  start({"--simulate", "kalvi-lte"});
  ASSERT_TRUE(waitUntilReady());
  const qint64 process = _server->processId();
  ::kill(static_cast<pid_t>(process), SIGSTOP);
  EndingServers ending;
  ending.add(std::move(_server));
  EXPECT_TRUE(isRunning(process)) << "three seconds are not over";
  EXPECT_TRUE(runUntil([&] { return ending.size() == 0; }));
  EXPECT_FALSE(isRunning(process));
}

TEST_F(ChildServerTest, ServersThatEndGoWithTheirList) {
  start({"--simulate", "kalvi-lte"});
  ASSERT_TRUE(waitUntilReady());
  const qint64 process = _server->processId();
  {
    EndingServers ending;
    ending.add(std::move(_server));
  }
  EXPECT_FALSE(isRunning(process));
  EXPECT_TRUE(fs::is_empty(_session.path()));
}

TEST_F(ChildServerTest, AServerThatHasEndedIsLetGo) {
  start({"--replay=/no such file"});
  ASSERT_TRUE(waitUntilEnded());
  EndingServers ending;
  ending.add(std::move(_server));
  ending.add(nullptr);
  EXPECT_TRUE(runUntil([&] { return ending.size() == 0; }));
}

TEST_F(ChildServerTest, AFileThatIsNotThereIsTold) {
  start({"--replay=/no such file"});
  ASSERT_TRUE(waitUntilEnded());
  EXPECT_EQ(*_why, "cannot open /no such file: No such file or directory");
  EXPECT_TRUE(_server->hasEnded());
  EXPECT_FALSE(_server->isReady());
}

TEST_F(ChildServerTest, AFileThatIsNoCaptureIsTold) {
  const std::string path = _session.file("notes");
  std::ofstream(path) << "a text of some length, which is no capture of a modem at all\n";
  start({"--replay=" + path});
  ASSERT_TRUE(waitUntilEnded());
  EXPECT_THAT(*_why, HasSubstr(path + " holds text, no capture"));
}

TEST_F(ChildServerTest, AServerThatIsKilledIsTold) {
  start({"--simulate", "kalvi-lte"});
  ASSERT_TRUE(waitUntilReady());
  ::kill(static_cast<pid_t>(_server->processId()), SIGKILL);
  ASSERT_TRUE(waitUntilEnded());
  EXPECT_EQ(*_why, "the server was ended by a signal");
}

TEST_F(ChildServerTest, AServerThatIsAskedToEndIsTold) {
  start({"--simulate", "kalvi-lte"});
  ASSERT_TRUE(waitUntilReady());
  ServerControl(_server->folder()).stop();
  ASSERT_TRUE(waitUntilEnded());
  EXPECT_EQ(*_why, "the server has ended");
}

TEST_F(ChildServerTest, AProgramThatIsNotThereIsTold) {
  start({}, "/no such program");
  ASSERT_TRUE(waitUntilEnded());
  EXPECT_THAT(*_why, HasSubstr("/no such program cannot be started: "));
  EXPECT_THAT(*_why, EndsWith("; install it beside varnel"));
}

TEST_F(ChildServerTest, TheProgramIsLookedForInThePath) {
  ::setenv("PATH", fs::path(VARNEL_TELEPHONYD_PROGRAM).parent_path().c_str(), 1);
  EXPECT_EQ(serverProgram(), VARNEL_TELEPHONYD_PROGRAM);
  ::setenv("PATH", _session.path().c_str(), 1);
  EXPECT_EQ(serverProgram(), "varnel-telephonyd");
}

}  // namespace
}  // namespace varnel
