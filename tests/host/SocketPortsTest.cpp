#include "host/SocketPorts.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <sys/wait.h>

#include <atomic>
#include <csignal>
#include <fstream>
#include <stdexcept>
#include <thread>

#include "base/Log.h"
#include "host/PortFrame.h"
#include "host/SocketConnection.h"
#include "tests/support/EventLoop.h"
#include "tests/support/Process.h"
#include "tests/support/RawSocket.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;
using Clock = std::chrono::steady_clock;
using testing::ElementsAre;
using testing::HasSubstr;

Bytes bytesOf(std::string_view text) { return Bytes(text.begin(), text.end()); }

Bytes frameBytes(std::int32_t identifier, FrameMark mark, std::string_view text) {
  Bytes bytes;
  appendFrame(bytes, {identifier, mark, bytesOf(text)});
  return bytes;
}

class LastLine final : public LogSink {
 public:
  LastLine() { setLogSink(this, logErrorPriority); }
  LastLine(const LastLine&) = delete;
  LastLine& operator=(const LastLine&) = delete;
  ~LastLine() override { setLogSink(nullptr, -1); }
  void write(int /*priority*/, std::string_view line) override { text = line; }

  std::string text;
};

class SocketPortsTest : public testing::Test {
 protected:
  // A local port that keeps what it receives, as "IDENTIFIER:TEXT".
  std::unique_ptr<LocalPort> recordingPort() {
    auto port = _ports
                    .createLocalPort(_name,
                                     [this](std::int32_t identifier, ByteView data) {
                                       _messages.push_back(std::to_string(identifier) + ":" +
                                                           std::string(data.begin(), data.end()));
                                       return std::optional<Bytes>();
                                     })
                    .port;
    if (!port) throw std::runtime_error("no local port");
    port->setInvalidationHandler([this] { ++_invalidations; });
    return port;
  }

  // A peer that answers every request with the result of the function.
  std::unique_ptr<PeerThread> answeringPeer(LocalPort::MessageHandler handler) {
    return std::make_unique<PeerThread>([this, handler = std::move(handler)] {
      std::shared_ptr<LocalPort> port = _ports.createLocalPort(_name, handler).port;
      port->deliverOnMainQueue();
      return port;
    });
  }

  std::string path() const { return _folder.file(_name); }

  TemporaryFolder _folder;
  SocketPorts _ports{_folder.path()};
  const std::string _name = "com.orvane.test";
  std::vector<std::string> _messages;
  int _invalidations = 0;
};

TEST_F(SocketPortsTest, MessagesArriveInOrderOnceDeliveryHasBegun) {
  const auto local = recordingPort();
  const auto remote = _ports.createRemotePort(_name);
  ASSERT_TRUE(remote);
  EXPECT_EQ(remote->sendRequest(0, bytesOf("first"), 1s, {}).status, 0);
  EXPECT_EQ(remote->sendRequest(-5, bytesOf(""), 1s, {}).status, 0);
  runFor(30ms);
  EXPECT_TRUE(_messages.empty());
  local->deliverOnMainQueue();
  ASSERT_TRUE(runUntil([&] { return _messages.size() == 2; }));
  EXPECT_EQ(remote->sendRequest(7, bytesOf("third"), 1s, {}).status, 0);
  ASSERT_TRUE(runUntil([&] { return _messages.size() == 3; }));
  EXPECT_THAT(_messages, ElementsAre("0:first", "-5:", "7:third"));
  EXPECT_EQ(_invalidations, 0);
}

TEST_F(SocketPortsTest, TheSocketIsForItsUserAlone) {
  const auto local = recordingPort();
  struct stat status {};
  ASSERT_EQ(::stat(path().c_str(), &status), 0);
  EXPECT_EQ(status.st_mode & 0077, 0u);
}

TEST_F(SocketPortsTest, ABatchOfSmallMessagesArrivesWholeAndFast) {
  constexpr int count = 100'000;
  int received = 0;
  bool isInOrder = true;
  const auto local = _ports
                         .createLocalPort(_name,
                                          [&](std::int32_t identifier, ByteView data) {
                                            isInOrder =
                                                isInOrder && identifier == received && data.size() == 40;
                                            ++received;
                                            return std::optional<Bytes>();
                                          })
                         .port;
  local->deliverOnMainQueue();
  const PeerThread peer([this] {
    std::shared_ptr<RemotePort> remote = _ports.createRemotePort(_name);
    const Bytes message(40, 0x5A);
    for (int i = 0; i < count; ++i) {
      const auto sent = remote->sendRequest(i, message, 1min, {});
      if (sent.status != 0) ADD_FAILURE() << "message " << i << " has status " << sent.status;
    }
    return remote;
  });
  EXPECT_TRUE(runUntil([&] { return received == count; })) << received;
  EXPECT_TRUE(isInOrder);
}

