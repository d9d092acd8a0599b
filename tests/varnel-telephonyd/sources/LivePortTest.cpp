#include "programs/varnel-telephonyd/sources/LivePort.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <stdexcept>
#include <string>
#include <vector>

#include "programs/varnel-telephonyd/TelephonyServer.h"
#include "programs/varnel-telephonyd/sources/PortSource.h"
#include "tests/support/FakeQueue.h"
#include "tests/support/MemoryDevice.h"
#include "tests/support/MemoryPorts.h"
#include "tests/support/ScriptedModem.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::IsEmpty;

class LivePortTest : public testing::Test {
 protected:
  void open() {
    _port.open();
    run();
  }
  void run() {
    do {
      _device.run();
      _queue.run();
    } while (_device.isOpen && !_device.sent.empty());
  }
  void advance(std::chrono::milliseconds duration) {
    _queue.advance(duration);
    run();
  }
  std::unique_ptr<MessageSource> viewer(CodeFilter::Codes codes) {
    auto source = _port.makeSource();
    source->setFilter({.modemCodes = std::move(codes), .serverCodes = {}});
    run();
    return source;
  }
  void sendLog(std::uint16_t code, const Bytes& payload) {
    _device.handlers.bytesCame(framed(logContents(code, payload)));
  }
  static std::vector<Bytes> taken(MessageSource& source) {
    std::vector<Bytes> messages;
    while (auto next = source.next()) messages.push_back(std::move(next->bytes));
    return messages;
  }

  MemoryDevice _device;
  FakeQueue _queue;
  std::vector<std::string> _told, _builds, _failures;
  LivePort _port{{.device = std::make_unique<MemoryPortDevice>(_device),
                  .queue = _queue,
                  .uptime = [this] { return _queue.now(); },
                  .name = "/dev/modem",
                  .tell = [this](const std::string& sentence) { _told.push_back(sentence); },
                  .ready = [this](const std::string& build) { _builds.push_back(build); },
                  .failed = [this](const std::string& sentence) { _failures.push_back(sentence); }}};
};

const std::string unplugged = "/dev/modem is unplugged; plug it in again, and the display goes on";

TEST_F(LivePortTest, AViewersCodesAreSwitchedOnAndItsMessagesComeInOrder) {
  open();
  EXPECT_THAT(_builds, ElementsAre("TEST.1.0-42"));
  const auto source = viewer({0xB0C1});
  EXPECT_TRUE(_device.modem.isOn(0xB0C1));
  EXPECT_EQ(source->next(), std::nullopt);
  EXPECT_TRUE(source->isWaiting());
  sendLog(0xB0C1, {1});
  sendLog(0xB0C1, {2});
  EXPECT_THAT(taken(*source), ElementsAre(logMessage(0xB0C1, {1}), logMessage(0xB0C1, {2})));
  EXPECT_EQ(_port.records(), 2u);
  EXPECT_EQ(source->lateness(), MessageSource::Lateness::IsDropped);
  EXPECT_EQ(source->nameOfLast(), "A record of /dev/modem");
}

TEST_F(LivePortTest, ADeviceThatIsNoSerialLineMayGiveSeveralRecordsPerReadAndShortReads) {
  _device.isSerialLine = false;
  open();
  EXPECT_THAT(_builds, ElementsAre("TEST.1.0-42"));
  const auto source = viewer({0xB0C1});
  EXPECT_TRUE(_device.modem.isOn(0xB0C1));
  const Bytes read = MemoryDevice::message(
      {framed(logContents(0xB0C1, {1})), framed(logContents(0xB0C1, {2})), framed(logContents(0xB0C1, {3}))});
  _device.handlers.bytesCame(read);
  for (const std::uint8_t byte : read) _device.handlers.bytesCame(Bytes{byte});
  const Bytes one = logMessage(0xB0C1, {1}), two = logMessage(0xB0C1, {2}), three = logMessage(0xB0C1, {3});
  EXPECT_THAT(taken(*source), ElementsAre(one, two, three, one, two, three));
  EXPECT_EQ(_port.leftOut(), LeftOut{});
}

TEST_F(LivePortTest, AMessageIsDueWhenItHasCome) {
  open();
  advance(5s);
  const auto source = viewer({0xB0C1});
  advance(300ms);
  sendLog(0xB0C1, {1});
  EXPECT_EQ(source->next()->at, 300ms);
}

TEST_F(LivePortTest, AWaitingViewerIsToldOfNews) {
  open();
  const auto source = viewer({0xB0C1});
  int news = 0;
  source->setNewsHandler([&] { ++news; });
  sendLog(0xB0C1, {1});
  EXPECT_EQ(news, 1);
}

