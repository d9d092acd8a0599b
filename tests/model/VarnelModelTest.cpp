#include "model/VarnelModel.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <cinttypes>
#include <cstdio>

#include "LogGenerator/KLV/LTE/LTELogGenerator.h"
#include "base/PropertyList.h"
#include "tests/support/Describe.h"
#include "tests/support/DictionaryOf.h"
#include "tests/support/FakeQueue.h"
#include "tests/support/FakeTelephony.h"
#include "tests/support/MemoryPorts.h"
#include "tests/support/PacketBuilder.h"
#include "tests/support/RecordingLog.h"
#include "tests/support/TestServices.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::KilledBySignal;
using testing::StartsWith;

using Lines = std::vector<std::string>;

constexpr std::string_view channel = "com.orvane.BasebandStateReport.LogChannel";

// The number of transmit antennas as an LTE modem reports it: log code 0xB0C1, the number in byte 20.
Bytes antennas(std::uint8_t number) { return PacketBuilder(0xB0C1, 22).u8(20, number).bytes(); }

std::string address(const void* object) {
  char text[32];
  std::snprintf(text, sizeof text, "0x%" PRIxPTR, reinterpret_cast<std::uintptr_t>(object));
  return text;
}

// The text with 0x* for every address but the null one.
std::string masked(std::string text) {
  for (std::size_t at = 0; (at = text.find("0x", at)) != std::string::npos; at += 2) {
    const std::size_t end = text.find_first_not_of("0123456789abcdef", at + 2);
    const std::size_t length = std::min(end, text.size()) - at;
    if (text.compare(at, length, "0x0") != 0) text.replace(at, length, "0x*");
  }
  return text;
}

Lines operator+(Lines first, const Lines& second) {
  first.insert(first.end(), second.begin(), second.end());
  return first;
}

const Lines created = {" ***** Created ports (send=0x*, recv=0x*)"};
const Lines configured = {"Creating LTELogGenerator object", "Creating KLVLogGenerator2 object with 0x*",
                          "Class Index: 1", "Got log generated: 0x*"};
const Lines streaming = {"Starting the display update timer"};

// A model and everything around it, the telephony service sound and its modem an LTE one.
class ModelTest : public testing::Test, public VarnelModelObserver {
 public:
  void updateViewControllerFromModel() override { ++updates; }
  void linkWasLost() override { connectionsAfterLosses.push_back(model->isConnected()); }

  void replyWith(Bytes reply) {
    ports.answer = [reply](const MemoryPorts::Request&) { return RemotePort::SendResult{0, reply}; };
  }
  void replyWith(const Value& reply) { replyWith(*writeXmlPropertyList(reply)); }
  void replyWithTechnology(const Value& technology) {
    replyWith(dictionaryOf({{"GetTechnology", technology}}));
  }

  // Requests that await a reply end in the one way, commands in the other.
  void answerWith(RemotePort::SendResult toRequest, RemotePort::SendResult toCommand) {
    ports.answer = [toRequest, toCommand](const MemoryPorts::Request& request) {
      return request.replyTimeout ? toRequest : toCommand;
    };
  }

  // Has every failure that a test provoked come to an end.
  void repair() {
    ports.refusesLocalPorts = false;
    ports.refusesRemotePorts = false;
    telephony.refusesConnections = false;
    telephony.logChannel = {0, "service.commands"};
    refusedCommand.clear();
    otherViewer.reset();
    replyWithTechnology("kalvi-lte");
  }

  FakeQueue queue;
  MemoryPorts ports;
  FakeTelephony telephony;
  std::string refusedCommand;              // the key of commands that cannot be serialised
  std::unique_ptr<LocalPort> otherViewer;  // holds the channel's name
  unsigned updates = 0;
  std::vector<bool> connectionsAfterLosses;

 protected:
  ModelTest() {
    testing::FLAGS_gtest_death_test_style = "threadsafe";
    host.resources.add("LTE", dictionaryOf({{"Serving Cell Info", Value::ofDictionary()},
                                            {"SIM Info", Value::ofDictionary()},
                                            {"PDP Context Info", Value::ofArray()}}));
    repair();
    model = std::make_unique<VarnelModel>(services, *this);
  }

  // The lines of error priority since the last call, addresses but the null one masked.
  Lines errors() {
    Lines lines;
    for (const auto& line : log.take()) {
      if (line.priority == 3) lines.push_back(masked(line.text));
    }
    return lines;
  }

