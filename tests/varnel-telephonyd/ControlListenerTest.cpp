#include "programs/varnel-telephonyd/ControlListener.h"

#include <gtest/gtest.h>
#include <sys/stat.h>

#include <memory>
#include <stdexcept>
#include <string>
#include <vector>

#include "host/ControlClient.h"
#include "host/ServerControl.h"
#include "tests/support/EventLoop.h"
#include "tests/support/Process.h"
#include "tests/support/RawSocket.h"
#include "tests/support/RecordingLog.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;

class ControlListenerTest : public testing::Test {
 protected:
  std::unique_ptr<ControlListener> listener(const SocketLimits& limits = {.connections = 16}) {
    return std::make_unique<ControlListener>(
        _folder.path(),
        [this](const ControlRequest& request) -> ControlReply {
          _requests.push_back(request);
          if (request.command == ControlRequest::Command::Pause) return ControlRefusal{"not now"};
          return ServerStatus{.channels = _requests.size()};
        },
        limits);
  }
  RawSocket client() { return RawSocket::connectedTo(_folder.file("com.orvane.TelephonyServer.Control")); }
  static Bytes framed(ByteView payload, FrameMark mark = FrameMark::Request) {
    Bytes bytes;
    appendFrame(bytes, {5, mark, payload});
    return bytes;
  }
  static Bytes statusRequest() { return framed(controlProtocol::writeRequest({})); }
  static Bytes statusRequests(int count) {
    Bytes bytes;
    for (const Bytes request = statusRequest(); count > 0; --count)
      bytes.insert(bytes.end(), request.begin(), request.end());
    return bytes;
  }
  // The replies that come until the connection ends, or until there are this many.
  static std::vector<ControlReply> replies(const RawSocket& client, std::size_t most) {
    FrameReader reader;
    std::vector<ControlReply> replies;
    while (replies.size() < most) {
      if (!runUntil([&] { return client.waits(0ms); })) break;
      const Bytes bytes = client.receive(0ms);
      if (bytes.empty()) break;
      reader.feed(bytes);
      while (const auto frame = reader.next()) {
        EXPECT_EQ(frame->identifier, 5);
        replies.push_back(controlProtocol::readReply(frame->payload).value());
      }
    }
    return replies;
  }
  static bool hasEnded(const RawSocket& client) {
    return runUntil([&] { return client.waits(0ms) && client.receive(0ms).empty(); });
  }

  TemporaryFolder _folder;
  std::vector<ControlRequest> _requests;
};

TEST_F(ControlListenerTest, AnswersEachRequest) {
  const auto listening = listener();
  const RawSocket socket = client();
  socket.send(statusRequests(100));
  const auto answers = replies(socket, 100);
  ASSERT_EQ(answers.size(), 100u);
  EXPECT_EQ(std::get<ServerStatus>(answers[99]).channels, 100u);
}

TEST_F(ControlListenerTest, WithoutAServerInTheOwnFolderTheSystemsIsMeant) {
  const std::filesystem::path own = _folder.file("own"), system = _folder.path();
  std::filesystem::create_directory(own);
  ::chmod(system.c_str(), 03770);
  EXPECT_EQ(nearestControl(own, system).path, own);
  const auto systems = listener();
  EXPECT_EQ(nearestControl(own, system).path, system);
  EXPECT_EQ(nearestControl(std::filesystem::path(_folder.file("missing")), system).path, system);
  const ControlListener owns(own, [](const ControlRequest&) { return ServerStatus{}; });
  EXPECT_EQ(nearestControl(own, system).path, own);
}

TEST_F(ControlListenerTest, TellsWhyItRefuses) {
  const auto listening = listener();
  const RawSocket socket = client();
  socket.send(framed(controlProtocol::writeRequest({.command = ControlRequest::Command::Pause})));
  EXPECT_EQ(replies(socket, 1), (std::vector<ControlReply>{ControlRefusal{"not now"}}));
}

TEST_F(ControlListenerTest, WhatIsNoRequestIsAnsweredByASentenceAndEndsTheConnection) {
  const auto listening = listener();
  for (const Bytes& bytes :
       {framed(Bytes{1, 2, 3}), framed(controlProtocol::writeRequest({}), FrameMark::Message),
        framed(Bytes(4097, ' '))}) {
    const RawSocket socket = client();
    RecordingLog log;
    socket.send(bytes);
    EXPECT_EQ(replies(socket, 1),
              (std::vector<ControlReply>{ControlRefusal{
                  "the telephony server does not understand this; use programs of one version"}}));
    EXPECT_TRUE(hasEnded(socket));
    EXPECT_EQ(
        log.takeTexts(),
        (std::vector<std::string>{"<4>A request to the server cannot be understood: its connection ends"}));
  }
  EXPECT_TRUE(_requests.empty());
}

TEST_F(ControlListenerTest, BytesThatAreNoFrameEndTheConnection) {
  const auto listening = listener();
  const RawSocket socket = client();
  socket.send(Bytes(9, 0xFF));
  EXPECT_TRUE(hasEnded(socket));
}

TEST_F(ControlListenerTest, AFrameThatIsNeverWholeEndsTheConnection) {
  const auto listening = listener({.connections = 16, .frameTime = 50ms});
  const RawSocket socket = client();
  const Bytes request = statusRequest();
  socket.send(ByteView(request).first(request.size() - 1));
  EXPECT_TRUE(hasEnded(socket));
  EXPECT_TRUE(_requests.empty());
}

