#include "host/SocketServer.h"

#include <fcntl.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/file.h>
#include <sys/resource.h>
#include <sys/stat.h>

#include <filesystem>
#include <fstream>
#include <string>
#include <vector>

#include "base/Log.h"
#include "host/DescriptorLimit.h"
#include "host/SocketPorts.h"
#include "host/TelephonyListener.h"
#include "tests/support/EventLoop.h"
#include "tests/support/OtherUser.h"
#include "tests/support/Process.h"
#include "tests/support/RawSocket.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;
namespace fs = std::filesystem;

// The log lines up to this priority number, while it lives.
class LogLines final : public LogSink {
 public:
  explicit LogLines(int level) { setLogSink(this, level); }
  LogLines(const LogLines&) = delete;
  LogLines& operator=(const LogLines&) = delete;
  ~LogLines() override { setLogSink(nullptr, -1); }
  void write(int /*priority*/, std::string_view line) override { texts.emplace_back(line); }

  std::vector<std::string> texts;
};

class SocketServerTest : public testing::Test {
 protected:
  std::unique_ptr<SocketServer> server(const SocketLimits& limits = {}) {
    return std::make_unique<SocketServer>(
        path(), [this](std::unique_ptr<SocketConnection> connection) { add(std::move(connection)); }, limits,
        SocketGate{.refusalWhenFull = Bytes{'f', 'u', 'l', 'l'}});
  }
  std::unique_ptr<SocketServer> server(SocketGate gate) {
    return std::make_unique<SocketServer>(
        path(), [this](std::unique_ptr<SocketConnection> connection) { add(std::move(connection)); },
        SocketLimits(), std::move(gate));
  }
  static unsigned modeOf(const std::string& file) {
    struct stat status {};
    return ::stat(file.c_str(), &status) == 0 ? status.st_mode & 07777 : 0;
  }
  void add(std::shared_ptr<SocketConnection> connection) {
    connection->setActivityHandler([weak = std::weak_ptr(connection), this] {
      const auto active = weak.lock();
      while (active->nextFrame()) ++_frames;
      if (const auto deed = std::exchange(_onceRead, nullptr)) deed();
      if (!active->isOpen()) std::erase(_connections, active);
    });
    _connections.push_back(std::move(connection));
  }
  // What a refused client reads.
  Bytes refusal() {
    const RawSocket client = RawSocket::connectedTo(path());
    EXPECT_TRUE(runUntil([&] { return client.waits(0ms); }));
    return client.receive();
  }
  bool isServed() {
    const int before = _frames;
    const auto client = SocketConnection::open(path());
    if (!client.connection) return false;
    client.connection->send({0, FrameMark::Message, {}});
    return runUntil([&] { return _frames > before; });
  }

  std::string path() const { return _folder.file("name"); }
  std::string lockPath() const { return path() + ".lock"; }

  TemporaryFolder _folder;
  std::vector<std::shared_ptr<SocketConnection>> _connections;
  int _frames = 0;
  std::function<void()> _onceRead;  // runs once after some bytes were read, before anything else happens
};

TEST_F(SocketServerTest, TakesSixtyFourConnectionsAndTurnsAwayTheNextOne) {
  const auto listening = server();
  std::vector<RawSocket> clients;
  for (int i = 0; i < 64; ++i) clients.push_back(RawSocket::connectedTo(path()));
  ASSERT_TRUE(runUntil([&] { return _connections.size() == 64; }));
  EXPECT_EQ(refusal(), (Bytes{'f', 'u', 'l', 'l'}));
  EXPECT_EQ(_connections.size(), 64u);
  clients.pop_back();
  ASSERT_TRUE(runUntil([&] { return _connections.size() == 63; }));
  EXPECT_TRUE(isServed());
}

TEST_F(SocketServerTest, AThousandConnectionsDoNotMakeItDeaf) {
  const auto listening = server();
  for (int round = 0; round < 20; ++round) {
    std::vector<RawSocket> clients;
    for (int i = 0; i < 50; ++i) clients.push_back(RawSocket::connectedTo(path()));
    ASSERT_TRUE(runUntil([&] { return _connections.size() == 50; })) << _connections.size();
    clients.clear();
    ASSERT_TRUE(runUntil([&] { return _connections.empty(); }));
  }
  EXPECT_TRUE(isServed());
}