TEST_F(LivePortTest, SeveralViewersGetTheSameAndTheModemSendsWhatAnyOfThemWants) {
  open();
  const auto first = viewer({0xB0C1});
  auto second = viewer({0xB0C2});
  EXPECT_TRUE(_device.modem.isOn(0xB0C1));
  EXPECT_TRUE(_device.modem.isOn(0xB0C2));
  sendLog(0xB0C2, {1});
  EXPECT_EQ(taken(*first), taken(*second));
  second.reset();
  run();
  EXPECT_TRUE(_device.modem.isOn(0xB0C1));
  EXPECT_FALSE(_device.modem.isOn(0xB0C2));
}

TEST_F(LivePortTest, AfterTheLastViewerTheModemIsQuietAndTheNextOneWakesIt) {
  open();
  auto source = viewer({0xB0C1});
  source.reset();
  run();
  EXPECT_FALSE(_device.modem.isOn(0xB0C1));
  source = viewer({0xB0C1});
  EXPECT_TRUE(_device.modem.isOn(0xB0C1));
}

TEST_F(LivePortTest, AViewerThatStartsOverDoesNotSwitchTheModemOff) {
  open();
  auto source = viewer({0xB0C1});
  _device.modem.requests.clear();
  source.reset();
  source = viewer({0xB0C1});
  EXPECT_THAT(_device.modem.requests, IsEmpty());
}