  void start() {
    model->startMonitor();
    ASSERT_TRUE(model->isConnected());
    log.take();
  }

  std::optional<Bytes> deliver(const Bytes& message) { return ports.deliver(channel, 0, message); }

  // The value under that path, or what is there instead.
  std::string shown(const std::string& path) {
    const auto node = model->nodeAtPath(path);
    if (!node) return "nothing";
    return node->value() ? *node->value() : "an inner node";
  }
  std::string shownAntennas() { return shown("/Serving Cell Info/Num Tx Antennas"); }

  std::optional<Bytes> write(const Value& command) const {
    if (!refusedCommand.empty() && command.dictionary()->has(refusedCommand)) return std::nullopt;
    return writeXmlPropertyList(command);
  }

  RecordingLog log;
  TestServices host;
  ModelServices services{ports, telephony, queue, host.services,
                         [this](const Value& command) { return write(command); }};
  std::unique_ptr<VarnelModel> model;
};

// One way in which the start of the stream fails, and the lines that tell of it.
struct Failure {
  std::string name;
  std::function<void(ModelTest&)> provoke;
  Lines lines;
};
void PrintTo(const Failure& failure, std::ostream* stream) { *stream << failure.name; }

const Lines noPorts = {"Could not create the ports necessary"};
const Lines noGenerator = {"No log generator technology works"};

const Failure failures[] = {
    {"LocalPortCannotBeMade", [](ModelTest& test) { test.ports.refusesLocalPorts = true; },
     Lines{"Could not create local message port"} + noPorts},
    {"LocalPortExistsAlready",
     [](ModelTest& test) { test.otherViewer = test.ports.createLocalPort(channel, nullptr).port; },
     Lines{"Local messsage port already exists"} + noPorts},
    {"ServiceCannotBeReached", [](ModelTest& test) { test.telephony.refusesConnections = true; },
     Lines{"Could not create TKServerConnection"} + noPorts},
    {"LogChannelError",
     [](ModelTest& test) {
       test.telephony.logChannel = {42, "service.commands"};
     },
     Lines{"_TKServerConnectionNetworkMonitorCreateLogChannel returns error: 42!"} + noPorts},
    {"NegativeLogChannelErrorOf64BitsAndNoName",
     [](ModelTest& test) {
       test.telephony.logChannel = {-5000000000, std::nullopt};
     },
     Lines{"_TKServerConnectionNetworkMonitorCreateLogChannel returns error: -5000000000!"} + noPorts},
    {"NoNameOfTheServicesPort",
     [](ModelTest& test) {
       test.telephony.logChannel = {0, std::nullopt};
     },
     Lines{"Could not create a log channel (TK returned null port)!"} + noPorts},
    {"EmptyNameOfTheServicesPort",
     [](ModelTest& test) {
       test.telephony.logChannel = {0, ""};
     },
     Lines{"Could not create a log channel (TK returned null port)!"} + noPorts},
    {"RemotePortCannotBeMade", [](ModelTest& test) { test.ports.refusesRemotePorts = true; },
     Lines{"Could not create the remote port!"} + noPorts},
    {"TechnologyRequestCannotBeSerialised", [](ModelTest& test) { test.refusedCommand = "GetTechnology"; },
     created + Lines{" Could not generate GetTechnology command; cannot configure"} + noGenerator},
    {"TechnologyRequestCannotBeSent",
     [](ModelTest& test) {
       test.answerWith({-1, std::nullopt}, {});
     },
     created + Lines{" ***** Could not send the GetTechnology command (got error=-1)"} + noGenerator},
    {"TechnologyRequestCannotBeSentThoughAReplyIsThere",
     [](ModelTest& test) {
       test.answerWith({-2, Bytes{'<'}}, {});
     },
     created + Lines{" ***** Could not send the GetTechnology command (got error=-2)"} + noGenerator},
    {"NoReply", [](ModelTest& test) { test.ports.answer = nullptr; },
     created + Lines{" ***** No response to GetTechnology; cannot configure"} + noGenerator},
    {"EmptyReply", [](ModelTest& test) { test.replyWith(Bytes{}); },
     created + Lines{" ***** Could not parse reply to GetTechnology; cannot configure"} + noGenerator},
    {"GarbageInReply",
     [](ModelTest& test) {
       test.replyWith(Bytes{0x00, 0xFF, 0x13, 0x37});
     },
     created + Lines{" ***** Could not parse reply to GetTechnology; cannot configure"} + noGenerator},
    {"ReplyIsAnArray", [](ModelTest& test) { test.replyWith(Value::ofArray({"GetTechnology"})); },
     created + Lines{" ***** Could not parse reply to GetTechnology; cannot configure"} + noGenerator},
    {"ReplyIsAText", [](ModelTest& test) { test.replyWith(Value("GetTechnology")); },
     created + Lines{" ***** Could not parse reply to GetTechnology; cannot configure"} + noGenerator},
    {"ReplyWithoutAnswer",
     [](ModelTest& test) {
       test.replyWith(dictionaryOf({{"Technology", "kalvi-lte"}}));
     },
     created + Lines{" ***** Reply to GetTechnology had no answer; cannot configure"} + noGenerator},
    {"UnknownTechnology", [](ModelTest& test) { test.replyWithTechnology("kalvi-lte2"); },
     created + Lines{"Got log generated: 0x0"} + noGenerator},
    {"EmptyTechnology", [](ModelTest& test) { test.replyWithTechnology(""); },
     created + Lines{"Got log generated: 0x0"} + noGenerator},
    {"TechnologyIsNoText", [](ModelTest& test) { test.replyWithTechnology(Value::ofInteger(4)); },
     created + Lines{"Got log generated: 0x0"} + noGenerator},
    {"StartCommandCannotBeSerialised", [](ModelTest& test) { test.refusedCommand = "SetState"; },
     created + configured + Lines{" Could not generate PLIST"}},
    {"StartCommandCannotBeSent",
     [](ModelTest& test) {
       test.answerWith({0, writeXmlPropertyList(dictionaryOf({{"GetTechnology", "kalvi-lte"}}))},
                       {-3, std::nullopt});
     },
     created + configured + Lines{" ***** Could not send the START command (got error=-3)"}},
};