TEST_F(SocketServerTest, WithoutADescriptorItTurnsAwayAndServesAgainLater) {
  const auto listening = server();
  runFor(10ms);
  rlimit before{};
  ASSERT_EQ(::getrlimit(RLIMIT_NOFILE, &before), 0);
  std::vector<FileDescriptor> others;
  const rlimit few{256, before.rlim_max};
  ASSERT_EQ(::setrlimit(RLIMIT_NOFILE, &few), 0);
  for (int i = 0; i < 3; ++i) {
    do {
      others.emplace_back(::open("/dev/null", O_RDONLY | O_CLOEXEC));
    } while (others.back().isOpen());
    others.resize(others.size() - 2);  // makes room for the client
    const RawSocket client = RawSocket::connectedTo(path());
    EXPECT_TRUE(runUntil([&] { return client.waits(0ms); }));
    EXPECT_EQ(client.receive(), (Bytes{'f', 'u', 'l', 'l'}));
  }
  EXPECT_TRUE(_connections.empty());
  others.clear();
  ::setrlimit(RLIMIT_NOFILE, &before);
  EXPECT_TRUE(isServed());
}

TEST_F(SocketServerTest, AFrameThatIsNotWholeInTimeEndsItsConnection) {
  const auto listening = server({.frameTime = 50ms});
  const RawSocket slow = RawSocket::connectedTo(path());
  const RawSocket other = RawSocket::connectedTo(path());
  slow.send(Bytes{5, 0, 0, 0, 0});
  ASSERT_TRUE(runUntil([&] { return slow.waits(0ms); }));
  EXPECT_TRUE(slow.receive().empty());
  EXPECT_EQ(_connections.size(), 1u);
  Bytes whole;
  appendFrame(whole, {0, FrameMark::Message, {}});
  EXPECT_TRUE(other.send(whole));
  EXPECT_TRUE(runUntil([&] { return _frames == 1; }));
}

TEST_F(SocketServerTest, AFrameThatComesInPiecesIsTakenAndTheTimeStartsAnewForTheNext) {
  const auto listening = server({.frameTime = 1h});
  const RawSocket client = RawSocket::connectedTo(path());
  Bytes whole;
  appendFrame(whole, {0, FrameMark::Message, Bytes{1, 2, 3}});
  for (int round = 1; round <= 3; ++round) {
    client.send(ByteView(whole).first(4));
    runFor(5ms);
    client.send(ByteView(whole).subspan(4));
    EXPECT_TRUE(runUntil([&] { return _frames == round; }));
  }
  EXPECT_EQ(_connections.size(), 1u);
}

// Data that came in time counts, even if nobody had looked yet.
TEST_F(SocketServerTest, AReceiverThatIsHeldUpEndsNobodysConnection) {
  const auto listening = server({.frameTime = 20ms});
  const RawSocket client = RawSocket::connectedTo(path());
  Bytes whole;
  appendFrame(whole, {0, FrameMark::Message, Bytes{1, 2, 3}});
  client.send(ByteView(whole).first(4));
  bool wasHeldUp = false;
  _onceRead = [&] {
    client.send(ByteView(whole).subspan(4));
    QThread::msleep(60);
    wasHeldUp = true;
  };
  ASSERT_TRUE(runUntil([&] { return wasHeldUp; }));
  EXPECT_TRUE(runUntil([&] { return _frames == 1 || _connections.empty(); }));
  EXPECT_EQ(_connections.size(), 1u);
}

TEST_F(SocketServerTest, SocketAndLockGoWithTheirOwner) {
  auto listening = server();
  struct stat status {};
  ASSERT_EQ(::stat(path().c_str(), &status), 0);
  EXPECT_TRUE(S_ISSOCK(status.st_mode));
  EXPECT_EQ(status.st_mode & 0777, 0600u);
  EXPECT_TRUE(fs::exists(lockPath()));
  listening.reset();
  EXPECT_TRUE(fs::is_empty(_folder.path()));
}

TEST_F(SocketServerTest, InASharedFolderTheGroupMayOpenSocketAndLockWhateverTheUmaskIs) {
  const mode_t before = ::umask(077);
  const auto listening = server(SocketGate{.access = PeerAccess(::geteuid(), ::getegid())});
  ::umask(before);
  EXPECT_EQ(modeOf(path()), 0660u);
  EXPECT_EQ(modeOf(lockPath()), 0660u);
  EXPECT_TRUE(isServed());
}

TEST_F(SocketServerTest, AServersOwnLockIsClosedToTheGroupAndOneThatWasOpenIsReplaced) {
  std::ofstream(lockPath()) << "";
  ::chmod(lockPath().c_str(), 0660);
  const FileDescriptor members(::open(lockPath().c_str(), O_RDWR | O_CLOEXEC));
  ASSERT_EQ(::flock(members.number(), LOCK_EX | LOCK_NB), 0);
  const SocketGate gate{.access = PeerAccess(::geteuid(), ::getegid()), .ownsName = true};
  const auto listening = server(gate);
  EXPECT_EQ(modeOf(path()), 0660u);
  EXPECT_EQ(modeOf(lockPath()), 0600u);
  EXPECT_TRUE(isServed());
  EXPECT_THROW(server(gate), SocketNameTaken);
}

