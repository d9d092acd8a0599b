#include "programs/varnel-telephonyd/TelephonyServer.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <string>
#include <utility>
#include <vector>

#include "host/CaptureWriter.h"
#include "host/StreamReport.h"
#include "programs/varnel-telephonyd/ReplaySource.h"
#include "programs/varnel-telephonyd/SimulationSource.h"
#include "programs/varnel-telephonyd/simulation/Technologies.h"
#include "tests/support/FakeQueue.h"
#include "tests/support/MemoryPorts.h"
#include "tests/support/Process.h"
#include "tests/support/RecordingLog.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;

Bytes bytesOf(const std::string& text) { return Bytes(text.begin(), text.end()); }

Bytes command(const std::string& dictionary) {
  return bytesOf("<plist version=\"1.0\"><dict>" + dictionary + "</dict></plist>");
}

const Bytes technologyRequest = command("<key>GetTechnology</key><string>GetTechnology</string>");
const Bytes startEverything = command("<key>SetState</key><string>Streaming</string>");

Bytes startWith(const std::string& modemCodes, const std::string& serverCodes) {
  return command("<key>SetState</key><string>Streaming</string><key>SetKalviLogCodes</key><array>" +
                 modemCodes + "</array><key>SetTkExtraCodes</key><array>" + serverCodes + "</array>");
}

// A modem packet with this log code. All its other bytes are 0.
Bytes modemPacket(std::uint8_t code) { return {1, 12, 0, code, 0, 0, 0, 0, 0, 0, 0, 0, 0}; }
Bytes serverPacket(std::uint8_t code) { return {0xFF, 12, 0, code, 0, 0, 0, 0, 0, 0, 0, 0, 0}; }

class ListSource final : public MessageSource {
 public:
  ListSource(std::vector<StreamMessage> messages, Lateness lateness, std::string endNote)
      : _messages(std::move(messages)), _lateness(lateness), _endNote(std::move(endNote)) {}
  std::optional<StreamMessage> next() override {
    if (_next == _messages.size()) return std::nullopt;
    return _messages[_next++];
  }
  Lateness lateness() const override { return _lateness; }
  std::string endNote() const override { return _endNote; }

 private:
  const std::vector<StreamMessage> _messages;
  const Lateness _lateness;
  const std::string _endNote;
  std::size_t _next = 0;
};

class TelephonyServerTest : public testing::Test {
 protected:
  using Sent = std::vector<Bytes>;

  std::string channel() {
    const auto made = _server.createLogChannel("viewer");
    EXPECT_EQ(made.error, 0);
    return made.portName.value_or("");
  }

  // The messages of the stream that were sent since the last call, without reports.
  Sent sent() {
    Sent messages;
    for (const auto& request : _ports.requests) {
      EXPECT_EQ(request.timeout, 0ms);
      EXPECT_EQ(request.replyTimeout, std::nullopt);
      if (request.identifier == 1) {
        _reports.push_back(readStreamReport(request.data).value());
      } else {
        EXPECT_EQ(request.identifier, 0);
        messages.push_back(request.data);
      }
    }
    _ports.requests.clear();
    return messages;
  }

  // Makes the viewer's port refuse messages while `hasRoom` is false.
  void takeOnlyWhile(const bool& hasRoom) {
    _ports.answer = [&hasRoom](const MemoryPorts::Request&) {
      return RemotePort::SendResult{hasRoom ? 0 : RemotePort::sendTimeout, std::nullopt};
    };
  }

  std::vector<StreamMessage> _stream{
      {0ms, modemPacket(1)}, {100ms, serverPacket(2)}, {250ms, modemPacket(3)}};
  std::vector<Bytes> _recorded;
  std::vector<std::string> _told;
  std::vector<StreamReport> _reports;
  MessageSource::Lateness _lateness = MessageSource::Lateness::Waits;
  std::string _endNote;
  MemoryPorts _ports;
  FakeQueue _queue;
  TelephonyServer _server{
      {.ports = _ports,
       .queue = _queue,
       .uptime = [this] { return _queue.now(); },
       .technology = "kalvi-lte",
       .makeSource = [this] { return std::make_unique<ListSource>(_stream, _lateness, _endNote); },
       .messageSent = [this](ByteView message) { _recorded.emplace_back(message.begin(), message.end()); },
       .tell = [this](const std::string& sentence) { _told.push_back(sentence); }}};
};

TEST_F(TelephonyServerTest, TellsTheTechnology) {
  const auto reply = _ports.deliver(channel(), 0, technologyRequest);
  ASSERT_TRUE(reply);
  const std::string text(reply->begin(), reply->end());
  EXPECT_NE(text.find("<key>GetTechnology</key>\n\t<string>kalvi-lte</string>"), std::string::npos) << text;
}

TEST_F(TelephonyServerTest, StreamsNothingBeforeTheStart) {
  const std::string port = channel();
  _ports.deliver(port, 0, technologyRequest);
  _queue.advance(10s);
  EXPECT_EQ(sent(), Sent());
}

