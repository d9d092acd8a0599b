#include "programs/varnel-telephonyd/sources/PortSession.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <random>
#include <string>
#include <vector>

#include "tests/support/FakeQueue.h"
#include "tests/support/ScriptedModem.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::IsEmpty;
using Kind = PortFailure::Kind;
using Requests = std::vector<Bytes>;

const Bytes version{0x00}, build{0x7C}, eventsOff{0x60, 0x00};
const Bytes debugTextOff{0x7D, 5, 0, 0, 0, 0, 0, 0};
const Bytes allCodesOff{0x73, 0, 0, 0, 0, 0, 0, 0}, codeNumbers{0x73, 0, 0, 0, 1, 0, 0, 0};
const Bytes twoProbes{0x00, 0x78, 0xF0, 0x7E, 0x00, 0x78, 0xF0, 0x7E};
const Bytes onlyB002{0x73, 0, 0, 0, 3, 0, 0, 0, 0x0B, 0, 0, 0, 3, 0, 0, 0, 0x04};

WantedCodes wanted(CodeFilter::Codes codes) {
  WantedCodes result;
  result.add({.modemCodes = std::move(codes), .serverCodes = {}});
  return result;
}

// A session with a modem in memory.
class PortSessionTest : public testing::Test {
 protected:
  void begin() {
    _session.begin();
    run();
  }
  // Lets the modem answer what was sent, until it has nothing more to say.
  void run() {
    while (!_sent.empty()) {
      const Bytes bytes = std::exchange(_sent, {});
      _all.insert(_all.end(), bytes.begin(), bytes.end());
      if (!_isListening) continue;
      if (const Bytes answer = _modem.take(bytes); !answer.empty()) _session.take(answer);
    }
  }
  void want(CodeFilter::Codes codes) {
    _session.setWanted(wanted(std::move(codes)));
    run();
  }
  void advance(std::chrono::milliseconds duration) {
    _queue.advance(duration);
    run();
  }
  void end() {
    _session.end([this] { _hasEnded = true; });
    run();
  }
  Requests requests() { return std::exchange(_modem.requests, {}); }
  // What a port is taken for that says this after the first request. It gets no other command.
  static std::optional<Kind> failureAfter(const Bytes& said) {
    FakeQueue queue;
    Bytes sent;
    LeftOut leftOut;
    std::optional<Kind> kind;
    PortSession session({.queue = queue,
                         .send = [&](ByteView bytes) { sent.insert(sent.end(), bytes.begin(), bytes.end()); },
                         .record = [](const CaptureRecord&) { ADD_FAILURE(); },
                         .ready = [] { ADD_FAILURE(); },
                         .failed = [&](const PortFailure& failure) { kind = failure.kind; },
                         .refused = [](std::size_t, const std::string&) { ADD_FAILURE(); },
                         .leftOut = leftOut});
    session.begin();
    session.take(said);
    queue.advance(1min);
    EXPECT_LE(sent.size(), twoProbes.size());
    EXPECT_TRUE(std::equal(sent.begin(), sent.end(), twoProbes.begin()));
    return kind;
  }

  FakeQueue _queue;
  ScriptedModem _modem;
  bool _isListening = true;
  Bytes _sent, _all;
  std::vector<Bytes> _messages;
  std::vector<PortFailure> _failures;
  std::vector<std::string> _refusals;
  int _timesReady = 0;
  bool _hasEnded = false;
  LeftOut _leftOut;
  PortSession _session{
      {.queue = _queue,
       .send = [this](ByteView bytes) { _sent.insert(_sent.end(), bytes.begin(), bytes.end()); },
       .record =
           [this](const CaptureRecord& record) {
             _messages.emplace_back(record.message.begin(), record.message.end());
           },
       .ready = [this] { ++_timesReady; },
       .failed = [this](const PortFailure& failure) { _failures.push_back(failure); },
       .refused =
           [this](std::size_t equipment, const std::string& detail) {
             _refusals.push_back(std::to_string(equipment) + ": " + detail);
           },
       .leftOut = _leftOut}};
};