TEST_F(SocketServerTest, WhatBlocksANameIsToldWithWhatToDo) {
  const auto trouble = [this] {
    try {
      server(SocketGate{.ownsName = true});
    } catch (const std::runtime_error& error) {
      return std::string(error.what());
    }
    return std::string();
  };
  fs::create_directory(path());
  EXPECT_EQ(trouble(), "cannot listen on " + path() +
                           ": Address already in use; remove it, or name another folder with --runtime-dir");
  fs::create_directory(lockPath());
  EXPECT_EQ(trouble(), "cannot open " + lockPath() +
                           ": Is a directory; remove it, or name another folder with --runtime-dir");
}

// The server's user and the member of the group, if the test is root; else both are the test's user.
struct ServerAndMember {
  uid_t server, member;
};

class NameTakenByAMember : public SocketServerTest {
 protected:
  void SetUp() override {
    ASSERT_EQ(::chmod(_folder.path().c_str(), 03770), 0);
    give(_folder.path(), _users.server);
  }
  static void give(const fs::path& file, uid_t user) {
    if (canBecomeAnotherUser()) {
      ASSERT_EQ(::lchown(file.c_str(), user, static_cast<gid_t>(-1)), 0);
    }
  }
  // Makes a server in a process of its user. A test that is not root checks that an entry of the same user,
  // which only that user can have made, is left alone.
  bool isMade() {
    return inAnotherProcess(unusedGroup, [this] {
             try {
               const auto made = server(SocketGate{.ownsName = true});
               return RawSocket::connectedTo(path()).send(Bytes{0}) ? 0 : 1;
             } catch (const std::runtime_error&) {
               return 2;
             }
           }) == 0;
  }

  const ServerAndMember _users = canBecomeAnotherUser() ? ServerAndMember{unusedUser, unusedUser + 1}
                                                        : ServerAndMember{::geteuid(), ::geteuid()};
};

TEST_F(NameTakenByAMember, WithAClosedLockIsTakenBack) {
  std::ofstream(lockPath()) << "";
  ::chmod(lockPath().c_str(), 0600);
  give(lockPath(), _users.member);
  EXPECT_TRUE(isMade());
}

TEST_F(NameTakenByAMember, WithAHeldLockIsTakenBack) {
  const FileDescriptor lock(::open(lockPath().c_str(), O_RDWR | O_CREAT | O_CLOEXEC, 0666));
  ::fchmod(lock.number(), 0666);
  give(lockPath(), _users.member);
  ASSERT_EQ(::flock(lock.number(), LOCK_EX | LOCK_NB), 0);
  EXPECT_TRUE(isMade());
}

TEST_F(NameTakenByAMember, WithAFolderIsTakenBackAndTheFolderIsKept) {
  for (const std::string& name : {path(), lockPath()}) {
    fs::create_directory(name);
    std::ofstream(fs::path(name) / "file") << "";
    give(name, _users.member);
  }
  EXPECT_EQ(isMade(), canBecomeAnotherUser());
  std::size_t folders = 0;
  for (const auto& entry : fs::directory_iterator(_folder.path()))
    folders += fs::exists(entry.path() / "file");
  EXPECT_EQ(folders, 2u);
}

TEST_F(NameTakenByAMember, WithALiveSocketIsTakenBack) {
  const RawSocket members = RawSocket::listeningAt(path());
  give(path(), _users.member);
  ::chmod(path().c_str(), 0666);
  EXPECT_EQ(isMade(), canBecomeAnotherUser());
}

// Only root can make root's entries.
TEST_F(NameTakenByAMember, ByRootIsLeftAlone) {
  const RawSocket roots = RawSocket::listeningAt(path());
  ::chmod(path().c_str(), 0666);
  EXPECT_FALSE(isMade());
  EXPECT_TRUE(fs::exists(path()));
}