TEST_F(SocketPortsTest, AMessageOfOneMebibyteGoesThroughAndNoMore) {
  const auto local = recordingPort();
  local->deliverOnMainQueue();
  const auto remote = _ports.createRemotePort(_name);
  EXPECT_EQ(remote->sendRequest(1, Bytes(1048577, 'x'), 1s, {}).status, RemotePort::transportError);
  EXPECT_EQ(remote->sendRequest(1, Bytes(1048576, 'x'), 1s, {}).status, 0);
  ASSERT_TRUE(runUntil([&] { return !_messages.empty(); }));
  EXPECT_EQ(_messages.at(0).size(), 1048578u);
  EXPECT_TRUE(remote->isValid());
}

TEST_F(SocketPortsTest, ARequestGetsItsReply) {
  const auto peer = answeringPeer([](std::int32_t identifier, ByteView data) {
    Bytes reply(data.begin(), data.end());
    reply.push_back(static_cast<std::uint8_t>(identifier));
    return std::optional(reply);
  });
  const auto remote = _ports.createRemotePort(_name);
  const auto result = remote->sendRequest('!', bytesOf("ask"), 1s, 1min);
  EXPECT_EQ(result.status, 0);
  EXPECT_EQ(result.reply, bytesOf("ask!"));
}

TEST_F(SocketPortsTest, ARequestWithoutReplyLearnsSoAtOnce) {
  const auto peer = answeringPeer([](std::int32_t, ByteView) { return std::optional<Bytes>(); });
  const auto remote = _ports.createRemotePort(_name);
  // A wait for the reply would end with a timeout.
  const auto result = remote->sendRequest(0, bytesOf("ask"), 1s, 1min);
  EXPECT_EQ(result.status, 0);
  EXPECT_FALSE(result.reply);
}

TEST_F(SocketPortsTest, AReplyThatDoesNotComeIsAReceiveTimeout) {
  const RawSocket peer = RawSocket::listeningAt(path());
  const auto remote = _ports.createRemotePort(_name);
  const auto start = Clock::now();
  EXPECT_EQ(remote->sendRequest(0, bytesOf("ask"), 1s, 100ms).status, RemotePort::receiveTimeout);
  EXPECT_GE(Clock::now() - start, 99ms);
  EXPECT_TRUE(remote->isValid());
}

TEST_F(SocketPortsTest, ForeignFramesDoNotProlongTheWait) {
  const RawSocket listener = RawSocket::listeningAt(path());
  const auto remote = _ports.createRemotePort(_name);
  const RawSocket peer = listener.accept();
  std::atomic<bool> isEnding = false;
  std::atomic<bool> hasStopped = false;
  std::thread flood([&] {
    // For a minute. A request that other frames prolong would end after it.
    const auto end = Clock::now() + 1min;
    while (!isEnding && Clock::now() < end && peer.send(frameBytes(0, FrameMark::Notification, "news")))
      std::this_thread::sleep_for(5ms);
    hasStopped = true;
  });
  EXPECT_EQ(remote->sendRequest(0, bytesOf("ask"), 1s, 100ms).status, RemotePort::receiveTimeout);
  EXPECT_FALSE(hasStopped);
  isEnding = true;
  flood.join();
}

TEST_F(SocketPortsTest, ALateReplyIsNotTakenForTheNextOne) {
  const RawSocket listener = RawSocket::listeningAt(path());
  const auto remote = _ports.createRemotePort(_name);
  const RawSocket peer = listener.accept();
  EXPECT_EQ(remote->sendRequest(0, bytesOf("1"), 1s, 20ms).status, RemotePort::receiveTimeout);
  EXPECT_EQ(remote->sendRequest(0, bytesOf("2"), 1s, 20ms).status, RemotePort::receiveTimeout);
  peer.send(frameBytes(0, FrameMark::Reply, "late 1"));
  runFor(30ms);
  peer.send(frameBytes(0, FrameMark::Reply, "late 2"));
  peer.send(frameBytes(0, FrameMark::Notification, "news"));
  peer.send(frameBytes(0, FrameMark::Reply, "in time"));
  EXPECT_EQ(remote->sendRequest(0, bytesOf("3"), 1s, 1min).reply, bytesOf("in time"));
}