class LinkFailure : public ModelTest, public testing::WithParamInterface<Failure> {
 protected:
  LinkFailure() {
    GetParam().provoke(*this);
    log.take();
  }
};

INSTANTIATE_TEST_SUITE_P(Each, LinkFailure, testing::ValuesIn(failures),
                         [](const auto& info) { return info.param.name; });

TEST_P(LinkFailure, IsLoggedWithItsTextsInOrder) {
  model->startMonitor();
  EXPECT_EQ(errors(), GetParam().lines);
}

TEST_P(LinkFailure, TearsTheLinkDown) {
  model->startMonitor();
  EXPECT_FALSE(model->isConnected());
  EXPECT_EQ(ports.hasLocalPort(channel), otherViewer != nullptr);
  EXPECT_EQ(ports.remotePort(), nullptr);
  EXPECT_EQ(telephony.openConnections(), 0u);
  EXPECT_EQ(queue.liveTimers(), 0u);
}

TEST_P(LinkFailure, IsRetriedExactlyFiveSecondsLater) {
  queue.advance(700ms);
  model->startMonitor();
  errors();
  queue.advance(4999ms);
  EXPECT_THAT(errors(), IsEmpty());
  queue.advance(1ms);
  EXPECT_EQ(errors(), GetParam().lines);
}

TEST_P(LinkFailure, IsRetriedWithoutLimit) {
  model->startMonitor();
  for (int attempt = 2; attempt <= 100; ++attempt) {
    errors();
    queue.advance(5s);
    ASSERT_EQ(errors(), GetParam().lines) << "attempt " << attempt;
    ASSERT_EQ(queue.waitingTasks(), 1u) << "attempt " << attempt;
  }
}

TEST_P(LinkFailure, IsOverFiveSecondsAfterItsCauseIsGone) {
  model->startMonitor();
  queue.advance(12s);
  errors();
  repair();
  queue.advance(2999ms);
  EXPECT_FALSE(model->isConnected());
  queue.advance(1ms);
  EXPECT_TRUE(model->isConnected());
  EXPECT_EQ(errors(), created + configured + streaming);
}

TEST_P(LinkFailure, LeavesNothingBehindWhenTheModelIsDestroyedBeforeTheRetry) {
  model->startMonitor();
  model.reset();
  log.take();
  queue.advance(60s);
  EXPECT_THAT(errors(), IsEmpty());
  EXPECT_EQ(queue.waitingTasks(), 0u);
  EXPECT_EQ(updates, 0u);
}