TEST_F(TelephonyServerTest, StreamsAtThePaceOfItsSource) {
  const std::string port = channel();
  _queue.advance(7s);
  EXPECT_EQ(_ports.deliver(port, 0, startEverything), std::nullopt);
  EXPECT_EQ(sent(), Sent());
  _queue.run();
  EXPECT_EQ(sent(), (Sent{modemPacket(1)}));
  _queue.advance(99ms);
  EXPECT_EQ(sent(), Sent());
  _queue.advance(1ms);
  EXPECT_EQ(sent(), (Sent{serverPacket(2)}));
  _queue.advance(150ms);
  EXPECT_EQ(sent(), (Sent{modemPacket(3)}));
  _queue.advance(1min);
  EXPECT_EQ(sent(), Sent());
  EXPECT_EQ(_server.channels(), 1u);
}

TEST_F(TelephonyServerTest, StreamsOnlyTheCodesAskedFor) {
  _ports.deliver(channel(), 0, startWith("<integer>3</integer>", "<integer>1</integer>"));
  _queue.advance(1s);
  EXPECT_EQ(sent(), (Sent{modemPacket(3)}));
  EXPECT_EQ(_recorded, (Sent{modemPacket(3)}));
}

TEST_F(TelephonyServerTest, ASecondStartChangesTheCodesAndGoesOn) {
  const std::string port = channel();
  _ports.deliver(port, 0, startWith("<integer>1</integer>", ""));
  _queue.advance(50ms);
  EXPECT_EQ(sent(), (Sent{modemPacket(1)}));
  _ports.deliver(port, 0, startWith("", "<integer>2</integer>"));
  _queue.advance(1s);
  EXPECT_EQ(sent(), (Sent{serverPacket(2)}));
}

TEST_F(TelephonyServerTest, ManyMessagesAtOnceComeInOrder) {
  _stream.clear();
  for (int i = 0; i < 1000; ++i) _stream.push_back({0ms, Bytes(1, static_cast<std::uint8_t>(i))});
  _ports.deliver(channel(), 0, startEverything);
  _queue.run();
  const Sent messages = sent();
  ASSERT_EQ(messages.size(), 1000u);
  EXPECT_EQ(messages[999], Bytes{999 % 256});
}

TEST_F(TelephonyServerTest, AMessageThatIsTooLongForTheChannelIsLeftOutWithALineAndTheStreamGoesOn) {
  Bytes longest = modemPacket(1), tooLong = modemPacket(2);
  longest.resize(1'048'576);
  tooLong.resize(1'048'577);
  _stream = {{0ms, tooLong}, {0ms, longest}, {1ms, modemPacket(3)}};
  _ports.deliver(channel(), 0, startEverything);
  RecordingLog log;
  _queue.advance(1s);
  EXPECT_EQ(sent(), (Sent{longest, modemPacket(3)}));
  EXPECT_EQ(_recorded, (Sent{longest, modemPacket(3)}));
  EXPECT_EQ(_server.channels(), 1u);
  EXPECT_EQ(log.takeTexts(),
            (std::vector<std::string>{
                "<3>A message is left out: it has 1048577 bytes, and the channel takes 1048576"}));
}

TEST_F(TelephonyServerTest, ManyMessagesThatAreTooLongDoNotFillTheLog) {
  _stream.assign(20, {0ms, Bytes(1'048'577)});
  _ports.deliver(channel(), 0, startEverything);
  RecordingLog log;
  _queue.advance(1s);
  EXPECT_EQ(sent(), Sent());
  EXPECT_EQ(log.lines().size(), 10u);
}

TEST_F(TelephonyServerTest, AMessageTooLongForTheChannelThatNobodyAskedForIsNone) {
  Bytes tooLong = modemPacket(2);
  tooLong.resize(1'048'577);
  _stream = {{0ms, tooLong}};
  _ports.deliver(channel(), 0, startWith("<integer>1</integer>", ""));
  RecordingLog log;
  _queue.advance(1s);
  EXPECT_TRUE(log.lines().empty());
}

TEST_F(TelephonyServerTest, MalformedCommandsGetNoAnswerAndChangeNothing) {
  const std::string port = channel();
  EXPECT_EQ(_ports.deliver(port, 0, bytesOf("nonsense")), std::nullopt);
  EXPECT_EQ(_ports.deliver(port, 0, {}), std::nullopt);
  EXPECT_EQ(_ports.deliver(port, 0, command("<key>SetState</key><string>Idle</string>")), std::nullopt);
  _queue.advance(1s);
  EXPECT_EQ(sent(), Sent());
  EXPECT_TRUE(_ports.deliver(port, 0, technologyRequest));
}

TEST_F(TelephonyServerTest, CommandsWithAnotherIdentifierAreIgnored) {
  const std::string port = channel();
  EXPECT_EQ(_ports.deliver(port, 1, technologyRequest), std::nullopt);
  _ports.deliver(port, 1, startEverything);
  _queue.advance(1s);
  EXPECT_EQ(sent(), Sent());
}