TEST_F(SocketPortsTest, NothingElseIsDeliveredWhileARequestWaits) {
  const auto local = recordingPort();
  local->deliverOnMainQueue();
  const RawSocket sender = RawSocket::connectedTo(path());
  runFor(20ms);
  const RawSocket silent = RawSocket::listeningAt(_folder.file("silent"));
  const auto remote = _ports.createRemotePort("silent");
  ASSERT_TRUE(sender.send(frameBytes(0, FrameMark::Message, "meanwhile")));
  remote->sendRequest(0, bytesOf("ask"), 1s, 50ms);
  EXPECT_TRUE(_messages.empty());
  EXPECT_TRUE(runUntil([&] { return _messages.size() == 1; }));
}

TEST_F(SocketPortsTest, AReplyCountsAlsoWhenThePeerGoesRightAfterIt) {
  const RawSocket listener = RawSocket::listeningAt(path());
  const auto remote = _ports.createRemotePort(_name);
  std::thread answering([&] {
    const RawSocket peer = listener.accept();
    peer.receive();
    peer.send(frameBytes(0, FrameMark::Reply, "bye"));
  });
  const auto result = remote->sendRequest(0, bytesOf("ask"), 1s, 1min);
  answering.join();
  EXPECT_EQ(result.status, 0);
  EXPECT_EQ(result.reply, bytesOf("bye"));
  EXPECT_FALSE(remote->isValid());
}

TEST_F(SocketPortsTest, APeerThatGoesWhileARequestWaitsMakesThePortInvalid) {
  const RawSocket listener = RawSocket::listeningAt(path());
  const auto remote = _ports.createRemotePort(_name);
  std::thread leaving([&] { listener.accept().receive(); });
  EXPECT_EQ(remote->sendRequest(0, bytesOf("ask"), 1s, 1min).status, RemotePort::becameInvalid);
  leaving.join();
  EXPECT_EQ(remote->sendRequest(0, bytesOf("ask"), 1s, 1min).status, RemotePort::isInvalid);
}

TEST_F(SocketPortsTest, ARemotePortIsInvalidAsSoonAsItsPeerHasGone) {
  const RawSocket listener = RawSocket::listeningAt(path());
  const auto remote = _ports.createRemotePort(_name);
  RawSocket peer = listener.accept();
  EXPECT_TRUE(remote->isValid());
  peer.close();
  EXPECT_FALSE(remote->isValid());
  EXPECT_EQ(remote->sendRequest(0, bytesOf("x"), 1s, {}).status, RemotePort::isInvalid);
}

TEST_F(SocketPortsTest, ARemotePortStaysInvalidAfterItWasInvalidated) {
  const RawSocket listener = RawSocket::listeningAt(path());
  const auto remote = _ports.createRemotePort(_name);
  remote->invalidate();
  EXPECT_FALSE(remote->isValid());
  EXPECT_EQ(remote->sendRequest(0, bytesOf("x"), 1s, 1s).status, RemotePort::isInvalid);
  remote->invalidate();
}

TEST_F(SocketPortsTest, WhatWasSentGoesOutWhenTheSenderEnds) {
  const RawSocket listener = RawSocket::listeningAt(path());
  auto remote = _ports.createRemotePort(_name);
  const RawSocket peer = listener.accept();
  remote->sendRequest(3, bytesOf("last"), 1s, {});
  remote.reset();
  EXPECT_EQ(peer.receive(), frameBytes(3, FrameMark::Message, "last"));
}

TEST_F(SocketPortsTest, SendingToAPeerThatDoesNotReadTimesOutOnceMuchIsQueued) {
  const RawSocket listener = RawSocket::listeningAt(path());
  const auto remote = _ports.createRemotePort(_name);
  const RawSocket peer = listener.accept();
  const Bytes message(1000000, 'x');
  std::int32_t status = 0;
  int sent = 0;
  for (; status == 0 && sent < 20; ++sent) status = remote->sendRequest(0, message, 50ms, {}).status;
  EXPECT_EQ(status, RemotePort::sendTimeout);
  EXPECT_GE(sent, 5);  // about 4 MiB are queued without waiting
  EXPECT_LE(sent, 12);
  EXPECT_TRUE(remote->isValid());
}