TEST_F(ModelTest, ANewModelIsIdle) {
  EXPECT_FALSE(model->isConnected());
  queue.advance(60s);
  EXPECT_EQ(telephony.attempts, 0u);
  EXPECT_THAT(ports.events, IsEmpty());
  EXPECT_THAT(log.take(), IsEmpty());
}

TEST_F(ModelTest, RefreshOfAnIdleModelDoesNothing) {
  model->refresh();
  queue.advance(60s);
  EXPECT_EQ(telephony.attempts, 0u);
  EXPECT_EQ(updates, 0u);
}

TEST_F(ModelTest, RestartMonitorLaterConnectsOnceTheQueueRuns) {
  model->restartMonitorLater();
  EXPECT_EQ(telephony.attempts, 0u);
  queue.run();
  EXPECT_EQ(telephony.attempts, 1u);
  EXPECT_TRUE(model->isConnected());
  queue.advance(60s);
  EXPECT_EQ(telephony.attempts, 1u);
}

TEST_F(ModelTest, TheStreamsStartIsLoggedInOrder) {
  model->startMonitor();
  EXPECT_EQ(errors(), created + configured + streaming);
}

TEST_F(ModelTest, TheCreatedPortsAreLoggedWithTheirAddresses) {
  model->startMonitor();
  EXPECT_EQ(log.take().front().text, " ***** Created ports (send=" + address(ports.remotePort()) +
                                         ", recv=" + address(ports.localPort(channel)) + ")");
}

TEST_F(ModelTest, TheChannelIsMadeForTheLocalPortAndTheServicesPortIsOpenedByItsName) {
  telephony.logChannel.portName = "service.port.17";
  model->startMonitor();
  EXPECT_THAT(telephony.logChannelNames, ElementsAre("com.orvane.BasebandStateReport.LogChannel"));
  EXPECT_THAT(ports.events,
              ElementsAre("local com.orvane.BasebandStateReport.LogChannel created", "local delivers",
                          "local handler set", "remote service.port.17 created"));
}

TEST_F(ModelTest, TheConnectionIsClosedOnceTheChannelIsMade) {
  telephony.whileMakingLogChannel = [&] { EXPECT_EQ(telephony.openConnections(), 1u); };
  model->startMonitor();
  EXPECT_EQ(telephony.openConnections(), 0u);
}

TEST_F(ModelTest, TheTechnologyRequestAwaitsItsReplyForOneSecond) {
  start();
  ASSERT_EQ(ports.requests.size(), 2u);
  const MemoryPorts::Request& request = ports.requests[0];
  EXPECT_EQ(request.identifier, 0);
  EXPECT_EQ(request.timeout, 1s);
  EXPECT_EQ(request.replyTimeout, std::optional<std::chrono::milliseconds>(1s));
  EXPECT_EQ(std::string(request.data.begin(), request.data.begin() + 5), "<?xml");
  EXPECT_EQ(described(readPropertyList(request.data).value()), R"({GetTechnology: "GetTechnology"})");
}

TEST_F(ModelTest, TheStartCommandOfTheGeneratorIsSentAndAwaitsNoReply) {
  start();
  ASSERT_EQ(ports.requests.size(), 2u);
  const MemoryPorts::Request& request = ports.requests[1];
  EXPECT_EQ(request.identifier, 0);
  EXPECT_EQ(request.timeout, 1s);
  EXPECT_EQ(request.replyTimeout, std::nullopt);
  EXPECT_EQ(std::string(request.data.begin(), request.data.begin() + 5), "<?xml");
  const std::string command = described(readPropertyList(request.data).value());
  EXPECT_EQ(command, described(LTELogGenerator::generator(host.services)->getStartCommand()));
  // 0xB0C2, the first log code of an LTE modem.
  EXPECT_THAT(command, StartsWith(R"({SetState: "Streaming", SetKalviLogCodes: [45250, )"));
}

TEST_F(ModelTest, ABinaryReplyIsAccepted) {
  replyWith(*writeBinaryPropertyList(dictionaryOf({{"GetTechnology", "kalvi-lte"}})));
  model->startMonitor();
  EXPECT_EQ(errors(), created + configured + streaming);
}

