#include "host/NearestServer.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/stat.h>

#include "host/LinkMonitor.h"
#include "host/TelephonyListener.h"
#include "tests/support/EventLoop.h"
#include "tests/support/OtherUser.h"
#include "tests/support/Process.h"

namespace varnel {
namespace {

namespace fs = std::filesystem;
using namespace std::chrono_literals;
using testing::HasSubstr;

class NearestServerTest : public testing::Test {
 protected:
  void makeSystemsFolder() {
    fs::create_directory(_system);
    ASSERT_EQ(::chmod(_system.c_str(), 03770), 0);
  }
  // A server whose command port tells where it is.
  static std::unique_ptr<PeerThread> serverIn(const fs::path& folder) {
    return std::make_unique<PeerThread>([folder] {
      return std::make_shared<TelephonyListener>(folder, [folder](std::string_view) {
        return TelephonyConnection::LogChannel{0, folder.filename().string()};
      });
    });
  }
  // Where the server is that a viewer finds; empty when it finds none.
  std::string found() {
    const auto local = _nearest.createLocalPort("viewer", {});
    EXPECT_TRUE(local.port);
    _portsAreIn = fs::exists(_own / "viewer") ? "own" : "system";
    const auto connection = _nearest.connect({});
    if (!connection) return "";
    return connection->createLogChannel("viewer").portName.value_or("no name");
  }

  TemporaryFolder _folder;
  const fs::path _own = _folder.path() / "own", _system = _folder.path() / "system";
  const bool _isMade = fs::create_directory(_own);
  LinkMonitor _monitor{_own};
  NearestServer _nearest{_own, _system, _monitor, 1min};
  std::string _portsAreIn;
};

TEST_F(NearestServerTest, IsInTheOwnFolderFirst) {
  makeSystemsFolder();
  const auto system = serverIn(_system), own = serverIn(_own);
  EXPECT_EQ(found(), "own");
  EXPECT_EQ(_portsAreIn, "own");
}

TEST_F(NearestServerTest, IsInTheSystemsFolderIfTheOwnOneHasNone) {
  makeSystemsFolder();
  const auto system = serverIn(_system);
  EXPECT_EQ(found(), "system");
  EXPECT_EQ(_portsAreIn, "system");
  EXPECT_EQ(_monitor.linkReport().place, _system.string());
}

TEST_F(NearestServerTest, IsLookedForAnewWithEachLocalPort) {
  EXPECT_EQ(found(), "");
  EXPECT_EQ(_portsAreIn, "own");
  EXPECT_THAT(_monitor.linkReport().trouble, HasSubstr("No telephony server serves in " + _own.string()));
  makeSystemsFolder();
  {
    const auto system = serverIn(_system);
    EXPECT_EQ(found(), "system");
  }
  EXPECT_EQ(found(), "");
  const auto own = serverIn(_own);
  EXPECT_EQ(found(), "own");
}

TEST_F(NearestServerTest, IsNotInAFolderThatIsNotShared) {
  fs::create_directory(_system);
  ::chmod(_system.c_str(), 0777);
  const auto system = serverIn(_system);
  EXPECT_EQ(found(), "");
}

TEST_F(NearestServerTest, IsInTheNamedFolderAloneIfThereIsOne) {
  makeSystemsFolder();
  const auto system = serverIn(_system);
  NearestServer nearest{_own, std::nullopt, _monitor, 1min};
  EXPECT_FALSE(nearest.connect({}));
}

TEST_F(NearestServerTest, IsInTheOtherFolderAfterAMove) {
  makeSystemsFolder();
  const fs::path other = _folder.path() / "other";
  fs::create_directory(other);
  const auto system = serverIn(_system), own = serverIn(_own), moved = serverIn(other);
  EXPECT_EQ(found(), "own");
  _nearest.moveTo(other, std::nullopt);
  EXPECT_EQ(found(), "other");
  EXPECT_EQ(_monitor.linkReport().place, other.string());
  _nearest.moveTo(_own, _system);
  EXPECT_EQ(found(), "own");
}

TEST_F(NearestServerTest, AMoveEndsWhatTheMonitorTellsOfTheDisplay) {
  _monitor.subscriptionIsShown(1);
  _monitor.subscriptionIsShown(2);
  EXPECT_NE(_monitor.linkReport().mixture, "");
  _nearest.moveTo(_own, std::nullopt);
  EXPECT_EQ(_monitor.linkReport().mixture, "");
}

TEST_F(NearestServerTest, TheEndOfAServerOfOnesOwnIsToldInPlaceOfTheTrouble) {
  EXPECT_EQ(found(), "");
  _monitor.setEndOfOwnServer("The server that plays walk.pcap has ended");
  EXPECT_EQ(_monitor.linkReport().trouble, "The server that plays walk.pcap has ended");
  _monitor.setEndOfOwnServer({});
  EXPECT_THAT(_monitor.linkReport().trouble, HasSubstr("No telephony server serves in "));
}

// If the test is root, the viewer is another user's. Otherwise it may use the folder, and finds the server.
TEST_F(NearestServerTest, WhoIsNoMemberLearnsWhichGroupTheSystemsServerServes) {
  makeSystemsFolder();
  ::chmod(_folder.path().c_str(), 0777);
  ::chmod(_own.c_str(), 0777);
  const auto system = serverIn(_system);
  const std::string group = groupName(::getegid());
  const int result = inAnotherProcess(unusedGroup, [this, &group] {
    if (!canBecomeAnotherUser()) return found() == "system" ? 0 : 1;
    if (!found().empty()) return 2;
    const std::string trouble = _monitor.linkReport().trouble;
    return trouble.ends_with("; the one in " + _system.string() + " serves members of the group " + group)
               ? 0
               : 3;
  });
  EXPECT_EQ(result, 0);
}

}  // namespace
}  // namespace varnel