TEST_F(PortSessionTest, ProbesMakesQuietAndAsksWhichCodesThereAre) {
  begin();
  EXPECT_EQ(requests(), (Requests{version, build, eventsOff, debugTextOff, allCodesOff, codeNumbers}));
  EXPECT_TRUE(_session.isReady());
  EXPECT_EQ(_timesReady, 1);
  EXPECT_EQ(_session.build(), "TEST.1.0-42");
  EXPECT_EQ(_leftOut, LeftOut{});
  advance(1min);
  EXPECT_THAT(requests(), IsEmpty());
  EXPECT_THAT(_failures, IsEmpty());
}

TEST_F(PortSessionTest, SendsOneRequestAtATime) {
  _isListening = false;
  begin();
  EXPECT_EQ(_all, (Bytes{0x00, 0x78, 0xF0, 0x7E}));
  advance(1999ms);
  EXPECT_EQ(_all.size(), 4u);
}

TEST_F(PortSessionTest, SwitchesOnTheCodesThatAreWantedAndNoOthers) {
  begin();
  requests();
  want({0xB002});
  EXPECT_EQ(requests(), (Requests{onlyB002}));
  want({0xB002});
  EXPECT_THAT(requests(), IsEmpty());
  _modem.numbers[5] = 0;
  want({0xB002, 0x512F, 0xB400});
  EXPECT_THAT(requests(), IsEmpty());
  EXPECT_EQ(_session.missingCodes(), 2u);
}

TEST_F(PortSessionTest, CodesThatAreWantedEarlySwitchOnWhenTheNumbersAreKnown) {
  _session.setWanted(wanted({0xB002}));
  EXPECT_THAT(_sent, IsEmpty());
  begin();
  EXPECT_EQ(requests(),
            (Requests{version, build, eventsOff, debugTextOff, allCodesOff, codeNumbers, onlyB002}));
}

TEST_F(PortSessionTest, EachEquipmentHasItsRequestAndAnotherMaskReplacesTheFirst) {
  _modem.numbers[5] = 0x400;
  begin();
  requests();
  want({0x5001, 0xB002});
  EXPECT_EQ(requests(), (Requests{{0x73, 0, 0, 0, 3, 0, 0, 0, 5, 0, 0, 0, 2, 0, 0, 0, 0x02}, onlyB002}));
  want({0xB009});
  // A mask without a bit, as long as the one before.
  EXPECT_EQ(requests(), (Requests{{0x73, 0, 0, 0, 3, 0, 0, 0, 5, 0, 0, 0, 2, 0, 0, 0, 0x00},
                                  {0x73, 0, 0, 0, 3, 0, 0, 0, 0x0B, 0, 0, 0, 10, 0, 0, 0, 0x00, 0x02}}));
  EXPECT_FALSE(_modem.isOn(0x5001));
  EXPECT_FALSE(_modem.isOn(0xB002));
  EXPECT_TRUE(_modem.isOn(0xB009));
}

TEST_F(PortSessionTest, BecomesQuietWhenNothingIsWantedAndGoesOnAfterwards) {
  begin();
  want({0xB002});
  requests();
  want({});
  EXPECT_EQ(requests(), (Requests{eventsOff, allCodesOff, debugTextOff}));
  EXPECT_FALSE(_modem.isOn(0xB002));
  advance(1min);
  EXPECT_THAT(requests(), IsEmpty());
  want({0xB002});
  EXPECT_EQ(requests(), (Requests{onlyB002}));
}

TEST_F(PortSessionTest, WhatIsWantedMeanwhileIsAskedOnce) {
  begin();
  requests();
  _session.setWanted(wanted({0xB001}));
  _session.setWanted(wanted({0xB003}));
  _session.setWanted(wanted({0xB002}));
  run();
  EXPECT_EQ(requests(), (Requests{{0x73, 0, 0, 0, 3, 0, 0, 0, 0x0B, 0, 0, 0, 2, 0, 0, 0, 0x02}, onlyB002}));
}

TEST_F(PortSessionTest, LogsGoOnBetweenAnswers) {
  _modem.beforeAnswers = framed(logContents(0xB002, {7}));
  begin();
  want({0xB002});
  ASSERT_EQ(_messages.size(), 7u);
  EXPECT_EQ(_messages[0], (Bytes{1, 13, 0, 0x02, 0xB0, 0, 0, 0, 0, 0, 0, 0, 0, 7}));
  EXPECT_EQ(_messages[6], _messages[0]);
  EXPECT_TRUE(_modem.isOn(0xB002));
}

