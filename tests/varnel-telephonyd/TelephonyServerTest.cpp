#include "programs/varnel-telephonyd/TelephonyServer.h"

#include <gtest/gtest.h>

#include <string>
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
  EXPECT_EQ(_server.counts(), (MessageCounts{.received = 1}));
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
    return std::make_unique<SimulationSource>(simulatedModem(GetParam().technology, 1));
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