TEST_F(LivePortTest, WhatAViewerDoesNotTakeIsBoundedAndCounted) {
  open();
  const auto source = viewer({0xB0C1});
  // A message of 200 bytes and its cost of 64: 63550 of them are below 16 MiB, and one more is not.
  const Bytes frame = framed(logContents(0xB0C1, Bytes(187, 1)));
  for (int i = 0; i < 63'600; ++i) _device.handlers.bytesCame(frame);
  EXPECT_EQ(source->waiting(), 63'550u);
  EXPECT_EQ(source->takeLost(), 50u);
  EXPECT_EQ(source->takeLost(), 0u);
  ASSERT_TRUE(source->next());
  _device.handlers.bytesCame(frame);
  EXPECT_EQ(source->takeLost(), 0u);
}

TEST_F(LivePortTest, CodesThatTheModemDoesNotHaveAreToldOnce) {
  open();
  const auto first = viewer({0xB0C1, 0xB821, 0x512F});
  const auto second = viewer({0xB821});
  EXPECT_THAT(_told, ElementsAre("the modem of /dev/modem does not have 2 of the log codes that viewers ask "
                                 "for; they are left out"));
}

TEST_F(LivePortTest, AnUnpluggedModemComesBackByItself) {
  open();
  const auto source = viewer({0xB0C1});
  int news = 0;
  source->setNewsHandler([&] { ++news; });
  _device.trouble =
      "there is no device /dev/modem; plug the modem in, or look for its ports with ls /dev/tty* "
      "/dev/wwan*";
  _device.unplug();
  EXPECT_EQ(news, 1);
  EXPECT_EQ(source->waitNote(), unplugged);
  EXPECT_TRUE(source->isWaiting());
  advance(1h);
  EXPECT_EQ(_device.openings, 3601);
  EXPECT_THAT(_told, ElementsAre(unplugged));
  _device.trouble.reset();
  _device.modem = {};
  advance(1s);
  EXPECT_TRUE(_device.modem.isOn(0xB0C1));
  EXPECT_EQ(source->waitNote(), "");
  EXPECT_EQ(news, 2);
  EXPECT_THAT(_told, ElementsAre(unplugged, "/dev/modem is back"));
  EXPECT_EQ(_builds.size(), 1u);
  sendLog(0xB0C1, {1});
  EXPECT_THAT(taken(*source), ElementsAre(logMessage(0xB0C1, {1})));
}

TEST_F(LivePortTest, ATroubleOfTheReturnIsToldWhenItLasts) {
  open();
  const auto source = viewer({0xB0C1});
  _device.unplug();
  _device.trouble = "another program uses it";
  advance(1s);
  EXPECT_EQ(source->waitNote(), unplugged);
  advance(1s);
  EXPECT_EQ(source->waitNote(), "another program uses it");
}

TEST_F(LivePortTest, ADeviceThatCannotBeOpenedAtTheStartIsAnError) {
  _device.trouble = "another program uses it";
  try {
    _port.open();
    FAIL();
  } catch (const std::runtime_error& error) {
    EXPECT_STREQ(error.what(), "another program uses it");
  }
}

TEST_F(LivePortTest, WhatIsNoDiagnosticPortFailsAtTheStart) {
  _device.modem.otherAnswers = {{{0x73}, {0x13, 0x73}}};
  open();
  EXPECT_THAT(
      _failures,
      ElementsAre("/dev/modem refuses to switch on its logs (error 0x13); allow it in the settings of "
                  "the modem, or use another modem"));
  EXPECT_FALSE(_device.isOpen);
  EXPECT_THAT(_builds, IsEmpty());
}

TEST_F(LivePortTest, AModemThatAnswersNoMoreIsOpenedAgain) {
  open();
  _device.modem.otherAnswers = {{{0x73}, {}}};
  const auto source = viewer({0xB0C1});
  advance(4s);
  EXPECT_EQ(source->waitNote(),
            "/dev/modem answers no more; if this goes on, unplug the modem and plug it in again");
  EXPECT_THAT(_failures, IsEmpty());
  _device.modem.otherAnswers.clear();
  advance(1s);
  EXPECT_EQ(source->waitNote(), "");
  EXPECT_TRUE(_device.modem.isOn(0xB0C1));
}

TEST_F(LivePortTest, CodesThatAreRefusedAreTold) {
  _device.modem.otherAnswers = {{{0x73, 0, 0, 0, 3}, {0x15, 0x73}}};
  open();
  const auto source = viewer({0xB0C1});
  EXPECT_EQ(
      source->waitNote(),
      "/dev/modem refuses to switch on its logs (error 0x15); allow it in the settings of the modem, or "
      "use another modem");
  EXPECT_EQ(_told.at(0),
            "/dev/modem refuses to switch on the log codes from 0xB000 on (error 0x15); sections that need "
            "them stay empty");
  _device.modem.otherAnswers.clear();
  source->setFilter({.modemCodes = CodeFilter::Codes{0xB0C2}, .serverCodes = {}});
  run();
  EXPECT_EQ(source->waitNote(), "");
  EXPECT_TRUE(_device.modem.isOn(0xB0C2));
}

TEST_F(LivePortTest, AtTheEndTheModemIsQuietAndTheDeviceIsClosed) {
  open();
  const auto source = viewer({0xB0C1});
  bool hasEnded = false;
  _port.end([&] { hasEnded = true; });
  run();
  EXPECT_TRUE(hasEnded);
  EXPECT_FALSE(_device.isOpen);
  EXPECT_FALSE(_device.modem.isOn(0xB0C1));
}

TEST_F(LivePortTest, TheEndComesAlsoWhileTheModemIsUnplugged) {
  open();
  bool hasEnded = false;
  _device.unplug();
  _port.end([&] { hasEnded = true; });
  EXPECT_TRUE(hasEnded);
  advance(1h);
  EXPECT_EQ(_device.openings, 1);
}

TEST_F(LivePortTest, TheEndComesAlsoWhenTheModemIsUnpluggedMeanwhile) {
  open();
  bool hasEnded = false;
  _port.end([&] { hasEnded = true; });
  EXPECT_FALSE(hasEnded);
  _device.unplug();
  EXPECT_TRUE(hasEnded);
}

// The channel of a viewer that has room for three messages, and the device's messages all at once.
TEST_F(LivePortTest, WhatAChannelDoesNotDeliverIsCountedToTheLastMessage) {
  MemoryPorts ports;
  int room = 3;
  ports.answer = [&](const MemoryPorts::Request& request) {
    const bool isTaken = request.identifier != 0 || room-- > 0;
    return RemotePort::SendResult{isTaken ? 0 : RemotePort::sendTimeout, std::nullopt};
  };
  TelephonyServer server({.ports = ports,
                          .queue = _queue,
                          .uptime = [this] { return _queue.now(); },
                          .technology = "all-radios",
                          .makeSource = [this] { return _port.makeSource(); },
                          .messageSent = [](ByteView) {},
                          .tell = [](const std::string&) {}});
  open();
  const std::string command =
      "<plist version=\"1.0\"><dict><key>SetState</key><string>Streaming</string><key>SetKalviLogCodes</key>"
      "<array><integer>45249</integer></array></dict></plist>";
  const auto channel = server.createLogChannel("viewer").portName;
  ASSERT_TRUE(channel);
  ports.deliver(*channel, 0, Bytes(command.begin(), command.end()));
  run();
  EXPECT_TRUE(_device.modem.isOn(0xB0C1));
  const Bytes frame = framed(logContents(0xB0C1, Bytes(187, 1)));
  for (int i = 0; i < 70'000; ++i) _device.handlers.bytesCame(frame);
  _device.handlers.bytesCame(framed(logContents(0xB0C2, {})));
  advance(500ms);
  EXPECT_EQ(server.counts().delivered, 3u);
  advance(600ms);
  server.end();
  EXPECT_EQ(server.counts(), (MessageCounts{.received = 70'001, .delivered = 3, .dropped = 69'998}));
  run();
  EXPECT_FALSE(_device.modem.isOn(0xB0C1));
}

TEST(PortCounts, TellEachKindOfFrameThatWasLeftOut) {
  EXPECT_EQ(inWords(7, {}), "port: 7 records, 0 frames left out");
  EXPECT_EQ(inWords(0, {.badChecksum = 1, .torn = 2, .otherCommands = 3, .encrypted = 4, .broken = 5}),
            "port: 0 records, 15 frames left out (1 with a wrong checksum, 2 torn, 3 of other commands, 4 "
            "encrypted, 5 broken)");
  EXPECT_EQ(inWords(7, {.torn = 1, .noiseBytes = 13}),
            "port: 7 records, 1 frames left out (1 torn), 13 bytes in no frame");
}

}  // namespace
}  // namespace varnel