TEST_F(TelephonyServerTest, AViewerWithoutAPortGetsAnError) {
  _ports.refusesRemotePorts = true;
  const auto made = _server.createLogChannel("viewer");
  EXPECT_EQ(made.error, 6);
  EXPECT_EQ(made.portName, std::nullopt);
  EXPECT_EQ(_server.channels(), 0u);
}

TEST_F(TelephonyServerTest, ACommandPortThatCannotBeMadeIsAnError) {
  _ports.refusesLocalPorts = true;
  EXPECT_EQ(_server.createLogChannel("viewer").error, 7);
  EXPECT_EQ(_server.channels(), 0u);
  EXPECT_EQ(_ports.remotePort(), nullptr);
}

TEST_F(TelephonyServerTest, AChannelEndsWithItsCommandPort) {
  const std::string port = channel();
  _ports.deliver(port, 0, startEverything);
  _queue.run();
  _ports.invalidateLocalPort(port);
  EXPECT_EQ(_server.channels(), 0u);
  EXPECT_EQ(_ports.remotePort(), nullptr);
  sent();
  _queue.advance(1s);
  EXPECT_EQ(sent(), Sent());
}

TEST_F(TelephonyServerTest, AChannelWithoutAStreamEndsSoonAfterItsViewer) {
  const std::string port = channel();
  _ports.endRemotePorts();
  _queue.advance(1s);
  EXPECT_EQ(_server.channels(), 0u);
  EXPECT_FALSE(_ports.hasLocalPort(port));
}

TEST_F(TelephonyServerTest, AStreamEndsWhenTheViewerIsGone) {
  _ports.deliver(channel(), 0, startEverything);
  _queue.run();
  _ports.endRemotePorts();
  _queue.advance(100ms);
  EXPECT_EQ(_server.channels(), 0u);
  EXPECT_EQ(_recorded, (Sent{modemPacket(1)}));
}

TEST_F(TelephonyServerTest, AViewerThatHasNoRoomIsGivenTime) {
  bool hasRoom = false;
  _ports.answer = [&](const MemoryPorts::Request&) {
    return RemotePort::SendResult{hasRoom ? 0 : RemotePort::sendTimeout, std::nullopt};
  };
  _ports.deliver(channel(), 0, startEverything);
  _queue.advance(4s);
  EXPECT_EQ(_server.channels(), 1u);
  EXPECT_EQ(_recorded, Sent());
  hasRoom = true;
  _queue.advance(1s);
  EXPECT_EQ(_recorded, (Sent{modemPacket(1), serverPacket(2), modemPacket(3)}));
}

TEST_F(TelephonyServerTest, AViewerThatDoesNotReadIsDropped) {
  _ports.answer = [&](const MemoryPorts::Request&) {
    return RemotePort::SendResult{RemotePort::sendTimeout, std::nullopt};
  };
  _ports.deliver(channel(), 0, startEverything);
  _queue.advance(6s);
  EXPECT_EQ(_server.channels(), 0u);
  EXPECT_EQ(_ports.remotePort(), nullptr);
}

TEST_F(TelephonyServerTest, EveryChannelHasItsOwnStream) {
  const std::string first = channel();
  _ports.deliver(first, 0, startWith("<integer>3</integer>", ""));
  _queue.advance(200ms);
  const std::string second = channel();
  EXPECT_NE(first, second);
  _ports.deliver(second, 0, startWith("<integer>1</integer>", ""));
  _queue.run();
  EXPECT_EQ(sent(), (Sent{modemPacket(1)}));
  _queue.advance(50ms);
  EXPECT_EQ(sent(), (Sent{modemPacket(3)}));
}

TEST_F(TelephonyServerTest, AViewerThatComesBackStartsAtTheBeginning) {
  const std::string first = channel();
  _ports.deliver(first, 0, startEverything);
  _queue.advance(1s);
  EXPECT_EQ(sent().size(), 3u);
  _ports.invalidateLocalPort(first);
  _ports.deliver(channel(), 0, startEverything);
  _queue.advance(1s);
  EXPECT_EQ(sent().size(), 3u);
  EXPECT_EQ(_server.channels(), 1u);
}

TEST_F(TelephonyServerTest, PortsOfTheServersOwnAreRefused) {
  for (const char* const name : {"com.orvane.TelephonyServer", "com.orvane.TelephonyServer.LogChannel.1",
                                 "com.orvane.TelephonyServer.LogChannel.7"}) {
    const auto made = _server.createLogChannel(name);
    EXPECT_EQ(made.error, 9) << name;
    EXPECT_EQ(made.portName, std::nullopt);
  }
  EXPECT_EQ(_server.channels(), 0u);
  EXPECT_EQ(_ports.remotePort(), nullptr);
  EXPECT_EQ(_server.createLogChannel("com.orvane.BasebandStateReport.LogChannel").error, 0);
}

TEST_F(TelephonyServerTest, ThereAreSixteenChannelsAtMost) {
  std::string last;
  for (int i = 0; i < 16; ++i) last = channel();
  EXPECT_EQ(_server.createLogChannel("viewer").error, 8);
  EXPECT_EQ(_server.channels(), 16u);
  _ports.invalidateLocalPort(last);
  EXPECT_EQ(_server.createLogChannel("viewer").error, 0);
}

