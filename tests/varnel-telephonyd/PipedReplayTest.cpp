#include "programs/varnel-telephonyd/PipedReplay.h"

#include <gtest/gtest.h>

#include <string>
#include <utility>
#include <vector>

#include "programs/varnel-telephonyd/TelephonyServer.h"
#include "tests/support/FakeQueue.h"
#include "tests/support/MemoryPorts.h"
#include "tests/support/RecordingLog.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;

class FakeReader final : public RecordReader {
 public:
  FakeReader(int& requests, std::optional<RecordReading>& reading) : _requests(requests), _reading(reading) {}
  void request() override { ++_requests; }
  std::optional<RecordReading> take() override { return std::exchange(_reading, std::nullopt); }

 private:
  int& _requests;
  std::optional<RecordReading>& _reading;
};

class PipedReplayTest : public testing::Test {
 protected:
  // The next record comes. The reader had to wait for it, unless it was there already.
  void comes(std::int64_t seconds, Bytes message, bool wasAwaited) {
    RecordReading reading;
    reading.time = {seconds, 0};
    reading.message = std::move(message);
    if (reading.message.front() == 0x81) reading.subscription = reading.message[1];
    reading.wasAwaited = wasAwaited;
    arrives(reading);
  }
  void ends(const std::string& error = "") {
    RecordReading reading;
    reading.isEnd = true;
    reading.error = error;
    arrives(reading);
  }
  void arrives(const RecordReading& reading) {
    _reading = reading;
    _replay.recordArrived();
  }
  static std::pair<std::chrono::milliseconds, Bytes> next(MessageSource& source) {
    auto message = source.next();
    if (!message) return {-1ms, {}};
    return {message->at, message->bytes};
  }
  using Played = std::pair<std::chrono::milliseconds, Bytes>;

  FakeQueue _queue;
  int _requests = 0;
  std::optional<RecordReading> _reading;
  PipedReplay _replay{{.reader = std::make_unique<FakeReader>(_requests, _reading),
                       .queue = _queue,
                       .uptime = [this] { return _queue.now(); },
                       .name = "the pipe"}};
};

TEST_F(PipedReplayTest, ReadsNothingWithoutAViewerAndOneRecordAtATimeWithOne) {
  _queue.advance(1min);
  EXPECT_EQ(_requests, 0);
  auto source = _replay.makeSource();
  EXPECT_FALSE(source->next());
  EXPECT_FALSE(source->next());
  EXPECT_TRUE(source->isWaiting());
  EXPECT_EQ(_requests, 1);
  source.reset();
  comes(1000, {1}, true);
  EXPECT_EQ(_requests, 1);
  source = _replay.makeSource();
  EXPECT_EQ(next(*source), (Played{0ms, {1}}));
  EXPECT_EQ(_requests, 1);
  EXPECT_FALSE(source->next());
  EXPECT_EQ(_requests, 2);
}