TEST_F(ModelTest, AReplyMayHoldMoreThanTheAnswer) {
  replyWith(dictionaryOf({{"Server", "1"}, {"GetTechnology", "kalvi-lte"}, {"More", Value::ofArray()}}));
  model->startMonitor();
  EXPECT_EQ(errors(), created + configured + streaming);
}

TEST_F(ModelTest, StartMonitorWhileStreamingDoesNothing) {
  start();
  const Lines events = ports.events;
  model->startMonitor();
  EXPECT_THAT(log.take(), IsEmpty());
  EXPECT_EQ(ports.events, events);
  EXPECT_EQ(ports.requests.size(), 2u);
  EXPECT_EQ(telephony.attempts, 1u);
  EXPECT_EQ(queue.liveTimers(), 1u);
}

TEST_F(ModelTest, ARetryThatComesWhileStreamingDoesNothing) {
  telephony.refusesConnections = true;
  model->startMonitor();
  repair();
  queue.advance(2s);
  model->restartMonitor();
  ASSERT_TRUE(model->isConnected());
  log.take();
  queue.advance(60s);
  EXPECT_THAT(log.take(), IsEmpty());
  EXPECT_EQ(telephony.attempts, 2u);
}

TEST_F(ModelTest, RestartMonitorTearsTheLinkDownWithoutAnInvalidationAndStartsItAnew) {
  start();
  ports.events.clear();
  model->restartMonitor();
  EXPECT_THAT(
      ports.events,
      ElementsAre("local handler removed", "local invalidated", "local destroyed", "remote invalidated",
                  "remote destroyed", "local com.orvane.BasebandStateReport.LogChannel created",
                  "local delivers", "local handler set", "remote service.commands created"));
  EXPECT_EQ(errors(), created + configured + streaming);
  EXPECT_EQ(queue.liveTimers(), 1u);
}

TEST_F(ModelTest, TheDisplayTimerAsksForAnUpdateTwoSecondsAfterTheStartAndEveryTwoSeconds) {
  start();
  deliver(antennas(1));
  queue.advance(1999ms);
  EXPECT_EQ(updates, 0u);
  queue.advance(1ms);
  EXPECT_EQ(updates, 1u);
  deliver(antennas(2));
  queue.advance(1999ms);
  EXPECT_EQ(updates, 1u);
  queue.advance(1ms);
  EXPECT_EQ(updates, 2u);
}

TEST_F(ModelTest, TheDisplayTimerAsksForOneUpdateHoweverManyMessagesArrived) {
  start();
  for (std::uint8_t number = 1; number <= 10; ++number) deliver(antennas(number));
  queue.advance(10s);
  EXPECT_EQ(updates, 1u);
}

TEST_F(ModelTest, TheDisplayTimerAsksForNoUpdateWhenNothingArrived) {
  start();
  queue.advance(60s);
  EXPECT_EQ(updates, 0u);
}

TEST_F(ModelTest, AMessageOfAnotherIdentifierChangesNothing) {
  start();
  for (const std::int32_t identifier : {1, -1, 256}) {
    EXPECT_EQ(ports.deliver(channel, identifier, antennas(2)), std::nullopt);
  }
  EXPECT_THAT(log.take(), IsEmpty());
  queue.advance(10s);
  EXPECT_EQ(updates, 0u);
  EXPECT_EQ(model->topLevelNodes()->childNodes(), nullptr);
}

TEST_F(ModelTest, AMessageIsDecodedAndHasNoReply) {
  start();
  EXPECT_EQ(deliver(antennas(2)), std::nullopt);
  EXPECT_EQ(shownAntennas(), "2");
}

TEST_F(ModelTest, AMessageThatComesBeforeThereIsAGeneratorIsDroppedButCountsAsNewData) {
  telephony.whileMakingLogChannel = [&] { deliver(antennas(2)); };
  start();
  queue.advance(2s);
  EXPECT_EQ(updates, 1u);
  EXPECT_EQ(shownAntennas(), "nothing");
}

TEST_F(ModelTest, ThereAreNoNodesWhileThereIsNoGenerator) {
  EXPECT_EQ(model->topLevelNodes(), nullptr);
  EXPECT_EQ(model->nodeAtPath("/"), nullptr);
}

TEST_F(ModelTest, ThereIsNothingToSaveWhileThereIsNoGenerator) {
  EXPECT_TRUE(model->getSaveContents().isAbsent());
}

