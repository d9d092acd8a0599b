#include "app/NoticeKeeper.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "base/PropertyList.h"
#include "tests/support/DictionaryOf.h"
#include "tests/support/FakeLinkReports.h"
#include "tests/support/FakeQueue.h"
#include "tests/support/FakeTelephony.h"
#include "tests/support/MemoryPorts.h"
#include "tests/support/PacketBuilder.h"
#include "tests/support/RecordingLog.h"
#include "tests/support/TestServices.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;

constexpr std::string_view channel = "com.orvane.BasebandStateReport.LogChannel";
constexpr const char* noServer = "No server is in /run/varnel; type varnel-telephonyd";

// A model whose observer asks the keeper after every call, like a viewer.
class NoticeKeeperTest : public testing::Test, public VarnelModelObserver {
 protected:
  NoticeKeeperTest() {
    host.resources.add("LTE", dictionaryOf({{"Serving Cell Info", Value::ofDictionary()}}));
    host.resources.add("UTRAN", dictionaryOf({{"RRC Info", Value::ofDictionary()}}));
    host.resources.add("C2KTemplate", dictionaryOf({{"EV-DO", dictionaryOf({{"Fingers", "kFingerC2I"}})}}));
    // In a zone two hours east of UTC it is 14:05:09.
    host.clock.set({1709294709, 0});
    host.clock.setZone({7200, false});
    answerWith("kalvi-lte");
  }

  void updateViewControllerFromModel() override {
    model.topLevelNodes();
    keeper.update();
  }
  void linkWasOpened() override { keeper.update(); }
  void linkWasLookedAt() override { keeper.update(); }

  void answerWith(std::string technology) {
    ports.answer = [technology](const MemoryPorts::Request&) {
      return RemotePort::SendResult{0, writeXmlPropertyList(dictionaryOf({{"GetTechnology", technology}}))};
    };
  }
  void start() {
    keeper.begin(model);
    model.restartMonitorLater();
    queue.run();
  }
  void startWithoutServer() {
    telephony.refusesConnections = true;
    link.report.trouble = noServer;
    start();
  }
  void letServerCome() {
    telephony.refusesConnections = false;
    link.report = {};
    queue.advance(5s);
  }
  // Delivers a message and lets the display timer notice it.
  void receive(const Bytes& message) {
    ports.deliver(channel, 0, message);
    queue.advance(2s);
  }
  void receive() { receive(PacketBuilder(0xB0C1, 22).bytes()); }

  RecordingLog log;
  TestServices host;
  FakeQueue queue;
  MemoryPorts ports;
  FakeTelephony telephony;
  FakeLinkReports link;
  const ModelServices services{ports, telephony, queue, host.services, writeXmlPropertyList, &link};
  VarnelModel model{services, *this};
  unsigned calls = 0;
  NoticeKeeper keeper{services, "press R", [this] { ++calls; }};
};

TEST_F(NoticeKeeperTest, WhyThereIsNoLinkIsToldAfterThreeSeconds) {
  startWithoutServer();
  queue.advance(3s - 1ms);
  EXPECT_EQ(keeper.text(), "");
  EXPECT_EQ(calls, 0u);
  queue.advance(1ms);
  EXPECT_EQ(keeper.text(), noServer);
  EXPECT_EQ(calls, 1u);
}

TEST_F(NoticeKeeperTest, EachAttemptToConnectMayHaveAnotherReason) {
  startWithoutServer();
  queue.advance(4s);
  link.report.trouble = "The server is full";
  EXPECT_EQ(keeper.text(), noServer);
  queue.advance(1s);
  EXPECT_EQ(keeper.text(), "The server is full");
}

TEST_F(NoticeKeeperTest, TheReasonGoesWhenTheLinkIsThere) {
  startWithoutServer();
  queue.advance(3s);
  letServerCome();
  receive();
  EXPECT_EQ(keeper.text(), "");
}

TEST_F(NoticeKeeperTest, ALinkThatIsThereInTimeIsNotToldOf) {
  start();
  receive();
  queue.advance(60s);
  EXPECT_EQ(keeper.text(), "");
  EXPECT_EQ(calls, 0u);
}

TEST_F(NoticeKeeperTest, AfterALossTheThreeSecondsBeginAnew) {
  start();
  receive();
  telephony.refusesConnections = true;
  link.report.trouble = noServer;
  ports.invalidateLocalPort(channel);
  queue.advance(3s - 1ms);
  EXPECT_EQ(keeper.text(), "");
  queue.advance(1ms);
  EXPECT_EQ(keeper.text(), noServer);
}