TEST_F(TelephonyServerTest, AChannelWithoutACommandEndsAfterTenSeconds) {
  const std::string port = channel();
  _ports.deliver(port, 0, bytesOf("nonsense"));
  _queue.advance(9999ms);
  EXPECT_EQ(_server.channels(), 1u);
  _queue.advance(1ms);
  EXPECT_EQ(_server.channels(), 0u);
  EXPECT_FALSE(_ports.hasLocalPort(port));
  EXPECT_EQ(_ports.remotePort(), nullptr);
}

TEST_F(TelephonyServerTest, AChannelWithACommandStays) {
  _ports.deliver(channel(), 0, technologyRequest);
  _queue.advance(1h);
  EXPECT_EQ(_server.channels(), 1u);
}

TEST_F(TelephonyServerTest, EveryMessageThatIsDueIsCountedOnce) {
  _stream = {{0ms, modemPacket(1)},
             {0ms, Bytes((1 << 20) + 1, 1)},
             {0ms, modemPacket(3)},
             {0ms, Bytes(1 << 20, 1)},
             {1h, modemPacket(1)}};
  const std::string port = channel();
  // The long messages are packets of code 0x101.
  _ports.deliver(port, 0, startWith("<integer>1</integer><integer>257</integer>", ""));
  _queue.advance(1s);
  EXPECT_EQ(_server.counts(), (MessageCounts{.received = 4, .delivered = 2, .tooLong = 1, .notAskedFor = 1}));
  EXPECT_EQ(sent().size(), 2u);
  EXPECT_EQ(_reports, (std::vector{StreamReport{"", 0, 1}}));
  _ports.invalidateLocalPort(port);
  EXPECT_EQ(_server.counts(), (MessageCounts{.received = 4, .delivered = 2, .tooLong = 1, .notAskedFor = 1}));
}

TEST_F(TelephonyServerTest, AMessageInHandWhenTheViewerGoesIsDropped) {
  const bool hasRoom = false;
  takeOnlyWhile(hasRoom);
  _ports.deliver(channel(), 0, startEverything);
  _queue.advance(200ms);
  EXPECT_EQ(_server.counts(), (MessageCounts{.received = 1, .waiting = 1}));
  _server.end();
  EXPECT_EQ(_server.counts(), (MessageCounts{.received = 1, .dropped = 1}));
  EXPECT_EQ(_server.channels(), 0u);
}

TEST_F(TelephonyServerTest, CountsOfAllChannelsAreAdded) {
  _ports.deliver(channel(), 0, startEverything);
  _ports.deliver(channel(), 0, startWith("<integer>1</integer>", ""));
  _queue.advance(1s);
  EXPECT_EQ(_server.counts(), (MessageCounts{.received = 6, .delivered = 4, .notAskedFor = 2}));
}

TEST_F(TelephonyServerTest, AModemDoesNotWaitForAViewerWithoutRoom) {
  _lateness = MessageSource::Lateness::IsDropped;
  bool hasRoom = false;
  takeOnlyWhile(hasRoom);
  _ports.deliver(channel(), 0, startEverything);
  _queue.advance(1200ms);  // the first two messages are more than a second late, the third one is not
  hasRoom = true;
  _queue.advance(1s);
  EXPECT_EQ(_recorded, (Sent{modemPacket(3)}));
  EXPECT_EQ(_server.counts(), (MessageCounts{.received = 3, .delivered = 1, .dropped = 2}));
  sent();
  EXPECT_EQ(_reports.back(), (StreamReport{"", 2, 0}));
}

TEST_F(TelephonyServerTest, AReportThatFoundNoRoomIsSentLater) {
  _stream.resize(1);
  _endNote = "the end";
  bool hasRoom = true;
  takeOnlyWhile(hasRoom);
  _ports.deliver(channel(), 0, startEverything);
  _queue.run();
  hasRoom = false;
  _queue.advance(1s);
  hasRoom = true;
  _ports.requests.clear();
  _queue.advance(5s);
  sent();
  EXPECT_EQ(_reports, (std::vector{StreamReport{"the end", 0, 0}}));
}

TEST_F(TelephonyServerTest, LossesAreToldAtOnceAndThenEveryTenSecondsWhileTheyGrow) {
  _stream.clear();
  for (int second = 0; second < 30; ++second)
    _stream.push_back({std::chrono::seconds(second), Bytes((1 << 20) + 1, 1)});
  _ports.deliver(channel(), 0, startEverything);
  _queue.advance(1min);
  const auto told = [](const std::string& count) {
    return "messages: " + count + " received, 0 delivered, 0 dropped, " + count + " refused (" + count +
           " too long for the channel, 0 not asked for)";
  };
  EXPECT_EQ(_told, (std::vector<std::string>{told("1"), told("11"), told("21"), told("30")}));
}