TEST_F(PortSessionTest, AWrapperNamesTheSubscription) {
  begin();
  Bytes contents{0x98, 1, 0, 0, 2, 0, 0, 0};
  const Bytes log = logContents(0xB002, {7});
  contents.insert(contents.end(), log.begin(), log.end());
  _session.take(framed(contents));
  EXPECT_THAT(_messages, ElementsAre(Bytes{0x81, 2, 1, 13, 0, 0x02, 0xB0, 0, 0, 0, 0, 0, 0, 0, 0, 7}));
}

TEST_F(PortSessionTest, FramesMayComeInPieces) {
  begin();
  for (const std::uint8_t byte : framed(logContents(0xB002, {0x7E, 0x7D}))) _session.take(Bytes{byte});
  EXPECT_THAT(_messages, ElementsAre(logMessage(0xB002, {0x7E, 0x7D})));
}

TEST_F(PortSessionTest, WhatHoldsNoRecordIsCounted) {
  begin();
  Bytes unsound = framed(logContents(0xB002, {1}));
  unsound[12] ^= 1;
  _session.take(unsound);
  _session.take(framed({0x9E, 1, 2, 3}));
  _session.take(framed({0x92, 1, 2}));
  _session.take(framed({0x10, 0, 13, 0, 14, 0, 2, 0xB0, 0, 0, 0, 0, 0, 0, 0, 0, 1}));
  const Bytes whole = framed(logContents(0xB002, {1}));
  _session.take(ByteView(whole).first(9));
  _session.takeEnd();
  EXPECT_THAT(_messages, IsEmpty());
  EXPECT_EQ(_leftOut,
            (LeftOut{.badChecksum = 1, .torn = 1, .otherCommands = 1, .encrypted = 1, .broken = 1}));
}

TEST_F(PortSessionTest, TheFirstFrameMayBeTorn) {
  const Bytes whole = framed(logContents(0xB002, {1}));
  _session.take(ByteView(whole).subspan(5));
  begin();
  EXPECT_TRUE(_session.isReady());
  EXPECT_EQ(_leftOut, LeftOut{.torn = 1});
}

TEST_F(PortSessionTest, ALostAnswerIsAskedForOnceMore) {
  _isListening = false;
  begin();
  _isListening = true;
  advance(2s);
  EXPECT_TRUE(_session.isReady());
  EXPECT_EQ(requests()[0], version);
}

TEST_F(PortSessionTest, AnAnswerThatComesLateIsNotTakenForTheNextOne) {
  _modem.otherAnswers = {{build, {}}};
  begin();
  EXPECT_EQ(requests(), (Requests{version, build}));
  advance(2s);
  _session.take(framed({0x7C, 1, 0}));
  EXPECT_TRUE(_session.isReady());
  EXPECT_EQ(_session.build(), "Mar 14 2025 15:09:26");
  EXPECT_EQ(_leftOut, LeftOut{.otherCommands = 1});
}

TEST_F(PortSessionTest, ARefusalThatComesLateIsNotTakenForThatOfTheNextRequest) {
  _modem.otherAnswers = {{build, {}}, {eventsOff, {}}, {debugTextOff, {}}, {allCodesOff, {}}};
  begin();
  for (int i = 0; i < 3; ++i) advance(2s);
  EXPECT_EQ(requests(), (Requests{version, build, eventsOff, debugTextOff, allCodesOff}));
  _modem.otherAnswers.clear();
  _session.take(framed({0x13, 0x7C}));
  run();
  EXPECT_THAT(requests(), IsEmpty());
  _session.take(framed({0x73, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0}));
  _session.take(framed({0x13, 0x73, 0, 0, 0, 0, 0, 0, 0}));
  run();
  EXPECT_TRUE(_session.isReady());
  EXPECT_THAT(_failures, IsEmpty());
}

TEST_F(PortSessionTest, WhatIsNotNeededMayBeRefused) {
  _modem.otherAnswers = {{build, {0x13, 0x7C}}, {eventsOff, {0x14, 0x60}}, {debugTextOff, {0x13, 0x7D}}};
  begin();
  EXPECT_TRUE(_session.isReady());
  EXPECT_EQ(_session.build(), "Mar 14 2025 15:09:26");
}