TEST_F(NoticeKeeperTest, AnUnknownTechnologyIsNamedAndThoseThatAreKnown) {
  answerWith("kalvi-7g");
  link.report.place = "/run/varnel";
  start();
  queue.advance(3s);
  EXPECT_EQ(
      keeper.text(),
      "The telephony server in /run/varnel has a modem of the technology \"kalvi-7g\", which this viewer "
      "does not know; start varnel-telephonyd anew with one of ifx-gsm, kalvi-gsm-umts, kalvi-cdma, "
      "kalvi-lte, kalvi-utran-2, all-radios");
}

TEST_F(NoticeKeeperTest, AServerThatTellsNoTechnologyIsToldOfThoughTheHostKnowsNothing) {
  ports.answer = [](const MemoryPorts::Request&) { return RemotePort::SendResult{0, Bytes{1, 2}}; };
  link.report.place = "/run/varnel";
  start();
  queue.advance(3s);
  EXPECT_EQ(keeper.text(),
            "The telephony server in /run/varnel does not tell the technology of its modem; start "
            "varnel-telephonyd anew");
}

TEST_F(NoticeKeeperTest, AnOpenLinkThatBringsNothingIsToldAfterThreeSeconds) {
  start();
  queue.advance(3s);
  EXPECT_EQ(keeper.text(),
            "Connected to a modem of the technology \"kalvi-lte\", but nothing has arrived yet");
  receive();
  EXPECT_EQ(keeper.text(), "");
}

TEST_F(NoticeKeeperTest, ADisplayThatStandsStillAfterAReconnectionIsToldSinceWhenWithTheWayToStartOver) {
  start();
  receive();
  host.clock.set({1709294771, 0});
  ports.invalidateLocalPort(channel);
  receive();
  host.clock.set({1709298371, 0});
  ports.invalidateLocalPort(channel);
  EXPECT_EQ(
      keeper.text(),
      "The display stands still since 2024-03-01 at 14:06:11, when the link was opened anew; press R to "
      "start over");
}

TEST_F(NoticeKeeperTest, ADisplayOfAnotherTechnologyNamesBoth) {
  start();
  receive();
  answerWith("kalvi-utran-2");
  ports.invalidateLocalPort(channel);
  EXPECT_EQ(keeper.text(),
            "The display stands still since 2024-03-01 at 14:05:09, for it is that of \"kalvi-lte\" and the "
            "modem's technology is now \"kalvi-utran-2\"; press R to start over");
}

TEST_F(NoticeKeeperTest, ADisplayThatGoesOnAfterAReconnectionIsNotToldOf) {
  answerWith("kalvi-cdma");
  start();
  receive(PacketBuilder(0x108A, 23).bytes());
  ports.invalidateLocalPort(channel);
  receive(PacketBuilder(0x108A, 23).bytes());
  EXPECT_EQ(keeper.text(), "");
}

TEST_F(NoticeKeeperTest, ALinkThatIsOpenedAnewBeforeThereIsADisplayMakesOne) {
  start();
  ports.invalidateLocalPort(channel);
  receive();
  EXPECT_EQ(keeper.text(), "");
}

TEST_F(NoticeKeeperTest, AMissingTemplateIsNamedByItsFile) {
  for (const auto& [technology, resource] :
       {std::pair("kalvi-lte", "LTE"), {"kalvi-utran-2", "UTRAN"}, {"kalvi-cdma", "C2KTemplate"}}) {
    host.resources.remove(resource);
    answerWith(technology);
    VarnelModel other{services, *this};
    keeper.begin(other);
    other.startMonitor();
    ports.deliver(channel, 0, PacketBuilder(0xB0C1, 22).bytes());
    keeper.update();
    EXPECT_THAT(keeper.text(),
                testing::StartsWith("There is no display without the template " + std::string(resource) +
                                    ".plist, which cannot be loaded; install Varnel anew, or let "
                                    "VARNEL_RESOURCES name a folder that has it"));
    keeper.end();
  }
}

TEST_F(NoticeKeeperTest, WhatTheServerSaysOfItsSourceIsPassedOn) {
  start();
  receive();
  link.report.serverNote = "The replay has ended";
  queue.advance(2s);
  EXPECT_EQ(keeper.text(), "The replay has ended");
}

