#include "programs/varnel-telephonyd/simulation/pty/SimulatedPort.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <deque>
#include <string>
#include <vector>

#include "platform/TelephonyService.h"
#include "programs/varnel-telephonyd/simulation/Technologies.h"
#include "programs/varnel-telephonyd/sources/PortSession.h"
#include "tests/support/FakeQueue.h"
#include "tests/support/ScriptedModem.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::SizeIs;

Bytes textBytes(const std::string& text) { return {text.begin(), text.end()}; }

// A packet of the log channel with a length and a time of a server.
Bytes packet(std::uint16_t code, std::uint8_t value) {
  return {1,
          13,
          0,
          static_cast<std::uint8_t>(code & 0xFF),
          static_cast<std::uint8_t>(code >> 8),
          0x10,
          0,
          0,
          0,
          0,
          0,
          0,
          0,
          value};
}

// Sends what the test says; afterwards nothing for a day.
class ListedModem final : public SimulatedModem {
 public:
  explicit ListedModem(std::deque<SimulatedMessage> messages) : _messages(std::move(messages)) {}
  std::string_view technology() const override { return technology::allRadios; }
  SimulatedMessage next() override {
    if (_messages.empty()) return {24h, {}};
    SimulatedMessage message = std::move(_messages.front());
    _messages.pop_front();
    return message;
  }

 private:
  std::deque<SimulatedMessage> _messages;
};