TEST_F(ControlListenerTest, TheSeventeenthConnectionIsToldThatThereAreEnough) {
  const auto listening = listener();
  std::vector<RawSocket> clients;
  for (int i = 0; i < 16; ++i) {
    clients.push_back(client());
    clients.back().send(statusRequest());
    ASSERT_EQ(replies(clients.back(), 1).size(), 1u);
  }
  const RawSocket last = client();
  ASSERT_TRUE(runUntil([&] { return last.waits(0ms); }));
  FrameReader reader;
  reader.feed(last.receive());
  EXPECT_EQ(controlProtocol::readReply(reader.next().value().payload),
            ControlReply(ControlRefusal{
                "the telephony server is controlled by as many programs as it takes; end one of them"}));
}

TEST_F(ControlListenerTest, AClientThatNeverReadsDoesNotDisturbOthers) {
  const auto listening = listener();
  const RawSocket greedy = client();
  greedy.send(statusRequests(100));
  const RawSocket other = client();
  other.send(statusRequest());
  EXPECT_EQ(replies(other, 1).size(), 1u);
}

std::string failureOf(const std::function<void()>& operation) {
  try {
    operation();
  } catch (const std::runtime_error& error) {
    return error.what();
  }
  return "";
}

TEST_F(ControlListenerTest, AProgramControlsTheServerByItsClass) {
  const PeerThread server([this] { return std::shared_ptr<ControlListener>(listener()); });
  const ServerControl control(_folder.path(), 60s);
  EXPECT_EQ(control.status().channels, 1u);
  EXPECT_EQ(control.goOn().channels, 2u);
  EXPECT_EQ(control.setSpeed(2).channels, 3u);
  EXPECT_EQ(control.seek(90s).channels, 4u);
  EXPECT_EQ(control.setTechnology("kalvi-lte").channels, 5u);
  EXPECT_EQ(control.stop().channels, 6u);
  EXPECT_EQ(failureOf([&] { control.pause(); }), "not now");
  using Command = ControlRequest::Command;
  ASSERT_EQ(_requests.size(), 7u);
  EXPECT_EQ(_requests[2], (ControlRequest{.command = Command::SetSpeed, .speed = 2}));
  EXPECT_EQ(_requests[3], (ControlRequest{.command = Command::Seek, .place = StreamPlace(90s)}));
  EXPECT_EQ(_requests[4], (ControlRequest{.command = Command::SetTechnology, .technology = "kalvi-lte"}));
}

TEST_F(ControlListenerTest, WithoutAServerThereIsOneSentence) {
  EXPECT_EQ(failureOf([&] { ServerControl(_folder.path()).status(); }),
            "no telephony server serves in " + _folder.path().string() +
                "; start varnel-telephonyd, or name its folder with --runtime-dir");
}

TEST_F(ControlListenerTest, AServerThatDoesNotAnswerIsOneSentence) {
  const RawSocket silent = RawSocket::listeningAt(_folder.file("com.orvane.TelephonyServer.Control"));
  EXPECT_EQ(
      failureOf([&] { ServerControl(_folder.path(), 10ms).status(); }),
      "the telephony server in " + _folder.path().string() + " does not answer; end it and start it again");
}

// In the event loop of the listener, which a client that waits would stop.
TEST_F(ControlListenerTest, RepliesComeInTheOrderOfTheRequestsWithoutWaiting) {
  const auto open = listener();
  ControlClient client{RuntimeFolder(_folder.path())};
  std::string replies;
  const auto note = [&](const std::optional<ControlReply>& reply) {
    if (!reply) {
      replies += "none ";
    } else if (const auto* status = std::get_if<ServerStatus>(&*reply)) {
      replies += std::to_string(status->channels) + ' ';
    } else {
      replies += std::get<ControlRefusal>(*reply).sentence + ' ';
    }
  };
  client.ask({}, note);
  client.ask({.command = ControlRequest::Command::Pause}, note);
  client.ask({}, note);
  EXPECT_EQ(replies, "");
  EXPECT_TRUE(client.isWaiting());
  EXPECT_TRUE(runUntil([&] { return !client.isWaiting(); }));
  EXPECT_EQ(replies, "1 not now 3 ");
}

TEST_F(ControlListenerTest, ARequestToAServerThatIsNotThereOrHasGoneGetsNoReply) {
  ControlClient client{RuntimeFolder(_folder.path())};
  int withReply = 0, without = 0;
  const auto note = [&](const std::optional<ControlReply>& reply) { ++(reply ? withReply : without); };
  client.ask({}, note);
  EXPECT_EQ(without, 0) << "not from within";
  EXPECT_TRUE(runUntil([&] { return without == 1; }));
  auto open = listener();
  client.ask({}, note);
  EXPECT_TRUE(runUntil([&] { return withReply == 1; }));
  client.ask({}, note);
  open.reset();
  EXPECT_TRUE(runUntil([&] { return without == 2; }));
  open = listener();
  client.ask({}, note);
  EXPECT_TRUE(runUntil([&] { return withReply == 2; }));
}

TEST_F(ControlListenerTest, ARequestThatFindsTheServerGetsItsOwnReplyAfterOneThatDidNot) {
  ControlClient client{RuntimeFolder(_folder.path())};
  std::string replies;
  const auto note = [&replies](const std::string& name) {
    return [&replies, name](const std::optional<ControlReply>& reply) {
      replies += name + (reply ? " has a reply, " : " has none, ");
    };
  };
  client.ask({}, note("first"));
  const auto open = listener();
  client.ask({}, note("second"));
  EXPECT_TRUE(runUntil([&] { return !client.isWaiting(); }));
  EXPECT_EQ(replies, "first has none, second has a reply, ");
}

}  // namespace
}  // namespace varnel