TEST_F(SocketPortsTest, ANameThatLivesExistsAlready) {
  auto first = recordingPort();
  const auto second = _ports.createLocalPort(_name, {});
  EXPECT_FALSE(second.port);
  EXPECT_TRUE(second.alreadyExists);
  first.reset();
  EXPECT_EQ(_invalidations, 0);
  EXPECT_TRUE(_ports.createLocalPort(_name, {}).port);
}

TEST_F(SocketPortsTest, AnEndedPortGivesItsNameFree) {
  const auto first = recordingPort();
  first->invalidate();
  first->invalidate();
  EXPECT_EQ(_invalidations, 1);
  EXPECT_TRUE(_ports.createLocalPort(_name, {}).port);
}

// A process that held the port was killed, and its socket is still there.
TEST_F(SocketPortsTest, ADeadProcessesSocketIsTakenOver) {
  int ready[2];
  ASSERT_EQ(::pipe(ready), 0);
  const pid_t child = ::fork();
  if (child == 0) {
    const auto port = _ports.createLocalPort(_name, {}).port;
    if (::write(ready[1], port ? "y" : "n", 1) != 1) ::_exit(1);
    while (true) ::pause();
  }
  char answer = 'n';
  ASSERT_EQ(::read(ready[0], &answer, 1), 1);
  ASSERT_EQ(answer, 'y');
  EXPECT_TRUE(_ports.createLocalPort(_name, {}).alreadyExists);
  ::kill(child, SIGKILL);
  ::waitpid(child, nullptr, 0);
  ::close(ready[0]);
  ::close(ready[1]);
  ASSERT_TRUE(std::filesystem::exists(path()));
  EXPECT_FALSE(_ports.createRemotePort(_name));

  const auto local = recordingPort();
  local->deliverOnMainQueue();
  const auto remote = _ports.createRemotePort(_name);
  ASSERT_TRUE(remote);
  remote->sendRequest(0, bytesOf("hello"), 1s, {});
  EXPECT_TRUE(runUntil([&] { return _messages.size() == 1; }));
}

TEST_F(SocketPortsTest, AFileInTheSocketsPlaceIsTakenOver) {
  std::ofstream(path()) << "left behind";
  EXPECT_TRUE(_ports.createLocalPort(_name, {}).port);
}

TEST_F(SocketPortsTest, APeersGoingEndsTheLocalPortAfterAllThatItSent) {
  const auto local = recordingPort();
  local->deliverOnMainQueue();
  {
    const RawSocket peer = RawSocket::connectedTo(path());
    for (int i = 0; i < 3; ++i) peer.send(frameBytes(i, FrameMark::Message, "x"));
  }
  ASSERT_TRUE(runUntil([&] { return _invalidations == 1; }));
  EXPECT_THAT(_messages, ElementsAre("0:x", "1:x", "2:x"));
  EXPECT_FALSE(_ports.createRemotePort(_name));
}

TEST_F(SocketPortsTest, APeersGoingWaitsForDelivery) {
  const auto local = recordingPort();
  {
    const RawSocket peer = RawSocket::connectedTo(path());
    peer.send(frameBytes(0, FrameMark::Message, "early"));
  }
  runFor(30ms);
  EXPECT_EQ(_invalidations, 0);
  local->deliverOnMainQueue();
  EXPECT_EQ(_invalidations, 0);
  ASSERT_TRUE(runUntil([&] { return _invalidations == 1; }));
  EXPECT_THAT(_messages, ElementsAre("0:early"));
}

// More than the buffers hold, so that the end of the stream is still unread when delivery begins.
TEST_F(SocketPortsTest, NothingOfALargeBatchIsLostWhenItsSenderGoes) {
  std::size_t received = 0;
  const auto local = _ports
                         .createLocalPort(_name,
                                          [&](std::int32_t, ByteView data) {
                                            received += data.size();
                                            return std::optional<Bytes>();
                                          })
                         .port;
  local->setInvalidationHandler([this] { ++_invalidations; });
  std::thread sending([this] {
    const RawSocket peer = RawSocket::connectedTo(path());
    for (int i = 0; i < 100; ++i) peer.send(frameBytes(i, FrameMark::Message, std::string(100000, 'x')));
  });
  runFor(30ms);
  local->deliverOnMainQueue();
  EXPECT_TRUE(runUntil([&] { return _invalidations == 1; }));
  sending.join();
  EXPECT_EQ(received, 10'000'000u);
}

