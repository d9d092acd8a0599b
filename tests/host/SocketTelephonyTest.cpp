#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <sys/stat.h>
#include <sys/wait.h>

#include <csignal>
#include <fstream>
#include <stdexcept>

#include "base/Dictionary.h"
#include "base/PropertyList.h"
#include "host/PortFrame.h"
#include "host/SocketTelephonyService.h"
#include "host/TelephonyListener.h"
#include "tests/support/EventLoop.h"
#include "tests/support/OtherUser.h"
#include "tests/support/Process.h"
#include "tests/support/RawSocket.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;

Bytes requestFrame(std::string_view dictionary) {
  const std::string list = "<plist version=\"1.0\">" + std::string(dictionary) + "</plist>";
  Bytes bytes;
  appendFrame(bytes, {5, FrameMark::Request, Bytes(list.begin(), list.end())});
  return bytes;
}

class SocketTelephony : public testing::Test {
 protected:
  // A server whose channel maker returns that channel.
  std::unique_ptr<PeerThread> server(const TelephonyConnection::LogChannel& channel) {
    return std::make_unique<PeerThread>([this, channel] {
      return std::make_shared<TelephonyListener>(_folder.path(), [this, channel](std::string_view name) {
        _askedFor = name;
        return channel;
      });
    });
  }

  // The error with which a listener answers a request.
  std::int64_t errorOf(std::string_view request) {
    const TelephonyListener listener(_folder.path(), [this](std::string_view name) {
      _askedFor = name;
      return TelephonyConnection::LogChannel{0, "commands"};
    });
    const RawSocket client = RawSocket::connectedTo(path());
    client.send(requestFrame(request));
    FrameReader reader;
    std::optional<Value> reply;
    runUntil([&] {
      if (client.waits(0ms)) reader.feed(client.receive());
      while (const auto frame = reader.next()) {
        if (frame->mark == FrameMark::Reply && frame->identifier == 5)
          reply = readPropertyList(frame->payload);
      }
      return reply.has_value();
    });
    return reply ? reply->dictionary()->get("Error").integer().value_or(-1) : -2;
  }

  std::string path() const { return _folder.file("com.orvane.TelephonyServer"); }

  TemporaryFolder _folder;
  SocketTelephonyService _service{_folder.path(), 1min};
  // For requests that get no answer.
  SocketTelephonyService _impatientService{_folder.path(), 300ms};
  std::string _askedFor;
  int _notifications = 0;
};

TEST_F(SocketTelephony, CannotBeReachedWhenNobodyListens) {
  EXPECT_FALSE(_service.connect([] {}));
}

TEST_F(SocketTelephony, MakesALogChannel) {
  const auto listener = server({0, "com.orvane.commands"});
  const auto connection = _service.connect([] {});
  ASSERT_TRUE(connection);
  const auto channel = connection->createLogChannel("com.orvane.local");
  EXPECT_EQ(channel.error, 0);
  EXPECT_EQ(channel.portName, "com.orvane.commands");
  EXPECT_EQ(_askedFor, "com.orvane.local");
}

TEST_F(SocketTelephony, PassesErrorsAndAbsentPortNamesOn) {
  const auto listener = server({-77, std::nullopt});
  const auto connection = _service.connect({});
  const auto channel = connection->createLogChannel("x");
  EXPECT_EQ(channel.error, -77);
  EXPECT_FALSE(channel.portName);
}

TEST_F(SocketTelephony, NoReplyInTimeIsAnError) {
  const RawSocket silent = RawSocket::listeningAt(path());
  const auto connection = _impatientService.connect([this] { ++_notifications; });
  const auto start = std::chrono::steady_clock::now();
  EXPECT_EQ(connection->createLogChannel("x").error, 4);
  EXPECT_GE(std::chrono::steady_clock::now() - start, 299ms);
  EXPECT_EQ(_notifications, 0);
}

TEST_F(SocketTelephony, AReplyThatIsNoAnswerIsAnError) {
  const RawSocket listener = RawSocket::listeningAt(path());
  const auto connection = _service.connect({});
  const RawSocket server = listener.accept();
  Bytes reply;
  appendFrame(reply, {0, FrameMark::Reply, Bytes{1, 2, 3}});
  server.send(reply);
  EXPECT_EQ(connection->createLogChannel("x").error, 5);
}

TEST_F(SocketTelephony, NotificationsComeDuringTheWaitAndFromTheEventLoop) {
  TelephonyListener listener(_folder.path(),
                             [](std::string_view) { return TelephonyConnection::LogChannel{}; });
  auto connection = _impatientService.connect([this] { ++_notifications; });
  EXPECT_TRUE(runUntil([&] { return _notifications == 1; })) << "no greeting";
  listener.notifyAll();
  listener.notifyAll();
  EXPECT_TRUE(runUntil([&] { return _notifications == 3; }));
  listener.notifyAll();
  QCoreApplication::processEvents();  // sends it
  connection->createLogChannel("x");  // the notification arrives, though nobody answers the request
  EXPECT_EQ(_notifications, 4);
  connection.reset();
  listener.notifyAll();
  runFor(20ms);
  EXPECT_EQ(_notifications, 4);
}