TEST_F(SocketServerTest, AStrangerIsTurnedAwayWithOneLineAndOthersAreServed) {
  const LogLines lines(logWarningPriority);
  bool isStranger = true;
  std::vector<uid_t> users;
  const auto listening = server(SocketGate{.accepts =
                                               [&](const Peer& peer) {
                                                 users.push_back(peer.user);
                                                 return !isStranger;
                                               },
                                           .refusalOfStranger = Bytes{'n', 'o'}});
  for (int i = 0; i < 100; ++i) EXPECT_EQ(refusal(), (Bytes{'n', 'o'}));
  EXPECT_EQ(users, std::vector<uid_t>(100, ::geteuid()));
  EXPECT_TRUE(_connections.empty());
  EXPECT_EQ(lines.texts, (std::vector<std::string>{"Connections to " + path() + " are refused: user " +
                                                   std::to_string(::geteuid()) + " has no right to them"}));
  isStranger = false;
  EXPECT_TRUE(isServed());
}

// If the test is root, the peer is another user, whose process has the folder's group, or has not.
TEST_F(SocketServerTest, InASharedFolderAPeerOfItsGroupIsServedAndAnotherOneIsNot) {
  const auto listening = server(
      SocketGate{.access = PeerAccess(::geteuid(), unusedGroup), .refusalOfStranger = Bytes{'n', 'o'}});
  ::chmod(_folder.path().c_str(), 0777);
  ::chmod(path().c_str(), 0777);
  const auto isRefused = [this] {
    const RawSocket client = RawSocket::connectedTo(path());
    Bytes frame;
    appendFrame(frame, {0, FrameMark::Message, {}});
    client.send(frame);
    return client.waits(canBecomeAnotherUser() ? 60s : 20ms) && !client.receive().empty() ? 1 : 0;
  };
  EXPECT_EQ(inAnotherProcess(unusedGroup + 1, isRefused), canBecomeAnotherUser() ? 1 : 0);
  const int before = _frames;
  const auto send = [this] {
    const RawSocket client = RawSocket::connectedTo(path());
    Bytes frame;
    appendFrame(frame, {0, FrameMark::Message, {}});
    return client.send(frame) ? 0 : 1;
  };
  EXPECT_EQ(inAnotherProcess(unusedGroup, send), 0);
  EXPECT_TRUE(runUntil([&] { return _frames > before; }));
}

TEST_F(SocketServerTest, WhatIsNoFrameEndsTheConnectionWithOneLine) {
  const LogLines lines(logWarningPriority);
  const auto listening = server();
  const RawSocket rude = RawSocket::connectedTo(path());
  for (int i = 0; i < 3; ++i) rude.send(Bytes(100, 0xFF));
  EXPECT_TRUE(runUntil([&] { return rude.waits(0ms); }));
  EXPECT_TRUE(runUntil([&] { return _connections.empty(); }));
  EXPECT_EQ(lines.texts, (std::vector<std::string>{"A peer has sent what is no frame: the connection ends"}));
  EXPECT_TRUE(isServed());
}

TEST_F(SocketServerTest, APeerThatNeverReadsIsDroppedWithOneLineOnceFourMebibytesWait) {
  const LogLines lines(logWarningPriority);
  const auto listening = server();
  const RawSocket deaf = RawSocket::connectedTo(path());
  ASSERT_TRUE(runUntil([&] { return _connections.size() == 1; }));
  const Bytes payload(1'000'000, 'x');
  int sent = 0;
  for (; sent < 100 && _connections[0]->isOpen(); ++sent)
    _connections[0]->send({0, FrameMark::Message, payload});
  EXPECT_FALSE(_connections[0]->isOpen());
  EXPECT_GE(sent, 5);
  EXPECT_LE(sent, 12);
  EXPECT_EQ(lines.texts,
            (std::vector<std::string>{"A peer does not read what it is sent: the connection ends"}));
  EXPECT_TRUE(runUntil([&] { return _connections.empty(); }));
  EXPECT_TRUE(isServed());
}

TEST_F(SocketServerTest, LeftoversOfDeadProcessesAreRemovedAndNothingElse) {
  const auto listening = server();
  // What a killed process leaves: a socket on which nobody listens, and a lock that nobody holds.
  RawSocket::listeningAt(_folder.file("dead")).close();
  for (const char* name : {"dead.lock", "alone.lock", "file"}) std::ofstream(_folder.file(name)) << "";
  removeLeftovers(_folder.path());
  std::vector<std::string> left;
  for (const auto& entry : fs::directory_iterator(_folder.path())) left.push_back(entry.path().filename());
  EXPECT_THAT(left, testing::UnorderedElementsAre("name", "name.lock", "file"));
  EXPECT_TRUE(isServed());
  removeLeftovers(_folder.file("missing"));
}

TEST_F(SocketServerTest, ASecondServerIsRefusedAlsoWhenTheLockFileWasRemoved) {
  const auto first = server();
  EXPECT_THROW(server(), SocketNameTaken);
  fs::remove(lockPath());
  EXPECT_THROW(server(), SocketNameTaken);
  runUntil([&] { return !_connections.empty(); }, 100ms);
  EXPECT_TRUE(isServed());
}