TEST_F(SocketPortsTest, AKilledSenderEndsTheLocalPort) {
  const auto local = recordingPort();
  local->deliverOnMainQueue();
  const pid_t child = ::fork();
  if (child == 0) {
    const RawSocket peer = RawSocket::connectedTo(path());
    peer.send(frameBytes(1, FrameMark::Message, "alive"));
    while (true) ::pause();
  }
  EXPECT_TRUE(runUntil([&] { return _messages.size() == 1; }));
  EXPECT_EQ(_invalidations, 0);
  ::kill(child, SIGKILL);
  ::waitpid(child, nullptr, 0);
  EXPECT_TRUE(runUntil([&] { return _invalidations == 1; }));
}

TEST_F(SocketPortsTest, APeerThatSendsNoFramesIsDropped) {
  for (const Bytes& bad : {Bytes{1, 0, 0x10, 0, 0, 0, 0, 0, 0}, Bytes{0, 0, 0, 0, 0, 0, 0, 0, 9}}) {
    const auto local = recordingPort();
    local->deliverOnMainQueue();
    const RawSocket peer = RawSocket::connectedTo(path());
    peer.send(bad);
    peer.send(frameBytes(0, FrameMark::Message, "behind the fault"));
    EXPECT_TRUE(runUntil([&] { return _invalidations == 1; }));
    EXPECT_TRUE(_messages.empty());
    _invalidations = 0;
  }
}

// If the test runs as root, the peer becomes another user. Otherwise it cannot, and is served.
TEST_F(SocketPortsTest, PeersAreServedUnlessTheyAreOfAnotherUser) {
  const bool isRoot = ::geteuid() == 0;
  const auto local = recordingPort();
  local->deliverOnMainQueue();
  ::chmod(_folder.path().c_str(), 0777);
  ::chmod(path().c_str(), 0777);
  const pid_t child = ::fork();
  if (child == 0) {
    if (isRoot && ::setuid(12345) != 0) ::_exit(1);
    const RawSocket peer = RawSocket::connectedTo(path());
    peer.send(frameBytes(0, FrameMark::Message, "hello"));
    ::_exit(!isRoot || peer.waits(1min) ? 0 : 2);
  }
  int status = -1;
  ASSERT_TRUE(runUntil([&] { return ::waitpid(child, &status, WNOHANG) == child; }));
  EXPECT_EQ(status, 0);
  EXPECT_EQ(runUntil([&] { return _invalidations == 1; }, isRoot ? 20ms : 60000ms), !isRoot);
  EXPECT_EQ(_messages.size(), isRoot ? 0u : 1u);
}

TEST_F(SocketPortsTest, ReplyMarkedFramesAreNoMessages) {
  const auto local = recordingPort();
  local->deliverOnMainQueue();
  const RawSocket peer = RawSocket::connectedTo(path());
  for (const auto mark : {FrameMark::Reply, FrameMark::Notification, FrameMark::NoReply, FrameMark::Message})
    peer.send(frameBytes(static_cast<int>(mark), mark, ""));
  ASSERT_TRUE(runUntil([&] { return !_messages.empty(); }));
  EXPECT_THAT(_messages, ElementsAre("0:"));
}

TEST_F(SocketPortsTest, TheInvalidationHandlerMayDestroyThePort) {
  auto local = recordingPort();
  local->setInvalidationHandler([&] {
    local.reset();
    ++_invalidations;
  });
  local->invalidate();
  EXPECT_EQ(_invalidations, 1);

  local = recordingPort();
  local->deliverOnMainQueue();
  local->setInvalidationHandler([&] {
    local = recordingPort();  // of the same name
    ++_invalidations;
  });
  RawSocket::connectedTo(path()).close();
  EXPECT_TRUE(runUntil([&] { return _invalidations == 2; }));
}

TEST_F(SocketPortsTest, AnInvalidationHandlerThatWasRemovedIsNotCalled) {
  const auto local = recordingPort();
  local->setInvalidationHandler({});
  local->invalidate();
  EXPECT_EQ(_invalidations, 0);
}