TEST_F(SocketTelephony, TheNotificationHandlerMayDestroyTheConnection) {
  TelephonyListener listener(_folder.path(),
                             [](std::string_view) { return TelephonyConnection::LogChannel{}; });
  std::unique_ptr<TelephonyConnection> connection;
  const auto witness = std::make_shared<int>(1);
  connection = _service.connect([&, witness] {
    connection.reset();
    _notifications += *witness;
  });
  EXPECT_TRUE(runUntil([&] { return _notifications == 1; }));
  runFor(20ms);
}

TEST_F(SocketTelephony, ASecondListenerIsRefused) {
  const TelephonyListener first(_folder.path(), {});
  try {
    const TelephonyListener second(_folder.path(), {});
    FAIL() << "two servers in one folder";
  } catch (const std::runtime_error& error) {
    EXPECT_EQ(error.what(),
              "another process serves " + path() + "; end it, or name another folder with --runtime-dir");
  }
}

constexpr auto rights = "<key>Rights</key><array><string>internal</string><string>spi</string></array>";
constexpr auto command = "<key>Command</key><string>CreateLogChannel</string>";
constexpr auto portName = "<key>PortName</key><string>local</string>";

std::string dictionary(const std::vector<std::string>& entries) {
  std::string text = "<dict>";
  for (const std::string& entry : entries) text += entry;
  return text + "</dict>";
}

// The error that a client gets to whom the service grants these rights.
class SocketTelephonyRights : public SocketTelephony {
 protected:
  std::int64_t errorWith(const Rights& rights) {
    const PeerThread listener([this, rights] {
      return std::make_shared<TelephonyListener>(
          _folder.path(),
          [this](std::string_view name) {
            _askedFor = name;
            return TelephonyConnection::LogChannel{0, "commands"};
          },
          SocketLimits(), [rights](const Peer&) { return rights; });
    });
    return _service.connect({})->createLogChannel("local").error;
  }
};

TEST_F(SocketTelephonyRights, BothAreNeeded) {
  EXPECT_EQ(errorWith({.spi = true, .internal = true}), 0);
  EXPECT_EQ(_askedFor, "local");
  _askedFor.clear();
  EXPECT_EQ(errorWith({}), 3);
  EXPECT_EQ(errorWith({.spi = true}), 3);
  EXPECT_EQ(errorWith({.internal = true}), 3);
  EXPECT_EQ(_askedFor, "");
}

TEST_F(SocketTelephonyRights, AreGrantedByThePeersUserAndNotByWhatThePeerSays) {
  const auto claim = dictionary({command, portName, rights});
  Bytes answer;
  {
    const TelephonyListener listener(
        _folder.path(),
        [](std::string_view) {
          return TelephonyConnection::LogChannel{0, "commands"};
        },
        SocketLimits(),
        [](const Peer& peer) {
          EXPECT_EQ(peer.user, ::geteuid());
          return Rights();
        });
    const RawSocket client = RawSocket::connectedTo(path());
    client.send(requestFrame(claim));
    ASSERT_TRUE(runUntil([&] { return client.waits(0ms); }));
    answer = client.receive();
  }
  FrameReader reader;
  reader.feed(answer);
  const auto frame = reader.next();
  ASSERT_TRUE(frame);
  EXPECT_EQ(frame->mark, FrameMark::Reply);
  EXPECT_EQ(readPropertyList(frame->payload)->dictionary()->get("Error").integer(), 3);
  EXPECT_EQ(errorOf(claim), 0) << "of the server's own user";
  EXPECT_EQ(errorOf(dictionary({command, portName})), 0) << "without a claim";
}

// If the test is root, the viewers are another user's. Their processes have the folder's group, or have not.
TEST_F(SocketTelephonyRights, AreThoseOfTheServersUserAndOfTheFoldersGroup) {
  const RuntimeFolder shared(_folder.path(), PeerAccess(::geteuid(), unusedGroup));
  const TelephonyListener listener(shared, [](std::string_view) {
    return TelephonyConnection::LogChannel{0, "commands"};
  });
  ::chmod(_folder.path().c_str(), 0777);
  ::chmod(path().c_str(), 0777);
  const auto error = [&] {
    SocketTelephonyService service(shared, 1min);
    return static_cast<int>(service.connect({})->createLogChannel("local").error);
  };
  EXPECT_EQ(inAnotherProcess(unusedGroup, error), 0);
  EXPECT_EQ(inAnotherProcess(unusedGroup + 1, error), canBecomeAnotherUser() ? 3 : 0);
}