TEST_F(ModelTest, BeforeTheFirstMessageTheTreeIsALeafOfUnknownValue) {
  start();
  EXPECT_EQ(shown("/"), "(unknown)");
  EXPECT_EQ(model->topLevelNodes()->displayName(), "Varnel");
}

TEST_F(ModelTest, NodesAreFoundByTheirPaths) {
  start();
  deliver(antennas(2));
  EXPECT_EQ(model->nodeAtPath("/"), model->topLevelNodes());
  EXPECT_EQ(model->nodeAtPath("/SIM Info"), (*model->topLevelNodes()->childNodes())[1]);
  EXPECT_EQ(shownAntennas(), "2");
  EXPECT_EQ(model->nodeAtPath("/No such section"), nullptr);
  EXPECT_EQ(model->nodeAtPath(""), nullptr);
}

TEST_F(ModelTest, RefreshWithoutNewDataKeepsTheCachedTree) {
  start();
  deliver(antennas(2));
  model->refresh();
  const auto nodes = model->topLevelNodes();
  model->refresh();
  queue.advance(10s);
  EXPECT_EQ(model->topLevelNodes(), nodes);
  EXPECT_EQ(updates, 1u);
}

TEST_F(ModelTest, AMessageAloneKeepsTheCachedTree) {
  start();
  deliver(antennas(2));
  const auto nodes = model->topLevelNodes();
  deliver(antennas(4));
  EXPECT_EQ(model->topLevelNodes(), nodes);
  EXPECT_EQ(shownAntennas(), "2");
}

TEST_F(ModelTest, RefreshWithNewDataDropsTheTreeAndPostsOneUpdate) {
  start();
  deliver(antennas(2));
  const auto nodes = model->topLevelNodes();
  deliver(antennas(4));
  model->refresh();
  EXPECT_EQ(updates, 0u) << "the update is not made at once";
  EXPECT_EQ(queue.waitingTasks(), 1u);
  EXPECT_NE(model->topLevelNodes(), nodes);
  EXPECT_EQ(shownAntennas(), "4");
  queue.run();
  EXPECT_EQ(updates, 1u);
}

TEST_F(ModelTest, NodeAtPathBuildsTheTreeWhenNoneIsCached) {
  start();
  deliver(antennas(2));
  EXPECT_EQ(shownAntennas(), "2");
  deliver(antennas(4));
  model->refresh();
  const auto root = model->nodeAtPath("/");
  EXPECT_EQ(shownAntennas(), "4");
  EXPECT_EQ(model->topLevelNodes(), root);
}

// What the save contents tell of themselves.
Lines descriptions(const Value& contents) {
  Lines texts;
  for (const Value& item : *contents.array())
    texts.push_back(*item.dictionary()->get("Description").string());
  return texts;
}

TEST_F(ModelTest, EachBuildOfTheTreeRecordsOneSnapshot) {
  host.clock.set({1709301909, 0});
  start();
  deliver(antennas(2));
  EXPECT_THAT(descriptions(model->getSaveContents()), ElementsAre("DLF binary (161 bytes)"));
  model->topLevelNodes();
  model->topLevelNodes();
  model->nodeAtPath("/SIM Info");
  // Of the 22 bytes the first is left out.
  EXPECT_THAT(descriptions(model->getSaveContents()),
              ElementsAre("Snapshot (2024-03-01 14:05:09 +0000)", "DLF binary (182 bytes)"));
  deliver(antennas(4));
  model->refresh();
  EXPECT_EQ(model->getSaveContents().array()->size(), 2u);
  model->nodeAtPath("/");
  EXPECT_EQ(model->getSaveContents().array()->size(), 3u);
}

TEST_F(ModelTest, TheHistoryKeepsTheNewestFiveSnapshots) {
  start();
  for (std::uint8_t number = 1; number <= 6; ++number) {
    deliver(antennas(number));
    model->refresh();
    model->topLevelNodes();
  }
  const Value contents = model->getSaveContents();
  ASSERT_EQ(contents.array()->size(), 6u) << "five snapshots and the binary log";
  EXPECT_EQ(*contents.array()->front().dictionary()->get("DisplayState").data(), antennas(2));
  EXPECT_EQ(*(*contents.array())[4].dictionary()->get("DisplayState").data(), antennas(6));
}