TEST_F(PipedReplayTest, LiveRecordsArePlayedWhenTheyComeWhateverTheirTimes) {
  const auto source = _replay.makeSource();
  const std::pair<std::chrono::milliseconds, std::int64_t> records[] = {
      {100ms, 1000}, {200ms, 1003}, {300ms, 1002}, {400ms, 1'700'000'000}, {500ms, 1000}, {600ms, 1001}};
  RecordingLog log;
  for (const auto& [at, seconds] : records) {
    EXPECT_FALSE(source->next());
    _queue.advance(at - _queue.now());
    comes(seconds, {1}, true);
    EXPECT_EQ(next(*source), (Played{at, {1}}));
  }
  EXPECT_TRUE(log.lines().empty());
}

TEST_F(PipedReplayTest, RecordsThatAreThereAlreadyKeepTheirDistances) {
  _queue.advance(7s);
  const auto source = _replay.makeSource();
  source->next();
  _queue.advance(50ms);
  comes(1000, {1}, true);
  EXPECT_EQ(next(*source), (Played{50ms, {1}}));
  source->next();
  comes(1002, {2}, false);
  EXPECT_EQ(next(*source), (Played{2050ms, {2}}));
  _queue.advance(2s);
  source->next();
  comes(1003, {3}, false);
  EXPECT_EQ(next(*source), (Played{3050ms, {3}}));
  _queue.advance(1s);
  source->next();
  comes(1103, {4}, false);
  EXPECT_EQ(next(*source), (Played{8050ms, {4}}));
}

TEST_F(PipedReplayTest, AfterAStallOfALivePipeWhatHasPiledUpIsPlayedAtOnce) {
  const auto source = _replay.makeSource();
  source->next();
  comes(1000, {1}, true);
  EXPECT_EQ(next(*source), (Played{0ms, {1}}));
  source->next();
  _queue.advance(4s);
  comes(1001, {2}, true);
  EXPECT_EQ(next(*source), (Played{4s, {2}}));
  for (const std::int64_t seconds : {1002, 1003, 1004}) {
    source->next();
    comes(seconds, {3}, false);
    EXPECT_LE(next(*source).first, 4s);
  }
  source->next();
  comes(1006, {4}, false);
  EXPECT_EQ(next(*source), (Played{6s, {4}}));
}

TEST_F(PipedReplayTest, AMessageThatAViewerDidNotGetIsTheFirstOneOfTheNextViewer) {
  auto source = _replay.makeSource();
  source->next();
  comes(1000, {1}, true);
  EXPECT_EQ(next(*source), (Played{0ms, {1}}));
  source.reset();
  _queue.advance(10s);
  source = _replay.makeSource();
  EXPECT_EQ(next(*source).second, Bytes{1});
  EXPECT_EQ(source->nameOfLast(), "Record 1 of the pipe");
  EXPECT_FALSE(source->next());
}

TEST_F(PipedReplayTest, WithoutAViewerTheTimeOfRecordsThatAreThereStandsStill) {
  auto source = _replay.makeSource();
  source->next();
  comes(1000, {1}, false);
  source->next();
  source->next();
  comes(1003, {2}, false);
  EXPECT_EQ(next(*source), (Played{3s, {2}}));
  _queue.advance(1s);
  source.reset();
  _queue.advance(1min);
  source = _replay.makeSource();
  EXPECT_EQ(next(*source), (Played{2s, {2}}));
  _queue.advance(2s);
  source->next();
  comes(1004, {3}, false);
  EXPECT_EQ(next(*source), (Played{3s, {3}}));
}

TEST_F(PipedReplayTest, ASecondViewerWaitsUntilTheFirstHasGone) {
  auto first = _replay.makeSource();
  auto second = _replay.makeSource();
  int news = 0;
  second->setNewsHandler([&] { ++news; });
  first->next();
  EXPECT_FALSE(second->next());
  EXPECT_EQ(first->waitNote(), "");
  EXPECT_EQ(
      second->waitNote(),
      "another viewer shows the pipe, which can be read only once; this one goes on when that one ends");
  comes(1000, {1}, true);
  EXPECT_FALSE(second->next());
  EXPECT_TRUE(second->isWaiting());
  news = 0;
  first.reset();
  EXPECT_EQ(news, 0);
  _queue.run();
  EXPECT_EQ(news, 1);
  EXPECT_EQ(next(*second), (Played{0ms, {1}}));
  EXPECT_EQ(second->waitNote(), "");
}

TEST_F(PipedReplayTest, TheFirstViewerAfterTheEndTellsItToTheUser) {
  const auto first = _replay.makeSource();
  first->next();
  ends();
  EXPECT_FALSE(first->isEndTold());
  EXPECT_FALSE(first->next());
  EXPECT_FALSE(first->isWaiting());
  EXPECT_EQ(first->endNote(), "the replay of the pipe has ended");
  const auto second = _replay.makeSource();
  EXPECT_TRUE(second->isEndTold());
  EXPECT_FALSE(second->next());
  EXPECT_FALSE(second->isWaiting());
  EXPECT_EQ(second->waitNote(), "");
  EXPECT_EQ(second->endNote(), "the replay of the pipe has ended");
  EXPECT_EQ(_requests, 1);
}

TEST_F(PipedReplayTest, AFaultEndsItWithALogLine) {
  const auto source = _replay.makeSource();
  source->next();
  RecordingLog log;
  ends("the pipe is damaged");
  EXPECT_EQ(log.takeTexts(), (std::vector<std::string>{"<3>The replay ends: the pipe is damaged"}));
  EXPECT_FALSE(source->next());
  EXPECT_EQ(source->endNote(), "the replay has ended early: the pipe is damaged");
}

TEST_F(PipedReplayTest, OfTwoSubscriptionsTheFirstIsPlayed) {
  const auto source = _replay.makeSource();
  source->next();
  comes(1000, {0x81, 2, 1, 13}, true);
  EXPECT_EQ(next(*source), (Played{0ms, {0x81, 2, 1, 13}}));
  source->next();
  comes(1000, {0x81, 1, 1, 13}, true);
  EXPECT_FALSE(source->next());
  EXPECT_EQ(_requests, 3);
  comes(1000, {0x81, 2, 1, 14}, true);
  EXPECT_EQ(next(*source), (Played{0ms, {0x81, 2, 1, 14}}));
}

// Two viewers at a server.
class PipedStreamTest : public PipedReplayTest {
 protected:
  std::string start() {
    const std::string text =
        "<plist version=\"1.0\"><dict><key>SetState</key><string>Streaming</string></dict></plist>";
    const std::string port = _server.createLogChannel("viewer").portName.value();
    _ports.deliver(port, 0, Bytes(text.begin(), text.end()));
    _queue.run();
    return port;
  }
  std::vector<Bytes> sent() {
    std::vector<Bytes> messages;
    for (const auto& request : std::exchange(_ports.requests, {})) {
      if (request.identifier == 0) messages.push_back(request.data);
    }
    return messages;
  }

  MemoryPorts _ports;
  std::vector<std::string> _told;
  TelephonyServer _server{{.ports = _ports,
                           .queue = _queue,
                           .uptime = [this] { return _queue.now(); },
                           .technology = "kalvi-lte",
                           .makeSource = [this] { return _replay.makeSource(); },
                           .messageSent = [](ByteView) {},
                           .tell = [this](const std::string& sentence) { _told.push_back(sentence); }}};
};

TEST_F(PipedStreamTest, EachMessageIsSentWhenItComes) {
  start();
  EXPECT_EQ(sent(), std::vector<Bytes>());
  for (const std::uint8_t number : {1, 2, 3}) {
    _queue.advance(20s);
    EXPECT_EQ(_requests, number);
    comes(1000 + number, {number}, true);
    _queue.run();
    EXPECT_EQ(sent(), (std::vector<Bytes>{{number}}));
  }
  EXPECT_EQ(_server.counts(), (MessageCounts{.received = 3, .delivered = 3}));
}

TEST_F(PipedStreamTest, AMessageWithoutRoomGoesToTheNextViewerAndIsCountedOnce) {
  const std::string first = start();
  bool hasRoom = false;
  _ports.answer = [&](const MemoryPorts::Request&) {
    return RemotePort::SendResult{hasRoom ? 0 : RemotePort::sendTimeout, std::nullopt};
  };
  comes(1000, {1}, true);
  _queue.advance(2s);
  _ports.invalidateLocalPort(first);
  EXPECT_EQ(_server.counts(), MessageCounts{});
  hasRoom = true;
  sent();
  start();
  EXPECT_EQ(sent(), (std::vector<Bytes>{{1}}));
  EXPECT_EQ(_server.counts(), (MessageCounts{.received = 1, .delivered = 1}));
}

TEST_F(PipedStreamTest, AWaitingViewerGoesOnAfterTheFirstOne) {
  const std::string first = start();
  start();
  comes(1000, {1}, true);
  _queue.run();
  EXPECT_EQ(sent(), (std::vector<Bytes>{{1}}));
  _ports.invalidateLocalPort(first);
  _queue.run();
  comes(1001, {2}, true);
  _queue.run();
  EXPECT_EQ(sent(), (std::vector<Bytes>{{2}}));
  EXPECT_EQ(_server.channels(), 1u);
}

TEST_F(PipedStreamTest, TheEndIsToldOnceAndTheServerGoesOn) {
  start();
  start();
  ends();
  _queue.advance(2s);
  start();
  EXPECT_EQ(_told, (std::vector<std::string>{"the replay of the pipe has ended"}));
  EXPECT_EQ(_server.channels(), 3u);
}

}  // namespace
}  // namespace varnel