// The server of a shared folder may be another user's; that of a closed one may not. If the test is not root,
// the server is its own, and found in both.
TEST_F(SocketTelephonyRights, AViewerTrustsTheServerOfASharedFoldersOwner) {
  int ready[2];
  ASSERT_EQ(::pipe(ready), 0);
  ::chmod(_folder.path().c_str(), 0777);
  const pid_t child = ::fork();
  if (child == 0) {
    if (canBecomeAnotherUser() && (::setgid(unusedGroup) != 0 || ::setuid(unusedUser) != 0)) ::_exit(1);
    const RawSocket server = RawSocket::listeningAt(path());
    if (::write(ready[1], "y", 1) != 1) ::_exit(2);
    while (true) ::pause();
  }
  char answer = 'n';
  ASSERT_EQ(::read(ready[0], &answer, 1), 1);
  const uid_t owner = canBecomeAnotherUser() ? unusedUser : ::geteuid();
  const auto opens = [this](const PeerAccess& access) {
    return SocketConnection::open(path(), access).error;
  };
  EXPECT_EQ(opens(PeerAccess()), canBecomeAnotherUser() ? EPERM : 0);
  EXPECT_EQ(opens(PeerAccess(owner, ::getegid())), 0);
  EXPECT_EQ(opens(PeerAccess(::geteuid(), unusedGroup)), 0) << "a member";
  EXPECT_EQ(opens(PeerAccess(::geteuid(), unusedGroup + 1)), canBecomeAnotherUser() ? EPERM : 0);
  ::kill(child, SIGKILL);
  ::waitpid(child, nullptr, 0);
  ::close(ready[0]);
  ::close(ready[1]);
}

TEST_F(SocketTelephonyRights, OfASharedFolderLetTheServerClearAwayWhatKilledViewersLeave) {
  const RuntimeFolder shared(_folder.path(), PeerAccess(::geteuid(), ::getegid()));
  const TelephonyListener listener(shared, {});
  RawSocket::listeningAt(_folder.file("viewer")).close();
  std::ofstream(_folder.file("viewer.lock")) << "";
  EXPECT_TRUE(runUntil([&] { return !std::filesystem::exists(_folder.file("viewer.lock")); }));
  EXPECT_FALSE(std::filesystem::exists(_folder.file("viewer")));
}

TEST_F(SocketTelephony, RequestsThatMakeNoSenseAreRefused) {
  EXPECT_EQ(errorOf("<array/>"), 1);
  EXPECT_EQ(errorOf(dictionary({command, rights})), 1);
  EXPECT_EQ(errorOf(dictionary({portName, rights})), 2);
  EXPECT_EQ(errorOf(dictionary({"<key>Command</key><string>Dance</string>", portName, rights})), 2);
  EXPECT_EQ(_askedFor, "");
}

TEST_F(SocketTelephony, ClientsThatStayKeepNobodyAwayForLong) {
  const TelephonyListener listener(
      _folder.path(),
      [](std::string_view) {
        return TelephonyConnection::LogChannel{0, "commands"};
      },
      SocketLimits{.connections = 3, .stay = 1ms});
  std::vector<RawSocket> flood;
  for (int i = 0; i < 3; ++i) {
    flood.push_back(RawSocket::connectedTo(path()));
    ASSERT_TRUE(runUntil([&] { return flood.back().waits(0ms); }));  // greeted
    EXPECT_FALSE(flood.back().receive().empty());
  }
  runFor(5ms);
  const RawSocket client = RawSocket::connectedTo(path());
  client.send(requestFrame(dictionary({command, portName})));
  FrameReader reader;
  std::optional<std::int64_t> error;
  ASSERT_TRUE(runUntil([&] {
    if (client.waits(0ms)) reader.feed(client.receive());
    while (const auto frame = reader.next()) {
      if (frame->mark == FrameMark::Reply)
        error = readPropertyList(frame->payload)->dictionary()->get("Error").integer();
    }
    return error.has_value();
  }));
  EXPECT_EQ(error, 0);
  EXPECT_TRUE(flood[0].waits(60s)) << "the oldest one goes";
  EXPECT_TRUE(flood[0].receive().empty());
  EXPECT_FALSE(flood[1].waits(0ms));
  EXPECT_FALSE(flood[2].waits(0ms));
}

TEST_F(SocketTelephony, AClientThatSendsNoFramesIsDroppedAndOthersAreServed) {
  TelephonyListener listener(_folder.path(), {});
  const auto connection = _service.connect([this] { ++_notifications; });
  const RawSocket rude = RawSocket::connectedTo(path());
  rude.send(Bytes(100, 0xFF));
  EXPECT_TRUE(runUntil([&] { return _notifications == 1; }));
  Bytes greeting;
  appendFrame(greeting, {0, FrameMark::Notification, {}});
  EXPECT_EQ(rude.receive(), greeting);
  EXPECT_TRUE(runUntil([&] { return rude.waits(0ms); }));
  EXPECT_TRUE(rude.receive().empty());
  listener.notifyAll();
  EXPECT_TRUE(runUntil([&] { return _notifications == 2; }));
}

}  // namespace
}  // namespace varnel
