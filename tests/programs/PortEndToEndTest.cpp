#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <memory>
#include <regex>
#include <string>
#include <vector>

#include "tests/support/Process.h"
#include "tests/support/PtyModem.h"

namespace varnel {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsSupersetOf;
using testing::Not;
using testing::StartsWith;

const Bytes eventsOff{0x60, 0x00}, debugTextOff{0x7D, 5, 0, 0, 0, 0, 0, 0};
const Bytes allCodesOff{0x73, 0, 0, 0, 0, 0, 0, 0};

// The serving cell of LTE, version 1 of its master information block: the cell, and its antennas.
Bytes masterInformation(std::uint8_t physicalCell, std::uint8_t antennas) {
  return {1, physicalCell, 0, 0x2A, 0x14, 0x10, 0, antennas, 50};
}

// A server at a modem's port, and viewers as text.
class PortEndToEnd : public testing::Test {
 protected:
  std::unique_ptr<Process> server(const std::string& device) const {
    return std::make_unique<Process>(
        VARNEL_TELEPHONYD_PROGRAM,
        std::vector<std::string>{"--port", device, "--runtime-dir", _runtime.path()});
  }
  std::unique_ptr<Process> server() const { return server(_modem.link()); }
  std::unique_ptr<Process> viewer() const {
    return std::make_unique<Process>(
        VARNEL_PROGRAM, std::vector<std::string>{"--ui", "text", "--runtime-dir", _runtime.path(),
                                                 "--device-root", _folder.path(), "--log-level", "3"});
  }
  static testing::AssertionResult says(const Process& program, const std::string& part) {
    if (eventually([&] { return (program.output() + program.error()).find(part) != std::string::npos; }))
      return testing::AssertionSuccess();
    return testing::AssertionFailure() << "not said: " << part << ", but:\n"
                                       << program.output() << program.error();
  }
  // Sends the record again and again until the viewer shows the text: a record may come before its link.
  testing::AssertionResult shows(const Process& viewer, const Bytes& payload, const std::string& text) {
    if (eventually([&] {
          _modem.sendLog(0xB0C1, payload);
          ::usleep(50'000);
          return viewer.output().find(text) != std::string::npos;
        }))
      return testing::AssertionSuccess();
    return testing::AssertionFailure() << "not shown: " << text << ", but:\n"
                                       << viewer.output() << viewer.error();
  }
  std::vector<Bytes> lastThreeRequests() {
    const auto all = _modem.requests();
    return {all.end() - std::min<std::ptrdiff_t>(3, std::ssize(all)), all.end()};
  }

  // The requests that got an answer, if all others than this one do.
  std::size_t answered() {
    const auto all = _modem.requests();
    return all.size() - static_cast<std::size_t>(std::ranges::count(all, debugTextOff));
  }

  TemporaryFolder _runtime, _folder;
  PtyModem _modem{_folder.file("port")};
};

TEST_F(PortEndToEnd, AViewerShowsWhatTheModemSendsAndTheModemIsQuietAgainAfterIt) {
  const auto telephony = server();
  ASSERT_TRUE(says(*telephony, _modem.link() + " is the diagnostic port of a modem, build TEST.1.0-42\n"));
  ASSERT_TRUE(says(*telephony, "serving all-radios in "));
  EXPECT_FALSE(_modem.isOn(0xB0C1));
  auto varnel = viewer();
  ASSERT_TRUE(eventually([&] { return _modem.isOn(0xB0C1); })) << telephony->error();
  EXPECT_FALSE(_modem.isOn(0xB0FF));
  EXPECT_TRUE(shows(*varnel, masterInformation(77, 2), " 77\n"));
  varnel.reset();
  EXPECT_TRUE(eventually([&] { return !_modem.isOn(0xB0C1); }));
  EXPECT_TRUE(eventually([&] { return lastThreeRequests().back() == debugTextOff; }));
  EXPECT_THAT(lastThreeRequests(), ElementsAre(eventsOff, allCodesOff, debugTextOff));
}

TEST_F(PortEndToEnd, TheModemIsQuietAgainWhenTheServerIsAskedToEnd) {
  const auto telephony = server();
  const auto varnel = viewer();
  ASSERT_TRUE(eventually([&] { return _modem.isOn(0xB0C1); })) << telephony->error();
  telephony->signal(SIGTERM);
  ASSERT_TRUE(telephony->waitForEnd());
  EXPECT_EQ(telephony->exitStatus(), 0) << telephony->error();
  EXPECT_FALSE(_modem.isOn(0xB0C1));
  EXPECT_THAT(lastThreeRequests(), ElementsAre(eventsOff, allCodesOff, debugTextOff));
  EXPECT_THAT(telephony->error(), HasSubstr("\nvarnel-telephonyd: port: 0 records, "));
}

// The answers to the last requests come after everything else, so the server has read all when it ends.
TEST_F(PortEndToEnd, EveryRecordArrivesAndWhatIsNoneIsCounted) {
  const auto telephony = server();
  const auto varnel = viewer();
  ASSERT_TRUE(eventually([&] { return _modem.isOn(0xB0C1); })) << telephony->error();
  const Bytes log = logContents(0xB0C1, masterInformation(77, 2));
  Bytes wrapped{0x98, 1, 0, 0, 2, 0, 0, 0};
  wrapped.insert(wrapped.end(), log.begin(), log.end());
  Bytes unsound = framed(log);
  unsound[20] ^= 1;
  for (int i = 0; i < 1000; ++i) {
    _modem.send(framed(log));
    _modem.send(framed(wrapped));
    if (i % 100 != 0) continue;
    _modem.send(unsound);
    _modem.send(framed({0x9E, 1, 2, 3}));
    _modem.send(framed({0x79, 1, 2, 3}));
  }
  ASSERT_TRUE(eventually([&] { return _modem.hasSentAll(); }));
  telephony->signal(SIGTERM);
  ASSERT_TRUE(telephony->waitForEnd());
  EXPECT_THAT(telephony->error(), HasSubstr("\nvarnel-telephonyd: messages: 2000 received, "));
  EXPECT_THAT(telephony->error(), HasSubstr("\nvarnel-telephonyd: port: 2000 records, "));
  EXPECT_THAT(telephony->error(), HasSubstr("(10 with a wrong checksum, "));
  EXPECT_THAT(telephony->error(), HasSubstr(" of other commands, 10 encrypted)\n"));
}

// The modem has 1024 codes of LTE and NR, which are fewer than the viewer knows.
TEST_F(PortEndToEnd, EachEquipmentGetsOneMaskAndCodesBeyondItsNumberAreLeftOutAndCounted) {
  _modem.unplug();
  _modem.equipments = {1, 4, 5, 7};
  _modem.plugIn();
  const auto telephony = server();
  const auto varnel = viewer();
  ASSERT_TRUE(eventually([&] { return _modem.isOn(0xB0C1); })) << telephony->error();
  auto requests = _modem.requests();
  ASSERT_GT(requests.size(), 6u);
  requests.erase(requests.begin(), requests.begin() + 6);
  std::vector<int> equipments;
  for (const Bytes& request : requests) {
    ASSERT_GT(request.size(), 16u);
    EXPECT_EQ(Bytes(request.begin(), request.begin() + 8), (Bytes{0x73, 0, 0, 0, 3, 0, 0, 0}));
    equipments.push_back(request[8]);
    EXPECT_LE(request[12] + request[13] * 256, request[8] == 11 ? 0x400 : 0x1000);
  }
  EXPECT_THAT(equipments, IsSupersetOf({4, 5, 7, 11}));
  EXPECT_TRUE(std::ranges::is_sorted(equipments));
  EXPECT_THAT(std::ranges::adjacent_find(equipments), equipments.end());
  EXPECT_TRUE(_modem.isOn(0x512F));
  EXPECT_FALSE(_modem.isOn(0xB821));
  EXPECT_THAT(telephony->error(), HasSubstr(" of the log codes that viewers ask for; they are left out\n"));
}

// A log comes before each answer. The last request for quiet gets none, so all that was sent before it has
// been read when it comes.
TEST_F(PortEndToEnd, EveryRecordArrivesAlsoBetweenAnswersAndBeforeAndAfterAnUnplugging) {
  const Bytes log = logContents(0xB0C1, {1, 0x7E, 0x7D, 0x2A, 0x14, 0x10, 0, 2, 50});
  _modem.unplug();
  _modem.beforeAnswers = framed(log);
  _modem.otherAnswers = {{debugTextOff, {}}};
  _modem.plugIn();
  const auto telephony = server();
  auto varnel = viewer();
  ASSERT_TRUE(eventually([&] { return _modem.isOn(0xB0C1); })) << telephony->error();
  for (int i = 0; i < 1000; ++i) _modem.send(framed(log));
  // A frame that breaks off, in which another one begins.
  Bytes broken = framed(log);
  broken.resize(9);
  for (int i = 0; i < 10; ++i) {
    _modem.send(broken);
    _modem.send(framed(log));
  }
  ASSERT_TRUE(eventually([&] { return _modem.hasSentAll(); }));
  varnel.reset();
  ASSERT_TRUE(
      eventually([&] { return lastThreeRequests().back() == debugTextOff && _modem.requests().size() > 6; }));
  std::size_t answers = answered();
  _modem.send(broken);
  _modem.unplug();
  ASSERT_TRUE(says(*telephony, " is unplugged; "));
  _modem.plugIn();
  ASSERT_TRUE(says(*telephony, " is back\n"));
  varnel = viewer();
  ASSERT_TRUE(eventually([&] { return _modem.isOn(0xB0C1); })) << telephony->error();
  for (int i = 0; i < 500; ++i) _modem.send(framed(log));
  ASSERT_TRUE(eventually([&] { return _modem.hasSentAll(); }));
  telephony->signal(SIGTERM);
  ASSERT_TRUE(telephony->waitForEnd());
  answers += answered();
  EXPECT_THAT(telephony->error(),
              HasSubstr("\nvarnel-telephonyd: port: " + std::to_string(1500 + answers) + " records, "));
  EXPECT_THAT(telephony->error(), HasSubstr("(10 with a wrong checksum"));
}

// Eight megabytes, while the viewer does not run.
TEST_F(PortEndToEnd, WhatAViewerDoesNotReadIsCounted) {
  const auto telephony = server();
  const auto varnel = viewer();
  ASSERT_TRUE(eventually([&] { return _modem.isOn(0xB0C1); })) << telephony->error();
  varnel->signal(SIGSTOP);
  Bytes hundred;
  for (int i = 0; i < 100; ++i) appendFramed(hundred, logContents(0xB0C1, Bytes(200, 1)));
  for (int i = 0; i < 400; ++i) {
    _modem.send(hundred);
    ASSERT_TRUE(eventually([&] { return _modem.hasSentAll(); }));
  }
  telephony->signal(SIGTERM);
  ASSERT_TRUE(telephony->waitForEnd());
  EXPECT_THAT(telephony->error(), HasSubstr("\nvarnel-telephonyd: port: 40000 records, 0 frames left out\n"));
  std::smatch counts;
  const std::string told = telephony->error();
  ASSERT_TRUE(std::regex_search(
      told, counts,
      std::regex("messages: ([0-9]+) received, ([0-9]+) delivered, ([0-9]+) dropped, ([0-9]+) ")))
      << told;
  const auto count = [&](std::size_t index) { return std::stoul(counts[index]); };
  EXPECT_EQ(count(1), count(2) + count(3) + count(4)) << told;
  EXPECT_GT(count(3), 0u) << told;
}

TEST_F(PortEndToEnd, AfterTheModemWasUnpluggedTheDisplayGoesOn) {
  const auto telephony = server();
  const auto varnel = viewer();
  ASSERT_TRUE(eventually([&] { return _modem.isOn(0xB0C1); })) << telephony->error();
  ASSERT_TRUE(shows(*varnel, masterInformation(77, 2), " 77\n"));
  const std::string sentence = _modem.link() + " is unplugged; plug it in again, and the display goes on";
  _modem.unplug();
  EXPECT_TRUE(says(*telephony, sentence + "\n"));
  EXPECT_TRUE(says(*varnel, "Notice: " + sentence));
  _modem.plugIn();
  ASSERT_TRUE(says(*telephony, _modem.link() + " is back\n"));
  EXPECT_TRUE(eventually([&] { return _modem.isOn(0xB0C1); }));
  EXPECT_TRUE(shows(*varnel, masterInformation(88, 4), " 88\n"));
  EXPECT_THAT(varnel->error(), Not(HasSubstr("INVALIDATED")));
}

TEST_F(PortEndToEnd, APortThatCannotBeServedIsOneLineThatSaysWhatToDo) {
  const std::string missing = _folder.file("none");
  const auto telephony = server(missing);
  ASSERT_TRUE(telephony->waitForEnd());
  EXPECT_EQ(telephony->exitStatus(), 1);
  EXPECT_EQ(telephony->error(), "varnel-telephonyd: there is no device " + missing +
                                    "; plug the modem in, or look for its ports with ls /dev/tty* "
                                    "/dev/wwan*\n");
}

TEST_F(PortEndToEnd, APortThatRepeatsWhatItGetsTakesATCommands) {
  _modem.answer = [](ByteView bytes) { return Bytes(bytes.begin(), bytes.end()); };
  const auto telephony = server();
  ASSERT_TRUE(telephony->waitForEnd());
  EXPECT_EQ(telephony->exitStatus(), 1);
  EXPECT_THAT(telephony->error(), StartsWith("varnel-telephonyd: " + _modem.link() +
                                             " takes AT commands and is no diagnostic port; "));
}

// It would answer a line of text. It gets none, for it could be anything.
TEST_F(PortEndToEnd, APortThatIsSilentGetsTheProbeTwiceAndNothingElse) {
  Bytes got;
  _modem.answer = [&](ByteView bytes) -> Bytes {
    got.insert(got.end(), bytes.begin(), bytes.end());
    const std::string error = "\r\nERROR\r\n";
    return bytes.back() == '\r' ? Bytes(error.begin(), error.end()) : Bytes();
  };
  const auto telephony = server();
  ASSERT_TRUE(telephony->waitForEnd());
  EXPECT_EQ(telephony->exitStatus(), 1);
  EXPECT_THAT(
      telephony->error(),
      StartsWith("varnel-telephonyd: " + _modem.link() +
                 " does not answer as a diagnostic port, and may be the modem's port for AT commands; "));
  _modem.unplug();
  EXPECT_EQ(got, (Bytes{0x00, 0x78, 0xF0, 0x7E, 0x00, 0x78, 0xF0, 0x7E}));
}

TEST_F(PortEndToEnd, APortThatAnotherServerServesIsBusyAndItsHolderIsNamed) {
  const auto first = server();
  ASSERT_TRUE(says(*first, "serving all-radios in "));
  const TemporaryFolder runtime;
  Process second(VARNEL_TELEPHONYD_PROGRAM,
                 {"--port", _modem.link(), "--runtime-dir", runtime.path().string()});
  ASSERT_TRUE(second.waitForEnd());
  EXPECT_EQ(second.exitStatus(), 1);
  EXPECT_THAT(second.error(),
              testing::MatchesRegex("varnel-telephonyd: varnel-telephonyd \\(process [0-9]+\\) "
                                    "uses .*/port; end it first\n"));
}

}  // namespace
}  // namespace varnel