TEST_F(TelephonyServerTest, TheEndOfAStreamIsToldOnBothSides) {
  _endNote = "the replay of walk.pcap has ended";
  _ports.deliver(channel(), 0, startEverything);
  _queue.advance(249ms);
  EXPECT_TRUE(_told.empty());
  _queue.advance(10s);
  EXPECT_EQ(_told, (std::vector<std::string>{"the replay of walk.pcap has ended"}));
  EXPECT_EQ(sent().size(), 3u);
  EXPECT_EQ(_reports, (std::vector{StreamReport{"the replay of walk.pcap has ended", 0, 0}}));
}

TEST_F(TelephonyServerTest, ANoteReachesEveryViewerAndThoseThatComeLater) {
  _ports.deliver(channel(), 0, technologyRequest);
  _server.note("the recording has ended");
  _queue.advance(1s);
  sent();
  EXPECT_EQ(_reports, (std::vector{StreamReport{"the recording has ended", 0, 0}}));
  _ports.deliver(channel(), 0, technologyRequest);
  _queue.advance(1s);
  sent();
  EXPECT_EQ(_reports.size(), 2u);
  EXPECT_EQ(_reports.back(), (StreamReport{"the recording has ended", 0, 0}));
}

// All messages of a tenth of a second at once, for a viewer that has room for some of them.
TEST_F(TelephonyServerTest, AFloodIsCountedToTheLastMessage) {
  _lateness = MessageSource::Lateness::IsDropped;
  _stream.assign(100'000, {0ms, modemPacket(1)});
  for (std::size_t i = 0; i < _stream.size(); i += 100) _stream[i].bytes = modemPacket(2);
  std::uint64_t taken = 0;
  _ports.answer = [&](const MemoryPorts::Request& request) {
    const bool takes = _queue.now() < 3s ? taken < 20'000 : true;
    taken += takes && request.identifier == 0 ? 1 : 0;
    return RemotePort::SendResult{takes ? 0 : RemotePort::sendTimeout, std::nullopt};
  };
  const std::string port = channel();
  _ports.deliver(port, 0, startWith("<integer>1</integer>", ""));
  _queue.advance(1min);
  const MessageCounts counts = _server.counts();
  EXPECT_EQ(counts.received, 100'000u);
  EXPECT_EQ(counts.delivered, taken);
  EXPECT_EQ(counts.delivered, 20'000u);
  EXPECT_EQ(counts.dropped, 79'000u);
  EXPECT_EQ(counts.refused(), 1'000u);
  EXPECT_EQ(_server.channels(), 1u);
  sent();
  EXPECT_EQ(_reports.back(), (StreamReport{"", 79'000, 0}));
}

// A live source: what the viewer has not taken waits in it, and some of it is lost there.
class QueueSource final : public MessageSource {
 public:
  struct Queue {
    std::size_t waiting = 0;
    std::uint64_t lost = 0;
    std::function<void()> news;
  };
  explicit QueueSource(Queue& queue) : _queue(queue) {}

  std::optional<StreamMessage> next() override {
    if (_queue.waiting == 0) return std::nullopt;
    const std::uint8_t code = _queue.waiting-- % 10 == 0 ? 2 : 1;
    return StreamMessage{0ms, modemPacket(code)};
  }
  bool isWaiting() const override { return true; }
  void setNewsHandler(std::function<void()> handler) override { _queue.news = std::move(handler); }
  Lateness lateness() const override { return Lateness::Waits; }
  std::uint64_t takeLost() override { return std::exchange(_queue.lost, 0); }
  std::size_t waiting() const override { return _queue.waiting; }

 private:
  Queue& _queue;
};

// A thousand times a thousand messages for a viewer that reads now and then: each tenth message has a code
// that it has not asked for, and each thousand loses a hundred before they reach the channel.
TEST_F(TelephonyServerTest, OfAMillionMessagesEachIsDeliveredWaitingDroppedOrRefusedAtAnyTime) {
  QueueSource::Queue source;
  TelephonyServer server{{.ports = _ports,
                          .queue = _queue,
                          .uptime = [this] { return _queue.now(); },
                          .technology = "kalvi-lte",
                          .makeSource = [&source] { return std::make_unique<QueueSource>(source); },
                          .messageSent = [](ByteView) {},
                          .tell = [](const std::string&) {}}};
  bool hasRoom = true;
  std::uint64_t taken = 0;
  _ports.answer = [&](const MemoryPorts::Request& request) {
    if (hasRoom && request.identifier == 0) ++taken;
    return RemotePort::SendResult{hasRoom ? 0 : RemotePort::sendTimeout, std::nullopt};
  };
  _ports.deliver(server.createLogChannel("viewer").portName.value(), 0,
                 startWith("<integer>1</integer>", ""));
  std::uint64_t mostWaiting = 0;
  for (int round = 1; round <= 1000; ++round) {
    hasRoom = round % 5 != 0;
    source.waiting += 900;
    source.lost += 100;
    source.news();
    for (int step = 0; step < 3; ++step) {
      _queue.advance(10ms);
      const MessageCounts counts = server.counts();
      ASSERT_EQ(counts.received, counts.delivered + counts.waiting + counts.dropped + counts.refused());
      ASSERT_EQ(counts.delivered, taken);
      mostWaiting = std::max(mostWaiting, counts.waiting);
    }
    _ports.requests.clear();
  }
  hasRoom = true;
  _queue.advance(1s);
  EXPECT_EQ(server.counts(),
            (MessageCounts{
                .received = 1'000'000, .delivered = 810'000, .dropped = 100'000, .notAskedFor = 90'000}));
  EXPECT_EQ(mostWaiting, 899u);
  EXPECT_EQ(server.channels(), 1u);
}

// A capture of ten seconds with a message per second; the time is in the message.
class ReplayedStreamTest : public TelephonyServerTest {
 protected:
  ReplayedStreamTest() {
    CaptureWriter writer(_path);
    for (std::uint8_t second = 0; second <= 10; ++second)
      writer.write({1000 + second, 0}, modemPacket(second));
  }

  std::string start(ReplaySource::AtEnd atEnd = ReplaySource::AtEnd::Stop) {
    _atEnd = atEnd;
    const std::string port = _replay.createLogChannel("viewer").portName.value();
    _ports.deliver(port, 0, startEverything);
    _queue.run();
    return port;
  }
  // The seconds of the messages that were sent since the last call.
  std::vector<int> seconds() {
    std::vector<int> seconds;
    for (const Bytes& message : sent()) seconds.push_back(message.at(3));
    return seconds;
  }
  std::chrono::milliseconds position() const { return _replay.position().value().sinceStart; }

  TemporaryFolder _folder;
  const std::string _path = _folder.file("walk.pcap");
  ReplaySource::AtEnd _atEnd = ReplaySource::AtEnd::Stop;
  TelephonyServer _replay{{.ports = _ports,
                           .queue = _queue,
                           .uptime = [this] { return _queue.now(); },
                           .technology = "kalvi-lte",
                           .makeSource = [this] { return std::make_unique<ReplaySource>(_path, 1, _atEnd); },
                           .messageSent = [](ByteView) {},
                           .tell = [this](const std::string& sentence) { _told.push_back(sentence); }}};
};

using Seconds = std::vector<int>;

TEST_F(ReplayedStreamTest, ASeekForwardSendsWhatLiesBetweenAtOnceAndGoesOnFromThere) {
  start();
  _queue.advance(1500ms);
  EXPECT_EQ(seconds(), (Seconds{0, 1}));
  _replay.seek(6s);
  _queue.run();
  EXPECT_EQ(seconds(), (Seconds{2, 3, 4, 5, 6}));
  EXPECT_EQ(position(), 6s);
  _queue.advance(999ms);
  EXPECT_EQ(seconds(), Seconds());
  _queue.advance(1ms);
  EXPECT_EQ(seconds(), (Seconds{7}));
}

TEST_F(ReplayedStreamTest, ASeekBackwardStartsOverAtFullSpeed) {
  start();
  _queue.advance(7s);
  EXPECT_EQ(seconds(), (Seconds{0, 1, 2, 3, 4, 5, 6, 7}));
  _replay.seek(2500ms);
  _queue.run();
  EXPECT_EQ(seconds(), (Seconds{0, 1, 2, 3}));
  _queue.advance(1s);
  EXPECT_EQ(seconds(), (Seconds{4}));
  EXPECT_EQ(_replay.channels(), 1u);
}

TEST_F(ReplayedStreamTest, ASeekToATimeGoesByTheClockOfTheCapture) {
  start();
  _replay.seek(Time{1008, 0});
  _queue.run();
  EXPECT_EQ(seconds(), (Seconds{0, 1, 2, 3, 4, 5, 6, 7, 8}));
  _replay.seek(Time{1001, 500'000'000});
  _queue.run();
  EXPECT_EQ(seconds(), (Seconds{0, 1, 2}));
  EXPECT_EQ(_replay.position(), (StreamPosition{2s, Time{1002, 0}}));
}

TEST_F(ReplayedStreamTest, ASeekToTheMessageThatIsNextSendsItAtOnce) {
  start();
  _queue.advance(100ms);
  seconds();
  _replay.seek(1s);
  _queue.run();
  EXPECT_EQ(seconds(), (Seconds{1}));
  _queue.advance(1s);
  EXPECT_EQ(seconds(), (Seconds{2}));
}

TEST_F(ReplayedStreamTest, ASeekBehindTheEndEndsTheReplayAndASeekBackPlaysItAgain) {
  start();
  _replay.seek(1h);
  _queue.advance(2s);
  EXPECT_EQ(seconds().size(), 11u);
  EXPECT_EQ(_reports.back().note, "the replay of " + _path + " has ended");
  _replay.seek(9s);
  _queue.advance(1s);
  EXPECT_EQ(seconds(), (Seconds{0, 1, 2, 3, 4, 5, 6, 7, 8, 9, 10}));
  _replay.seek(0s);
  _queue.advance(1s);
  EXPECT_EQ(seconds(), (Seconds{0, 1}));
  EXPECT_EQ(_reports.back().note, "");
}

TEST_F(ReplayedStreamTest, ASeekThatALoopNeverReachesEndsWithTheRound) {
  start(ReplaySource::AtEnd::StartOver);
  _replay.seek(1h);
  _queue.run();
  EXPECT_EQ(seconds(), (Seconds{0, 1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 0}));
  _queue.advance(1s);
  EXPECT_EQ(seconds(), (Seconds{1}));
}

TEST_F(ReplayedStreamTest, APauseStopsTheStreamAndGoingOnKeepsTheDistances) {
  start();
  _queue.advance(1500ms);
  _replay.pause();
  seconds();
  _queue.advance(1h);
  EXPECT_EQ(seconds(), Seconds());
  EXPECT_TRUE(_replay.isPaused());
  _replay.goOn();
  _queue.advance(499ms);
  EXPECT_EQ(seconds(), Seconds());
  _queue.advance(1ms);
  EXPECT_EQ(seconds(), (Seconds{2}));
  EXPECT_EQ(_replay.counts(), (MessageCounts{.received = 3, .delivered = 3}));
}

TEST_F(ReplayedStreamTest, ASeekDuringAPauseSendsWhatIsBeforeThePlaceAndStaysThere) {
  start();
  _replay.pause();
  seconds();
  _replay.seek(3s);
  _queue.advance(1min);
  EXPECT_EQ(seconds(), (Seconds{1, 2}));
  _replay.seek(1s);
  _queue.advance(1min);
  EXPECT_EQ(seconds(), (Seconds{0}));
  _replay.goOn();
  _queue.advance(1s);
  EXPECT_EQ(seconds(), (Seconds{1, 2}));
}

TEST_F(ReplayedStreamTest, AStreamThatBeginsDuringAPauseWaitsAtItsStart) {
  _replay.pause();
  start();
  _queue.advance(1min);
  EXPECT_EQ(seconds(), Seconds());
  _replay.goOn();
  _queue.advance(1s);
  EXPECT_EQ(seconds(), (Seconds{0, 1}));
}

TEST_F(ReplayedStreamTest, ANewSpeedCountsFromNowOn) {
  start();
  _queue.advance(1500ms);
  seconds();
  _replay.setSpeed(4);
  _queue.advance(124ms);
  EXPECT_EQ(seconds(), Seconds());
  _queue.advance(1ms);
  EXPECT_EQ(seconds(), (Seconds{2}));
  _queue.advance(500ms);
  EXPECT_EQ(seconds(), (Seconds{3, 4}));
  _replay.setSpeed(0.001);
  _queue.advance(4999ms);
  EXPECT_EQ(seconds(), Seconds());
  _queue.advance(1ms);  // no wait is longer than five seconds
  EXPECT_EQ(seconds(), (Seconds{5}));
  EXPECT_EQ(position(), 5s);
}

TEST_F(ReplayedStreamTest, AChangeOfTechnologyEndsTheChannelsAndThoseThatComeBackAreTold) {
  start();
  seconds();
  _replay.changeTechnology("all-radios");
  EXPECT_EQ(_replay.channels(), 0u);
  const std::string port = _replay.createLogChannel("viewer").portName.value();
  const auto reply = _ports.deliver(port, 0, technologyRequest).value();
  EXPECT_NE(std::string(reply.begin(), reply.end()).find("<string>all-radios</string>"), std::string::npos);
  _ports.deliver(port, 0, startEverything);
  _queue.advance(1s);
  EXPECT_EQ(seconds(), (Seconds{0, 1}));
}

TEST_F(ReplayedStreamTest, AViewerWithoutRoomDuringASeekLosesNothing) {
  start();
  bool hasRoom = false;
  takeOnlyWhile(hasRoom);
  seconds();
  _replay.seek(5s);
  _queue.advance(3s);
  _ports.requests.clear();
  hasRoom = true;
  _queue.advance(20ms);
  EXPECT_EQ(seconds(), (Seconds{1, 2, 3, 4, 5}));
  _queue.advance(1s);
  EXPECT_EQ(seconds(), (Seconds{6}));
}

TEST_F(ReplayedStreamTest, ASeekBackDuringASeekForwardLosesNothing) {
  start();
  bool hasRoom = false;
  takeOnlyWhile(hasRoom);
  _replay.seek(5s);
  _queue.advance(1s);
  EXPECT_EQ(_replay.counts(), (MessageCounts{.received = 2, .delivered = 1, .waiting = 1}));
  _replay.seek(0s);
  EXPECT_EQ(_replay.counts(), (MessageCounts{.received = 1, .delivered = 1}));
  seconds();
  hasRoom = true;
  _queue.advance(2s);
  EXPECT_EQ(seconds(), (Seconds{0, 1, 2}));
  EXPECT_EQ(_replay.counts(), (MessageCounts{.received = 4, .delivered = 4}));
  EXPECT_EQ(_told, std::vector<std::string>());
}

TEST_F(TelephonyServerTest, ASimulationCanBePausedPlayedFasterAndPlayedAgain) {
  TelephonyServer server{
      {.ports = _ports,
       .queue = _queue,
       .uptime = [this] { return _queue.now(); },
       .technology = "kalvi-lte",
       .makeSource =
           [] { return std::make_unique<SimulationSource>([] { return simulatedModem("kalvi-lte", 1); }); },
       .messageSent = [](ByteView) {},
       .tell = [](const std::string&) {}}};
  Sent expected;
  std::size_t inTen = 0;
  const auto modem = simulatedModem("kalvi-lte", 1);
  for (SimulatedMessage next = modem->next(); next.at <= 40s; next = modem->next()) {
    expected.push_back(next.bytes);
    if (next.at <= 10s) ++inTen;
  }
  _ports.deliver(server.createLogChannel("viewer").portName.value(), 0, startEverything);
  _queue.advance(10s);
  EXPECT_EQ(sent().size(), inTen);
  server.pause();
  _queue.advance(1min);
  EXPECT_EQ(sent(), Sent());
  server.goOn();
  server.setSpeed(10);
  _queue.advance(3s);
  EXPECT_EQ(sent().size(), expected.size() - inTen);
  EXPECT_EQ(server.counts().dropped, 0u);
  server.setSpeed(1);
  server.seek(40s);  // what was played last is not behind it
  server.seek(10s);
  _queue.run();
  const Sent again = sent();
  ASSERT_GE(again.size(), inTen);
  EXPECT_TRUE(
      std::equal(again.begin(), again.begin() + static_cast<std::ptrdiff_t>(inTen), expected.begin()));
  EXPECT_GE(server.position().value().sinceStart, 10s);
}

struct SimulatedStream {
  const char* technology;
  Bytes start;                 // the viewer's command
  std::size_t fewestMessages;  // in half a minute
};

// The viewer asks for packets of CDMA2000 by their codes. An object stream has no codes to ask for.
const SimulatedStream simulatedStreams[] = {
    {"kalvi-lte", startEverything, 30},
    {"kalvi-cdma",
     command("<key>SetState</key><string>Streaming</string><key>SetKalviLogCodes</key><array>"
             "<integer>4234</integer><integer>4483</integer><integer>4498</integer><integer>4790</integer>"
             "<integer>4508</integer><integer>4509</integer><integer>4734</integer><integer>4943</integer>"
             "</array>"),
     200},
    {"ifx-gsm", startEverything, 30},
};

class SimulatedStreamTest : public testing::TestWithParam<SimulatedStream> {
 protected:
  template <class MakeSource, class MessageSent>
  std::vector<Bytes> serve(MakeSource makeSource, MessageSent messageSent) {
    _ports.requests.clear();
    TelephonyServer server{{.ports = _ports,
                            .queue = _queue,
                            .uptime = [this] { return _queue.now(); },
                            .technology = GetParam().technology,
                            .makeSource = makeSource,
                            .messageSent = messageSent,
                            .tell = [](const std::string& /*sentence*/) {}}};
    _ports.deliver(server.createLogChannel("viewer").portName.value(), 0, GetParam().start);
    _queue.advance(30s);
    std::vector<Bytes> sent;
    for (const auto& request : _ports.requests) {
      if (request.identifier == 0) sent.push_back(request.data);
    }
    return sent;
  }
  static std::unique_ptr<MessageSource> simulation() {
    return std::make_unique<SimulationSource>([] { return simulatedModem(GetParam().technology, 1); });
  }

  MemoryPorts _ports;
  FakeQueue _queue;
};

TEST_P(SimulatedStreamTest, TheViewersCommandStartsAllOfIt) {
  std::vector<Bytes> expected;
  const auto modem = simulatedModem(GetParam().technology, 1);
  for (SimulatedMessage next = modem->next(); next.at <= 30s; next = modem->next())
    expected.push_back(next.bytes);
  EXPECT_GT(expected.size(), GetParam().fewestMessages);
  EXPECT_EQ(serve(simulation, [](ByteView) {}), expected);
}

// A replayed recording of a simulated modem is the same stream.
TEST_P(SimulatedStreamTest, ARecordingIsReplayedAsItWasSent) {
  const TemporaryFolder folder;
  const std::string path = folder.file("walk.pcap");
  std::vector<Bytes> sent;
  {
    CaptureWriter writer(path);
    sent = serve(simulation, [&](ByteView message) {
      const auto now_ms = _queue.now().count();
      writer.write({1700000000 + now_ms / 1000, static_cast<std::int32_t>(now_ms % 1000 * 1000000)}, message);
    });
  }
  EXPECT_GT(sent.size(), GetParam().fewestMessages);
  EXPECT_EQ(serve([&] { return std::make_unique<ReplaySource>(path, 1, ReplaySource::AtEnd::Stop); },
                  [](ByteView) {}),
            sent);
}

INSTANTIATE_TEST_SUITE_P(Technologies, SimulatedStreamTest, testing::ValuesIn(simulatedStreams),
                         [](const auto& info) {
                           std::string name = info.param.technology;
                           std::erase(name, '-');
                           return name;
                         });

}  // namespace
}  // namespace varnel