TEST_F(PortSessionTest, APortThatSaysNothingIsAskedTwice) {
  _isListening = false;
  begin();
  advance(2s);
  EXPECT_EQ(_all, twoProbes);
  EXPECT_THAT(_failures, IsEmpty());
  advance(2s);
  ASSERT_EQ(_failures.size(), 1u);
  EXPECT_EQ(_failures[0].kind, Kind::AnswersNothing);
  advance(1min);
  EXPECT_EQ(_all, twoProbes);
}

// Replies, and what such a port says without being asked.
TEST_F(PortSessionTest, APortThatSpeaksLikeOneForATCommandsIsToldFromASilentOne) {
  for (const std::string text : {"\r\nOK\r\n", "\r\nERROR\r\n", "\r\n+CME ERROR: 4\r\n", "\r\nRING\r\n",
                                 "\r\n+CREG: 1\r\n", "\r\n^RSSI: 17\r\n"}) {
    EXPECT_EQ(failureAfter(Bytes(text.begin(), text.end())), Kind::AnswersText) << text;
  }
}

TEST_F(PortSessionTest, APortThatRepeatsWhatItGetsTakesATCommands) {
  EXPECT_EQ(failureAfter({0x00, 0x78, 0xF0, 0x7E}), Kind::AnswersText);
  EXPECT_EQ(failureAfter({0x78, 0xF0, 0x7E}), Kind::AnswersText);
}

// Positions, and bytes at another speed.
TEST_F(PortSessionTest, APortThatSaysSomethingElseDoesNotAnswer) {
  const std::string positions = "\r\n$GPGGA,,,,,,0,,,,,,,,*66\r\n";
  EXPECT_EQ(failureAfter(Bytes(positions.begin(), positions.end())), Kind::AnswersNothing);
  EXPECT_EQ(failureAfter(Bytes(3000, 0xFE)), Kind::AnswersNothing);
  EXPECT_EQ(failureAfter({'\r', '\n', '+'}), Kind::AnswersNothing);
}

TEST_F(PortSessionTest, APortWhoseLogsComeIsOneEvenWithoutItsVersion) {
  _modem.otherAnswers = {{version, {}}};
  begin();
  _session.take(framed(logContents(0xB002, {1})));
  advance(4s);
  EXPECT_TRUE(_session.isReady());
}

TEST_F(PortSessionTest, AModemThatRefusesItsLogsSaysWhy) {
  _modem.otherAnswers = {{codeNumbers, {0x13, 0x73}}};
  begin();
  ASSERT_EQ(_failures.size(), 1u);
  EXPECT_EQ(_failures[0].kind, Kind::Refuses);
  EXPECT_EQ(_failures[0].detail, "error 0x13");
  EXPECT_FALSE(_session.isReady());
}

TEST_F(PortSessionTest, NumbersThatAreCutOffAreARefusal) {
  _modem.otherAnswers = {{codeNumbers, Bytes{0x73, 0, 0, 0, 1, 0, 0, 0, 0, 0, 0, 0, 1, 2, 3, 4}}};
  begin();
  ASSERT_EQ(_failures.size(), 1u);
  EXPECT_EQ(_failures[0].detail, "an answer of 16 bytes");
}

TEST_F(PortSessionTest, AMaskThatIsRefusedIsToldAndNotRepeated) {
  _modem.numbers[5] = 0x400;
  _modem.otherAnswers = {{{0x73, 0, 0, 0, 3, 0, 0, 0, 5}, {0x15, 0x73}}};
  begin();
  requests();
  want({0x5001, 0xB002});
  EXPECT_EQ(requests().size(), 2u);
  EXPECT_THAT(_refusals, ElementsAre("5: error 0x15"));
  EXPECT_TRUE(_modem.isOn(0xB002));
  EXPECT_FALSE(_session.refusesAll());
  want({0x5001});
  EXPECT_TRUE(_session.refusesAll());
  EXPECT_THAT(_failures, IsEmpty());
}

TEST_F(PortSessionTest, AModemThatAnswersNoMoreIsAFailure) {
  begin();
  _isListening = false;
  want({0xB002});
  advance(2s);
  EXPECT_THAT(_failures, IsEmpty());
  advance(2s);
  ASSERT_EQ(_failures.size(), 1u);
  EXPECT_EQ(_failures[0].kind, Kind::FallsSilent);
}