TEST_F(SocketPortsTest, TheMessageHandlerMayDestroyOrEndThePort) {
  for (const bool destroys : {true, false}) {
    std::unique_ptr<LocalPort> local;
    int handled = 0;
    const auto witness = std::make_shared<int>(1);
    local = _ports
                .createLocalPort(_name,
                                 [&, witness](std::int32_t, ByteView data) {
                                   if (destroys) {
                                     local.reset();
                                   } else {
                                     local->invalidate();
                                   }
                                   handled += *witness;
                                   return std::optional(Bytes(data.begin(), data.end()));
                                 })
                .port;
    local->deliverOnMainQueue();
    const RawSocket peer = RawSocket::connectedTo(path());
    peer.send(frameBytes(1, FrameMark::Request, "first"));
    peer.send(frameBytes(2, FrameMark::Request, "second"));
    EXPECT_TRUE(runUntil([&] { return handled > 0; }));
    runFor(20ms);
    EXPECT_EQ(handled, 1);
    EXPECT_EQ(peer.receive(), frameBytes(1, FrameMark::Reply, "first"));
    EXPECT_TRUE(peer.receive(1s).empty());
  }
}

TEST_F(SocketPortsTest, APeerThatLeavesItsRepliesIsDropped) {
  const auto local =
      _ports.createLocalPort(_name, [](std::int32_t, ByteView) { return std::optional(Bytes(1000000, 'r')); })
          .port;
  local->deliverOnMainQueue();
  local->setInvalidationHandler([this] { ++_invalidations; });
  const RawSocket peer = RawSocket::connectedTo(path());
  for (int i = 0; i < 20; ++i) peer.send(frameBytes(i, FrameMark::Request, ""));
  EXPECT_TRUE(runUntil([&] { return _invalidations == 1; }));
}

TEST_F(SocketPortsTest, NobodyAnswersUnderAnUnknownName) {
  EXPECT_FALSE(_ports.createRemotePort("com.orvane.nobody"));
}

TEST_F(SocketPortsTest, ANameThatNoSocketCanHaveIsToldInTheLog) {
  LastLine log;
  const std::size_t room = 106 - _folder.path().native().size() - 1;
  EXPECT_TRUE(_ports.createLocalPort(std::string(room, 'n'), {}).port) << log.text;
  const auto longer = _ports.createLocalPort(std::string(room + 1, 'n'), {});
  EXPECT_FALSE(longer.port);
  EXPECT_FALSE(longer.alreadyExists);
  EXPECT_THAT(log.text, HasSubstr("is longer than 106 bytes"));

  for (const std::string name : {"", "../elsewhere", "a/b"}) {
    log.text.clear();
    EXPECT_FALSE(_ports.createLocalPort(name, {}).port);
    EXPECT_EQ(log.text, "\"" + name + "\" cannot be the name of a socket");
    log.text.clear();
    EXPECT_FALSE(_ports.createRemotePort(name));
    EXPECT_EQ(log.text, "\"" + name + "\" cannot be the name of a socket");
  }
}

TEST(SocketPortsWithoutAFolder, CannotMakeAPort) {
  LastLine log;
  SocketPorts ports(std::filesystem::path("/nowhere/at/all"));
  const auto created = ports.createLocalPort("name", {});
  EXPECT_FALSE(created.port);
  EXPECT_FALSE(created.alreadyExists);
  EXPECT_EQ(log.text,
            "cannot open /nowhere/at/all/name.lock: No such file or directory; name another folder with "
            "--runtime-dir");
}

using SocketPortsDeathTest = SocketPortsTest;

TEST_F(SocketPortsDeathTest, AnExceptionThatLeavesTheMessageHandlerEndsTheProgram) {
  testing::FLAGS_gtest_death_test_style = "threadsafe";
  EXPECT_DEATH(
      {
        const auto local = _ports
                               .createLocalPort(_name,
                                                [](std::int32_t, ByteView) -> std::optional<Bytes> {
                                                  throw std::runtime_error("thrown by a handler");
                                                })
                               .port;
        local->deliverOnMainQueue();
        const RawSocket peer = RawSocket::connectedTo(path());
        peer.send(frameBytes(0, FrameMark::Message, ""));
        runFor(1min);
      },
      "thrown by a handler");
}

}  // namespace
}  // namespace varnel