class SimulatedPortTest : public testing::Test {
 protected:
  void setUp(std::deque<SimulatedMessage> messages) {
    _port = std::make_unique<SimulatedPort>(
        SimulatedPort::Setup{.modem = std::make_unique<ListedModem>(std::move(messages)),
                             .queue = _queue,
                             .uptime = [this] { return _queue.now(); },
                             .now =
                                 [this] {
                                   return Time{1'000'000'000 + _queue.now() / 1s, 0};
                                 },
                             .send =
                                 [this](ByteView frame) {
                                   if (_isFull) return false;
                                   _stream.take(frame, [this](std::span<std::uint8_t> contents) {
                                     _frames.emplace_back(contents.begin(), contents.end());
                                   });
                                   return true;
                                 },
                             .build = "simulated"});
  }
  // The contents of the frames that have come since the last call.
  std::vector<Bytes> frames() { return std::exchange(_frames, {}); }
  std::vector<Bytes> answersTo(const Bytes& request) {
    frames();
    _port->take(framed(request));
    return frames();
  }
  void switchOn(std::uint8_t equipment, const Bytes& mask) {
    Bytes request{0x73, 0, 0, 0, 3, 0, 0, 0, equipment, 0, 0, 0, static_cast<std::uint8_t>(8 * mask.size()),
                  0,    0, 0};
    request.insert(request.end(), mask.begin(), mask.end());
    const auto answers = answersTo(request);
    ASSERT_THAT(answers, SizeIs(1));
    ASSERT_EQ(Bytes(answers[0].begin(), answers[0].begin() + 12),
              (Bytes{0x73, 0, 0, 0, 3, 0, 0, 0, 0, 0, 0, 0}));
  }
  void allOff() { answersTo({0x73, 0, 0, 0, 0, 0, 0, 0}); }
  // The last byte of each record that comes meanwhile.
  std::vector<int> valuesDuring(std::chrono::milliseconds duration) {
    frames();
    _queue.advance(duration);
    std::vector<int> values;
    for (const Bytes& contents : frames()) values.push_back(contents.back());
    return values;
  }

  FakeQueue _queue;
  LeftOut _leftOut;
  FrameStream _stream{_leftOut};
  bool _isFull = false;
  std::vector<Bytes> _frames;
  std::unique_ptr<SimulatedPort> _port;
};

TEST_F(SimulatedPortTest, AnswersTheProbe) {
  setUp({});
  const auto version = answersTo({0x00});
  ASSERT_THAT(version, SizeIs(1));
  EXPECT_EQ(version[0].size(), 55u);
  EXPECT_EQ(Bytes(version[0].begin(), version[0].begin() + 12), textBytes(std::string("\0Nov 22 2026", 12)));
  Bytes build{0x7C, 1, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0};
  for (const char letter : std::string("simulated")) build.push_back(static_cast<std::uint8_t>(letter));
  build.push_back(0);
  EXPECT_THAT(answersTo({0x7C}), ElementsAre(build));
}

TEST_F(SimulatedPortTest, AnswersRequestsForQuiet) {
  setUp({});
  EXPECT_THAT(answersTo({0x60, 0}), ElementsAre(Bytes{0x60, 0}));
  EXPECT_THAT(answersTo({0x7D, 5, 0, 0, 0, 0, 0, 0}), ElementsAre(Bytes{0x7D, 5, 1, 0, 0, 0, 0, 0}));
  EXPECT_THAT(answersTo({0x73, 0, 0, 0, 0, 0, 0, 0}),
              ElementsAre(Bytes{0x73, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0}));
}

TEST_F(SimulatedPortTest, TellsHowManyLogCodesThereAreOfEachEquipment) {
  setUp({});
  const auto answers = answersTo({0x73, 0, 0, 0, 1, 0, 0, 0});
  ASSERT_THAT(answers, SizeIs(1));
  ASSERT_EQ(answers[0].size(), 12u + 16 * 4);
  std::vector<int> equipments;
  for (int equipment = 0; equipment < 16; ++equipment) {
    if (answers[0][12 + 4 * equipment + 1] == 0x10) equipments.push_back(equipment);
  }
  EXPECT_THAT(equipments, ElementsAre(1, 4, 5, 7, 11, 13));
}

TEST_F(SimulatedPortTest, RefusesWhatItDoesNotKnow) {
  setUp({});
  EXPECT_THAT(answersTo({0x4B, 1}), ElementsAre(Bytes{0x13, 0x4B, 1}));
  EXPECT_THAT(answersTo({0x7D, 4, 0}), ElementsAre(Bytes{0x14, 0x7D, 4, 0}));
  EXPECT_THAT(answersTo({0x60}), ElementsAre(Bytes{0x15, 0x60}));
  EXPECT_THAT(answersTo({0x73, 0, 0, 0, 2, 0, 0, 0}), ElementsAre(Bytes{0x14, 0x73, 0, 0, 0, 2, 0, 0, 0}));
}

// A mask that is too short, one of more codes than there are, and one of an equipment beyond the last.
TEST_F(SimulatedPortTest, RefusesMasksThatDoNotFit) {
  setUp({});
  for (const Bytes& rest : {Bytes{0x0B, 0, 0, 0, 9, 0, 0, 0, 0xFF}, Bytes{0x00, 0, 0, 0, 1, 0, 0, 0, 1},
                            Bytes{0x10, 0, 0, 0, 1, 0, 0, 0, 1}}) {
    Bytes request{0x73, 0, 0, 0, 3, 0, 0, 0}, answer{0x73, 0, 0, 0, 3, 0, 0, 0, 1, 0, 0, 0};
    request.insert(request.end(), rest.begin(), rest.end());
    answer.insert(answer.end(), rest.begin(), rest.end());
    EXPECT_THAT(answersTo(request), ElementsAre(answer));
  }
  EXPECT_THAT(answersTo({0x73, 0, 0, 0, 3, 0, 0, 0, 1}),
              ElementsAre(Bytes{0x15, 0x73, 0, 0, 0, 3, 0, 0, 0, 1}));
  EXPECT_THAT(answersTo({0x73, 0, 0}), ElementsAre(Bytes{0x15, 0x73, 0, 0}));
}

TEST_F(SimulatedPortTest, SendsOnlyWhatIsSwitchedOn) {
  setUp({{1s, packet(0xB001, 1)}, {2s, packet(0xB002, 2)}, {3s, packet(0x5001, 3)}, {4s, packet(0xB001, 4)}});
  switchOn(0x0B, {0x02});
  EXPECT_THAT(valuesDuring(1min), ElementsAre(1, 4));
  EXPECT_EQ(_port->sent(), 2u);
  EXPECT_EQ(_port->dropped(), 0u);
}

TEST_F(SimulatedPortTest, WhileNothingIsOnItIsQuietAndThePhoneStandsStill) {
  setUp({{1s, packet(0xB001, 1)}, {2s, packet(0xB001, 2)}, {3s, packet(0xB001, 3)}});
  EXPECT_THAT(valuesDuring(1h), IsEmpty());
  switchOn(0x0B, {0x02});
  EXPECT_THAT(valuesDuring(1500ms), ElementsAre(1));
  allOff();
  EXPECT_THAT(valuesDuring(1h), IsEmpty());
  EXPECT_EQ(_queue.waitingTasks(), 0u);
  switchOn(0x0B, {0x02});
  EXPECT_THAT(valuesDuring(499ms), IsEmpty());
  EXPECT_THAT(valuesDuring(1ms), ElementsAre(2));
  EXPECT_THAT(valuesDuring(1s), ElementsAre(3));
}

// 1,000,000,001 s after 1970 are 684,035,201 s after 1980-01-06, that is 547,228,160,800 units of 1.25 ms
// (0x7F69571320).
TEST_F(SimulatedPortTest, ARecordHasTheModemsTimeAndItsOwnLength) {
  setUp({{1s, packet(0xB001, 7)}});
  switchOn(0x0B, {0x02});
  frames();
  _queue.advance(1s);
  EXPECT_THAT(frames(), ElementsAre(Bytes{0x10, 0, 13, 0, 13, 0, 0x01, 0xB0, 0, 0, 0x20, 0x13, 0x57, 0x69,
                                          0x7F, 0, 7}));
}

TEST_F(SimulatedPortTest, ARecordOfASubscriptionIsInAWrapperAndServersMessagesAreNotSent) {
  Bytes ofSecond{0x81, 2}, ofServer = packet(0xB001, 8);
  const Bytes inside = packet(0xB001, 7);
  ofSecond.insert(ofSecond.end(), inside.begin(), inside.end());
  ofServer[0] = 0xFF;
  setUp({{1s, ofSecond}, {1s, ofServer}, {1s, Bytes{1, 2, 3}}});
  switchOn(0x0B, {0x02});
  frames();
  _queue.advance(1s);
  const auto sent = frames();
  ASSERT_THAT(sent, SizeIs(1));
  EXPECT_EQ(Bytes(sent[0].begin(), sent[0].begin() + 9), (Bytes{0x98, 1, 0, 0, 2, 0, 0, 0, 0x10}));
}

TEST_F(SimulatedPortTest, WhatIsNotTakenIsCounted) {
  setUp({{1s, packet(0xB001, 1)}, {2s, packet(0xB001, 2)}});
  switchOn(0x0B, {0x02});
  _isFull = true;
  EXPECT_THAT(valuesDuring(1s), IsEmpty());
  _isFull = false;
  EXPECT_THAT(valuesDuring(1s), ElementsAre(2));
  EXPECT_EQ(_port->sent(), 1u);
  EXPECT_EQ(_port->dropped(), 1u);
}

// Each technology that sends packets has only log codes of the equipments that the port tells, and its first
// minutes have some.
TEST_F(SimulatedPortTest, EveryTechnologysLogCodesCanBeSwitchedOn) {
  for (const std::string_view technology : simulatedTechnologies()) {
    if (technology == technology::ifxGSM) continue;
    const auto modem = simulatedModem(technology, 1);
    int packets = 0;
    for (SimulatedMessage message = modem->next(); message.at < 5min; message = modem->next()) {
      const std::size_t begin = message.bytes.at(0) == 0x81 ? 2 : 0;
      if (message.bytes.at(begin) != 1) continue;
      ++packets;
      EXPECT_THAT(message.bytes.at(begin + 4) >> 4, testing::AnyOf(1, 4, 5, 7, 11, 13)) << technology;
    }
    EXPECT_GT(packets, 100) << technology;
  }
}

// The server's side of a port and the modem's agree.
TEST_F(SimulatedPortTest, ASessionGetsWhatItAsksFor) {
  setUp({{1s, packet(0xB001, 1)}, {2s, packet(0xB002, 2)}});
  Bytes toModem;
  std::vector<int> values;
  bool isReady = false, hasEnded = false;
  LeftOut leftOut;
  PortSession session(
      {.queue = _queue,
       .send = [&](ByteView bytes) { toModem.insert(toModem.end(), bytes.begin(), bytes.end()); },
       .record = [&](const CaptureRecord& record) { values.push_back(record.message.back()); },
       .ready = [&] { isReady = true; },
       .failed = [](const PortFailure&) { FAIL(); },
       .refused = [](std::size_t, const std::string&) { FAIL(); },
       .leftOut = leftOut});
  const auto run = [&] {
    do {
      _port->take(std::exchange(toModem, {}));
      for (const Bytes& contents : frames()) session.take(framed(contents));
    } while (!toModem.empty());
  };
  session.begin();
  run();
  EXPECT_TRUE(isReady);
  EXPECT_EQ(session.build(), "simulated");
  WantedCodes wanted;
  wanted.add({.modemCodes = CodeFilter::Codes{0xB002}, .serverCodes = {}});
  session.setWanted(wanted);
  run();
  _queue.advance(1min);
  run();
  EXPECT_THAT(values, ElementsAre(2));
  session.end([&] { hasEnded = true; });
  run();
  EXPECT_TRUE(hasEnded);
  EXPECT_EQ(leftOut, LeftOut{});
}

}  // namespace
}  // namespace varnel