TEST_F(PortSessionTest, IsQuietAgainAtTheEnd) {
  begin();
  want({0xB002});
  requests();
  end();
  EXPECT_EQ(requests(), (Requests{eventsOff, allCodesOff, debugTextOff}));
  EXPECT_TRUE(_hasEnded);
  EXPECT_FALSE(_modem.isOn(0xB002));
}

TEST_F(PortSessionTest, AtTheEndItWaitsForNoOlderAnswer) {
  begin();
  requests();
  _session.setWanted(wanted({0xB002}));
  end();
  EXPECT_EQ(requests(), (Requests{onlyB002, eventsOff, allCodesOff, debugTextOff}));
  EXPECT_TRUE(_hasEnded);
}

TEST_F(PortSessionTest, AtTheEndASilentModemTakesFourSecondsAndGetsAllRequests) {
  begin();
  want({0xB002});
  requests();
  _modem.otherAnswers = {{eventsOff, {}}, {allCodesOff, {}}, {debugTextOff, {}}};
  end();
  advance(3999ms);
  EXPECT_FALSE(_hasEnded);
  advance(1ms);
  EXPECT_TRUE(_hasEnded);
  EXPECT_EQ(requests(), (Requests{eventsOff, allCodesOff, debugTextOff}));
}

TEST_F(PortSessionTest, AtTheEndAModemThatKeepsSilentAboutEventsStillAnswersThatAllCodesAreOff) {
  _modem.otherAnswers = {{eventsOff, {}}, {debugTextOff, {}}};
  begin();
  advance(4s);
  want({0xB002});
  EXPECT_TRUE(_modem.isOn(0xB002));
  end();
  advance(2s);
  EXPECT_FALSE(_modem.isOn(0xB002));
  EXPECT_FALSE(_hasEnded);
  advance(2s);
  EXPECT_TRUE(_hasEnded);
}

// Bytes of no modem, and sound frames with any contents, at any time.
TEST_F(PortSessionTest, TakesAnyBytesAndKeepsWithinItsCommands) {
  std::minstd_rand random(17);
  const auto byte = [&] { return static_cast<std::uint8_t>(random() >> 8); };
  const Bytes starts{0x00, 0x10, 0x13, 0x60, 0x73, 0x7C, 0x7D, 0x98, 0x9E};
  begin();
  for (int i = 0; i < 20'000; ++i) {
    Bytes bytes(random() % 40);
    std::ranges::generate(bytes, byte);
    if (i % 4 != 0 && !bytes.empty()) {
      bytes[0] = starts[i % starts.size()];
      bytes = framed(bytes);
    }
    _session.take(bytes);
    if (i % 7 == 0) want({0xB000 + i % 0x400});
    if (i % 11 == 0) advance(1s);
  }
  end();
  advance(10s);
  EXPECT_TRUE(_hasEnded);
  EXPECT_LT(_all.size(), 1'000'000u);
}

TEST_F(PortSessionTest, WhatIsNoDiagnosticPortEndsAtOnceWithoutARequest) {
  _isListening = false;
  begin();
  const std::size_t before = _all.size();
  end();
  EXPECT_TRUE(_hasEnded);
  EXPECT_EQ(_all.size(), before);
}

// Whatever happens, a modem gets no command but these.
TEST_F(PortSessionTest, SendsNoOtherCommandsThanThese) {
  _modem.numbers.fill(0x1000);
  _modem.beforeAnswers = framed(logContents(0xB002, {7}));
  begin();
  want({0xB002, 0x1FFF, 0x512F});
  _session.setWanted([] {
    WantedCodes all;
    all.add({});
    return all;
  }());
  run();
  want({});
  end();
  const Requests all = requests();
  EXPECT_GT(all.size(), 25u);
  for (const Bytes& request : all) {
    const bool isMask =
        request.size() > 16 && std::equal(onlyB002.begin(), onlyB002.begin() + 8, request.begin());
    EXPECT_TRUE(isMask || request == version || request == build || request == eventsOff ||
                request == debugTextOff || request == allCodesOff || request == codeNumbers)
        << testing::PrintToString(request);
  }
}

}  // namespace
}  // namespace varnel