TEST_F(NoticeKeeperTest, AMixtureOfSimCardsIsToldAsLongAsItIsOne) {
  start();
  receive();
  link.report.mixture = "The display mixes SIM 1 and SIM 2";
  queue.advance(4s);
  EXPECT_EQ(keeper.text(), "The display mixes SIM 1 and SIM 2");
  link.report.mixture.clear();
  queue.advance(2s);
  EXPECT_EQ(keeper.text(), "");
}

TEST_F(NoticeKeeperTest, AllRadiosKeepSimCardsApartSoTheyAreNoMixture) {
  host.resources.add("AllRadios", dictionaryOf({{"1;LTE", Value::ofDictionary()}}));
  answerWith("all-radios");
  start();
  receive();
  link.report.mixture = "The display mixes SIM 1 and SIM 2";
  queue.advance(4s);
  EXPECT_THAT(keeper.text(), testing::Not(testing::HasSubstr("mixes")));
}

TEST_F(NoticeKeeperTest, WithoutADisplayNothingIsMixed) {
  link.report.mixture = "The display mixes SIM 1 and SIM 2";
  keeper.begin(model);
  keeper.update();
  EXPECT_EQ(keeper.text(), "");
}

TEST_F(NoticeKeeperTest, MessagesThatAreNotShownAreCountedALineForEachReason) {
  start();
  link.report.droppedByServer = 12;
  link.report.tooLongForChannel = 1;
  receive(PacketBuilder(0xB0C0, 40).bytes());
  EXPECT_EQ(keeper.text(),
            "Messages that the server dropped, since they were read too slowly: 12\n"
            "Messages too long for the log channel: 1\n"
            "Messages of a log code, version, or length that no decoder knows: 1");
}

TEST_F(NoticeKeeperTest, ASnapshotIsToldWithItsPlaceForHalfAMinute) {
  start();
  receive();
  keeper.snapshotWasWritten({.place = "/logs/a.varnel", .failure = {}});
  EXPECT_EQ(keeper.text(), "Saved: /logs/a.varnel");
  EXPECT_EQ(calls, 1u);
  queue.advance(30s - 1ms);
  EXPECT_EQ(keeper.text(), "Saved: /logs/a.varnel");
  queue.advance(1ms);
  EXPECT_EQ(keeper.text(), "");
  EXPECT_EQ(calls, 2u);
}

TEST_F(NoticeKeeperTest, ASnapshotThatReplacesAnotherSaysSo) {
  start();
  receive();
  keeper.snapshotWasWritten({.place = "/logs/a.varnel", .failure = {}, .hasReplaced = true});
  EXPECT_EQ(keeper.text(), "Saved: /logs/a.varnel, in place of the snapshot of the same second");
}

TEST_F(NoticeKeeperTest, ASnapshotThatIsNotSavedSaysWhy) {
  start();
  receive();
  keeper.snapshotWasWritten({.place = "/logs/a.varnel", .failure = "No space left on device"});
  EXPECT_EQ(keeper.text(), "Not saved: /logs/a.varnel: No space left on device");
  keeper.snapshotIsNotAllowed();
  EXPECT_EQ(keeper.text(),
            "Not saved: this device allows no snapshots, for it has no "
            "/OrvaneInternal/Library/PreferenceBundles/Carrier Settings.bundle");
}

TEST_F(NoticeKeeperTest, ASnapshotBeforeAnythingHasArrivedSaysSo) {
  start();
  keeper.snapshotIsWanted();
  EXPECT_EQ(keeper.text(), "Nothing has arrived yet: a snapshot saved now is empty");
  keeper.snapshotWasWritten({.place = "/logs/a.varnel", .failure = {}});
  EXPECT_EQ(keeper.text(), "Saved: /logs/a.varnel; it is empty, for nothing has arrived yet");
}

TEST_F(NoticeKeeperTest, AWantedSnapshotOfADisplayNeedsNoWord) {
  start();
  receive();
  keeper.snapshotIsWanted();
  EXPECT_EQ(keeper.text(), "");
  EXPECT_EQ(calls, 0u);
}

TEST_F(NoticeKeeperTest, ANewModelAndTheEndForgetWhatWasTold) {
  startWithoutServer();
  queue.advance(3s);
  keeper.snapshotIsNotAllowed();
  keeper.begin(model);
  EXPECT_EQ(keeper.text(), "");
  queue.advance(3s);
  EXPECT_EQ(keeper.text(), noServer);
  keeper.end();
  EXPECT_EQ(keeper.text(), "");
  EXPECT_EQ(queue.liveTimers(), 0u);
}

}  // namespace
}  // namespace varnel