TEST_F(ModelTest, TellsHowManyMessagesTheBinaryLogLacksSinceTheLinkWasOpened) {
  EXPECT_EQ(model->messagesLeftOutOfLog(), 0u);
  model->startMonitor();
  model->updateWithData(Bytes(16'777'216));
  EXPECT_EQ(model->messagesLeftOutOfLog(), 0u);
  model->updateWithData(antennas(2));
  EXPECT_EQ(model->messagesLeftOutOfLog(), 1u);
  model->restartMonitor();
  EXPECT_EQ(model->messagesLeftOutOfLog(), 0u);
}

TEST_F(ModelTest, InvalidationOfTheLocalPortIsLoggedAndRestartsTheMonitor) {
  start();
  const std::string port = address(ports.localPort(channel));
  ports.events.clear();
  ports.invalidateLocalPort(channel);
  EXPECT_EQ(log.lines().front().text, " ***** INVALIDATED " + port + " *****");
  EXPECT_EQ(errors(), Lines{" ***** INVALIDATED 0x* *****"} + created + configured + streaming);
  EXPECT_THAT(
      ports.events,
      ElementsAre("local invalidated", "local handler removed", "local destroyed", "remote invalidated",
                  "remote destroyed", "local com.orvane.BasebandStateReport.LogChannel created",
                  "local delivers", "local handler set", "remote service.commands created"));
  EXPECT_TRUE(model->isConnected());
  EXPECT_THAT(connectionsAfterLosses, ElementsAre(true));
  EXPECT_EQ(queue.liveTimers(), 1u);
  EXPECT_EQ(queue.waitingTasks(), 0u);
}

TEST_F(ModelTest, AfterAnInvalidationTheTimerCountsFromTheNewStart) {
  start();
  queue.advance(1500ms);
  ports.invalidateLocalPort(channel);
  deliver(antennas(2));
  queue.advance(1999ms);
  EXPECT_EQ(updates, 0u);
  queue.advance(1ms);
  EXPECT_EQ(updates, 1u);
}

TEST_F(ModelTest, AServiceThatGoesAwayAndReturnsIsStreamingAgainWithinFiveSeconds) {
  start();
  telephony.refusesConnections = true;
  ports.invalidateLocalPort(channel);
  EXPECT_FALSE(model->isConnected());
  EXPECT_EQ(queue.liveTimers(), 0u);
  queue.advance(33s);
  repair();
  queue.advance(5s);
  EXPECT_TRUE(model->isConnected());
  EXPECT_EQ(queue.liveTimers(), 1u);
}

TEST_F(ModelTest, RefreshNoticesARemotePortThatIsNoLongerValid) {
  start();
  const std::string port = address(ports.localPort(channel));
  ports.endRemotePorts();
  EXPECT_TRUE(model->isConnected());
  model->refresh();
  EXPECT_EQ(log.lines().front().text, " ***** INVALIDATED " + port + " *****");
  EXPECT_EQ(errors(), Lines{" ***** INVALIDATED 0x* *****"} + created + configured + streaming);
  EXPECT_TRUE(ports.remotePort()->isValid());
}

TEST_F(ModelTest, TheDisplayTimerNoticesARemotePortThatIsNoLongerValid) {
  start();
  ports.endRemotePorts();
  queue.advance(1999ms);
  EXPECT_THAT(errors(), IsEmpty());
  queue.advance(1ms);
  EXPECT_EQ(errors(), Lines{" ***** INVALIDATED 0x* *****"} + created + configured + streaming);
  EXPECT_EQ(queue.liveTimers(), 1u);
}

TEST_F(ModelTest, DataThatCameBeforeTheRemotePortEndedIsStillShown) {
  start();
  deliver(antennas(2));
  ports.endRemotePorts();
  model->refresh();
  queue.run();
  EXPECT_EQ(updates, 1u);
  EXPECT_EQ(shownAntennas(), "2");
}

TEST_F(ModelTest, ANotificationRefreshesWhileTheConnectionIsOpen) {
  start();
  deliver(antennas(2));
  telephony.whileMakingLogChannel = [&] { telephony.notify(); };
  ports.invalidateLocalPort(channel);
  EXPECT_EQ(updates, 0u);
  queue.run();
  EXPECT_EQ(updates, 1u);
}

TEST_F(ModelTest, NotificationsDuringTheFirstStartDoNoHarm) {
  telephony.whileMakingLogChannel = [&] { telephony.notify(); };
  model->startMonitor();
  EXPECT_EQ(errors(), created + configured + streaming);
  EXPECT_EQ(updates, 0u);
}

