#include "host/LinkMonitor.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "host/SocketConnection.h"
#include "host/SocketPorts.h"
#include "host/SocketTelephonyService.h"
#include "host/StreamReport.h"
#include "host/TelephonyListener.h"
#include "tests/support/EventLoop.h"
#include "tests/support/Process.h"
#include "tests/support/RawSocket.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;

// Does what a viewer does, step by step, in a folder that the test prepares.
class Link : public testing::Test {
 protected:
  std::unique_ptr<LocalPort> makeViewerPort() { return _ports.createLocalPort("viewer", ignore).port; }
  std::int64_t askForChannel() {
    const auto connection = _service.connect({});
    return connection ? connection->createLogChannel("viewer").error : -1;
  }
  std::unique_ptr<PeerThread> server(std::int64_t error, const SocketLimits& limits = {}) {
    return std::make_unique<PeerThread>([this, error, limits] {
      return std::make_shared<TelephonyListener>(
          _folder.path(),
          [error](std::string_view) {
            return TelephonyConnection::LogChannel{error, std::nullopt};
          },
          limits);
    });
  }
  std::string serverPath() const { return _folder.file("com.orvane.TelephonyServer"); }
  std::string trouble() const { return _link.linkReport().trouble; }
  std::string inFolder(const std::string& before, const std::string& after) const {
    return before + _folder.path().string() + after;
  }

  static std::optional<Bytes> ignore(std::int32_t /*identifier*/, ByteView /*data*/) { return std::nullopt; }

  TemporaryFolder _folder;
  LinkMonitor _link{_folder.path()};
  SocketPorts _ports{_folder.path(), &_link};
  SocketTelephonyService _service{_folder.path(), 300ms, &_link};
};

TEST_F(Link, HasNoTroubleBeforeItIsTried) {
  EXPECT_EQ(trouble(), "");
  EXPECT_EQ(_link.linkReport().serverNote, "");
  EXPECT_EQ(_link.linkReport().droppedByServer, 0u);
  EXPECT_EQ(_link.linkReport().tooLongForChannel, 0u);
}

TEST_F(Link, WithoutAServerNamesTheFolderAndWhatToType) {
  EXPECT_EQ(askForChannel(), -1);
  EXPECT_EQ(trouble(), inFolder("No telephony server serves in ",
                                "; start varnel-telephonyd, or name its folder with --runtime-dir"));
}

TEST_F(Link, TellsOfAServerThatWasKilled) {
  RawSocket::listeningAt(serverPath()).close();
  EXPECT_EQ(askForChannel(), -1);
  EXPECT_EQ(trouble(),
            inFolder("The telephony server in ",
                     " has ended; start varnel-telephonyd, or name its folder with --runtime-dir"));
}

TEST_F(Link, TellsOfAnotherViewer) {
  SocketPorts others(_folder.path());
  const auto port = others.createLocalPort("viewer", ignore).port;
  EXPECT_FALSE(makeViewerPort());
  EXPECT_EQ(trouble(), inFolder("Another viewer is at work in ",
                                "; end it, or give this one and a server a folder of their own with "
                                "--runtime-dir"));
}

TEST_F(Link, TellsOfAServerThatHangs) {
  const RawSocket silent = RawSocket::listeningAt(serverPath());
  EXPECT_EQ(askForChannel(), 4);
  EXPECT_EQ(trouble(), inFolder("The telephony server in ",
                                " does not answer; end varnel-telephonyd and start it again"));
}

// The queue of connections that nobody accepts is full. Another client is neither served nor made to wait.
TEST_F(Link, TellsOfAServerThatTakesNoConnections) {
  const RawSocket silent = RawSocket::listeningAt(serverPath());
  std::vector<std::unique_ptr<SocketConnection>> waiting;
  while (true) {
    auto opening = SocketConnection::open(serverPath());
    if (!opening.connection) break;
    waiting.push_back(std::move(opening.connection));
  }
  EXPECT_EQ(askForChannel(), -1);
  EXPECT_EQ(trouble(), inFolder("The telephony server in ",
                                " takes no connections; end varnel-telephonyd and start it again"));
}

TEST_F(Link, TellsOfAServerThatServesSixteenViewers) {
  const auto listener = server(8);
  EXPECT_EQ(askForChannel(), 8);
  EXPECT_EQ(trouble(),
            inFolder("The telephony server in ", " serves as many viewers as it can; end one of them"));
}