TEST_F(SocketServerTest, MakesItsLockAnewWhenSomebodyHasRemovedIt) {
  const auto listening = server({.lookInterval = 10ms});
  fs::remove(lockPath());
  EXPECT_TRUE(runUntil([&] { return fs::exists(lockPath()); }));
  EXPECT_THROW(server(), SocketNameTaken);
}

TEST_F(SocketServerTest, MakesItsSocketAnewWhenSomebodyHasRemovedIt) {
  const auto listening = server({.lookInterval = 10ms});
  fs::remove(path());
  ASSERT_TRUE(runUntil([&] { return fs::exists(path()); }));
  EXPECT_TRUE(isServed());
}

TEST_F(SocketServerTest, KeepsItsFilesFresh) {
  const auto listening = server({.lookInterval = 10ms});
  const timespec longAgo[2] = {{1000, 0}, {1000, 0}};
  for (const std::string& file : {path(), lockPath()})
    ASSERT_EQ(::utimensat(AT_FDCWD, file.c_str(), longAgo, 0), 0);
  const auto isFresh = [](const std::string& file) {
    struct stat status {};
    return ::stat(file.c_str(), &status) == 0 && status.st_mtime > 1000 && status.st_atime > 1000;
  };
  EXPECT_TRUE(runUntil([&] { return isFresh(path()) && isFresh(lockPath()); }));
}

TEST_F(SocketServerTest, ALockFileThatADeadProcessLeftIsTakenOver) {
  std::ofstream(lockPath()) << "";
  EXPECT_NO_THROW(server());
}

TEST_F(SocketServerTest, AStrangersConnectionDoesNotEndThePortOfItsFirstPeer) {
  SocketPorts ports(_folder.path());
  std::vector<std::string> messages;
  int invalidations = 0;
  const auto local = ports
                         .createLocalPort("port",
                                          [&](std::int32_t, ByteView data) {
                                            messages.emplace_back(data.begin(), data.end());
                                            return std::optional<Bytes>();
                                          })
                         .port;
  local->setInvalidationHandler([&] { ++invalidations; });
  local->deliverOnMainQueue();
  auto first = ports.createRemotePort("port");
  ASSERT_TRUE(first);
  first->sendRequest(0, Bytes{'1'}, 1s, std::nullopt);
  ASSERT_TRUE(runUntil([&] { return messages.size() == 1; }));
  {
    const RawSocket stranger = RawSocket::connectedTo(_folder.file("port"));
    Bytes intrusion;
    appendFrame(intrusion, {0, FrameMark::Message, Bytes{'X'}});
    stranger.send(intrusion);
    EXPECT_TRUE(runUntil([&] { return stranger.waits(0ms); }));
    EXPECT_TRUE(stranger.receive().empty());
  }
  first->sendRequest(0, Bytes{'2'}, 1s, std::nullopt);
  ASSERT_TRUE(runUntil([&] { return messages.size() == 2; }));
  EXPECT_EQ(messages, (std::vector<std::string>{"1", "2"}));
  EXPECT_EQ(invalidations, 0);
  first.reset();
  EXPECT_TRUE(runUntil([&] { return invalidations == 1; }));
}

TEST_F(SocketServerTest, ASocketWhoseQueueIsFullIsNotWaitedFor) {
  const RawSocket silent = RawSocket::listeningAt(path());
  std::vector<std::unique_ptr<SocketConnection>> waiting;
  while (true) {
    auto [connection, error] = SocketConnection::open(path());
    if (!connection) {
      EXPECT_EQ(error, EAGAIN);
      break;
    }
    waiting.push_back(std::move(connection));
    ASSERT_LT(waiting.size(), 100u);
  }
}

TEST(DescriptorLimit, IsRaisedAsFarAsTheSystemAllowsAndNeverLowered) {
  rlimit before{};
  ASSERT_EQ(::getrlimit(RLIMIT_NOFILE, &before), 0);
  const rlimit few{64, before.rlim_max};
  ASSERT_EQ(::setrlimit(RLIMIT_NOFILE, &few), 0);
  raiseDescriptorLimit(100);
  rlimit now{};
  ::getrlimit(RLIMIT_NOFILE, &now);
  EXPECT_EQ(now.rlim_cur, 100u);
  raiseDescriptorLimit(80);
  ::getrlimit(RLIMIT_NOFILE, &now);
  EXPECT_EQ(now.rlim_cur, 100u);
  ::setrlimit(RLIMIT_NOFILE, &before);
}

}  // namespace
}  // namespace varnel