TEST_F(ModelTest, TheOldGeneratorKeepsServingWhenTheTechnologyRequestFailsAfterAReconnection) {
  start();
  deliver(antennas(2));
  EXPECT_EQ(shownAntennas(), "2");
  ports.answer = nullptr;
  ports.invalidateLocalPort(channel);
  EXPECT_EQ(errors(), Lines({"Received an unknown log message: 45249", " ***** INVALIDATED 0x* *****"}) +
                          created + Lines{" ***** No response to GetTechnology; cannot configure"} +
                          streaming);
  EXPECT_TRUE(model->isConnected());
  ASSERT_EQ(ports.requests.size(), 4u);
  EXPECT_EQ(ports.requests[3].data, ports.requests[1].data) << "the start command";
  deliver(antennas(4));
  model->refresh();
  EXPECT_EQ(shownAntennas(), "4");
}

TEST_F(ModelTest, AnUnknownTechnologyAfterAReconnectionLeavesNoGenerator) {
  start();
  deliver(antennas(2));
  const auto nodes = model->topLevelNodes();
  replyWithTechnology("another");
  ports.invalidateLocalPort(channel);
  EXPECT_FALSE(model->isConnected());
  EXPECT_TRUE(model->getSaveContents().isAbsent());
  EXPECT_EQ(model->topLevelNodes(), nodes) << "the cached tree stays until new data arrives";
  model->refresh();
  EXPECT_EQ(model->topLevelNodes(), nullptr);
}

TEST_F(ModelTest, AfterAReconnectionTheNewGeneratorDecodesAndLogsAsUsualAndTheDisplayStaysAsItWas) {
  start();
  deliver(antennas(2));
  EXPECT_EQ(shownAntennas(), "2");
  ports.invalidateLocalPort(channel);
  log.take();

  deliver(antennas(4));
  EXPECT_THAT(log.takeTexts(),
              ElementsAre("<4>LTE Serving Cell Info", "<3>Received an unknown log message: 45249"));
  queue.advance(2s);
  EXPECT_EQ(updates, 1u) << "the message counts as new data";
  EXPECT_EQ(shownAntennas(), "2");
  // The raw bytes are collected nevertheless.
  const Value contents = model->getSaveContents();
  ASSERT_EQ(contents.array()->size(), 3u);
  EXPECT_EQ(*(*contents.array())[1].dictionary()->get("DisplayState").data(), antennas(4));
}

TEST_F(ModelTest, TheStateIsKeptAcrossReconnections) {
  start();
  deliver(antennas(2));
  model->topLevelNodes();
  ports.invalidateLocalPort(channel);
  EXPECT_THAT(model->getSaveContents().array()->size(), 2u);
  EXPECT_EQ(shownAntennas(), "2");
}

TEST_F(ModelTest, AModelDestroyedWhileStreamingTearsTheLinkDownAndLeavesNothingBehind) {
  start();
  deliver(antennas(2));
  log.take();
  ports.events.clear();
  model.reset();
  EXPECT_THAT(ports.events, ElementsAre("local handler removed", "local invalidated", "local destroyed",
                                        "remote invalidated", "remote destroyed"));
  EXPECT_THAT(errors(), IsEmpty());
  EXPECT_EQ(queue.liveTimers(), 0u);
  queue.advance(60s);
  EXPECT_EQ(telephony.attempts, 1u);
  EXPECT_EQ(updates, 0u);
}

TEST_F(ModelTest, AModelDestroyedWithAPendingUpdateMakesNoUpdate) {
  start();
  deliver(antennas(2));
  model->refresh();
  model.reset();
  queue.advance(60s);
  EXPECT_EQ(updates, 0u);
}

TEST_F(ModelTest, AModelDestroyedWithAPendingRestartDoesNotConnect) {
  model->restartMonitorLater();
  model.reset();
  queue.advance(60s);
  EXPECT_EQ(telephony.attempts, 0u);
}

using ModelDeathTest = ModelTest;

TEST_F(ModelDeathTest, AnExceptionOfADecoderEndsTheProgram) {
  start();
  EXPECT_EXIT(deliver(serverMessage(0xFF0000, std::string_view("no property list"))), KilledBySignal(SIGABRT),
              "UnknownDataException");
}

}  // namespace
}  // namespace varnel