TEST_F(Link, TellsOfAServerWithoutRoomForAConnection) {
  const auto listener = server(0, {.connections = 1, .stay = std::chrono::hours(1)});
  const RawSocket other = RawSocket::connectedTo(serverPath());
  EXPECT_FALSE(other.receive().empty());
  EXPECT_EQ(askForChannel(), 10);
  EXPECT_EQ(trouble(), inFolder("The telephony server in ",
                                " has as many connections as it takes; end one of the programs that are "
                                "connected to it"));
}

TEST_F(Link, TellsOfMissingRightsAndOfOtherErrors) {
  {
    const auto listener = server(3);
    EXPECT_EQ(askForChannel(), 3);
    EXPECT_EQ(trouble(), inFolder("The telephony server in ",
                                  " gives this user no log channel; if it is this user's own, end it and "
                                  "start it again, else become a member of the group that its option "
                                  "--allow-group names"));
  }
  const auto listener = server(7);
  EXPECT_EQ(askForChannel(), 7);
  EXPECT_EQ(trouble(),
            inFolder("The telephony server in ", " made no log channel (error 7); its log lines say why"));
}

TEST_F(Link, TellsThatAPathIsTooLong) {
  const std::string name(200, 'n');
  EXPECT_FALSE(_ports.createLocalPort(name, ignore).port);
  EXPECT_EQ(trouble(), "The socket's path " + _folder.file(name) +
                           " is longer than 106 bytes: choose a runtime folder with a shorter one, with "
                           "--runtime-dir");
}

TEST_F(Link, TellsOfACommandThatGetsNoAnswer) {
  const RawSocket silent = RawSocket::listeningAt(_folder.file("commands"));
  const auto commands = _ports.createRemotePort("commands");
  EXPECT_EQ(trouble(), "");
  EXPECT_EQ(commands->sendRequest(0, {}, 1s, 50ms).status, RemotePort::receiveTimeout);
  EXPECT_EQ(trouble(), inFolder("The telephony server in ",
                                " does not answer; end varnel-telephonyd and start it again"));
}

TEST_F(Link, ThatIsOpenHasNoTroubleAndForgetsWhatWasToldOfTheOneBefore) {
  EXPECT_EQ(askForChannel(), -1);
  _link.takeStreamReport(writeStreamReport({"x", 1, 2}));
  const RawSocket listener = RawSocket::listeningAt(_folder.file("commands"));
  ASSERT_TRUE(_ports.createRemotePort("commands"));
  EXPECT_EQ(trouble(), "");
  EXPECT_EQ(_link.linkReport().serverNote, "");
  EXPECT_EQ(_link.linkReport().droppedByServer, 0u);
  EXPECT_EQ(_link.linkReport().tooLongForChannel, 0u);
}

TEST_F(Link, PassesOnWhatTheServerTellsBesideItsMessages) {
  const auto port = makeViewerPort();
  ASSERT_TRUE(port);
  port->deliverOnMainQueue();
  SocketPorts server(_folder.path());
  const auto viewer = server.createRemotePort("viewer");
  viewer->sendRequest(1, writeStreamReport({"the replay of walk.pcap has ended", 5, 7}), 0ms, std::nullopt);
  ASSERT_TRUE(runUntil([this] { return !_link.linkReport().serverNote.empty(); }));
  EXPECT_EQ(_link.linkReport().serverNote, "The replay of walk.pcap has ended");
  EXPECT_EQ(_link.linkReport().droppedByServer, 5u);
  EXPECT_EQ(_link.linkReport().tooLongForChannel, 7u);
}

TEST(StreamReport, IsReadAsItWasWritten) {
  const StreamReport report{"one & \"two\"", 12345678901, 3};
  EXPECT_EQ(readStreamReport(writeStreamReport(report)), report);
}

TEST(StreamReport, WithoutANoteThatAPropertyListCanHoldKeepsItsNumbers) {
  EXPECT_EQ(readStreamReport(writeStreamReport({"\x01", 1, 2})), (StreamReport{"", 1, 2}));
}

TEST(StreamReport, IsNothingElse) {
  EXPECT_EQ(readStreamReport({}), std::nullopt);
  const std::string odd =
      "<plist version=\"1.0\"><dict><key>Note</key><integer>1</integer><key>Dropped</key>"
      "<integer>-1</integer></dict></plist>";
  EXPECT_EQ(readStreamReport(Bytes(odd.begin(), odd.end())), StreamReport());
}

}  // namespace
}  // namespace varnel
