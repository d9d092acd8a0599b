#include "app/TextViewer.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "base/PropertyList.h"
#include "tests/support/DictionaryOf.h"
#include "tests/support/FakeDeviceFiles.h"
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
using testing::ElementsAre;
using testing::EndsWith;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;
using testing::SizeIs;
using testing::StartsWith;

constexpr std::string_view channel = "com.orvane.BasebandStateReport.LogChannel";
constexpr const char* marker = "/OrvaneInternal/Library/PreferenceBundles/Carrier Settings.bundle";

// A report of an LTE modem about its transmit antennas: log code 0xB0C1 with the number in byte 20.
Bytes antennas(std::uint8_t number) { return PacketBuilder(0xB0C1, 22).u8(20, number).bytes(); }

class RecordedPages final : public TextOutput {
 public:
  void show(const TextPage& page) override { pages.push_back(page.text()); }

  std::vector<std::string> pages;
};

class TextViewerTest : public testing::Test {
 protected:
  TextViewerTest() {
    host.resources.add("LTE", dictionaryOf({{"Serving Cell Info", Value::ofDictionary()}}));
    // In a zone two hours east of UTC it is 14:05:09.
    host.clock.set({1709294709, 0});
    host.clock.setZone({7200, false});
    ports.answer = [](const MemoryPorts::Request&) {
      return RemotePort::SendResult{0, writeXmlPropertyList(dictionaryOf({{"GetTechnology", "kalvi-lte"}}))};
    };
  }

  // Delivers a message and lets the display timer notice it.
  void show(std::uint8_t number) {
    ports.deliver(channel, 0, antennas(number));
    queue.advance(2s);
  }
  const std::vector<std::string>& pages() const { return output.pages; }

  RecordingLog log;
  TestServices host;
  FakeQueue queue;
  MemoryPorts ports;
  FakeTelephony telephony;
  FakeDeviceFiles files;
  FakeLinkReports link;
  RecordedPages output;
  TextViewer viewer{
      {ports, telephony, queue, host.services, writeXmlPropertyList, &link}, files, output, "press R"};
};

TEST_F(TextViewerTest, TheFirstPageIsTheStatusAlone) { EXPECT_THAT(pages(), ElementsAre("Connecting...\n")); }

TEST_F(TextViewerTest, TheStatusHasTheTimeOfTheUsersClock) {
  FakeClock users;
  users.set({1709298309, 0});
  users.setZone({7200, false});
  RecordedPages otherPages;
  FakeQueue otherQueue;
  MemoryPorts otherPorts;
  otherPorts.answer = ports.answer;
  TextViewer other({otherPorts, telephony, otherQueue, host.services, writeXmlPropertyList, &link}, files,
                   otherPages, "press R", &users);
  otherQueue.run();
  otherPorts.deliver(channel, 0, antennas(2));
  otherQueue.advance(2s);
  ASSERT_THAT(otherPages.pages, Not(IsEmpty()));
  EXPECT_THAT(otherPages.pages.back(), StartsWith("Updated 2024-03-01 at 15:05:09\n"));
}

TEST_F(TextViewerTest, ConnectsOnceTheQueueRuns) {
  EXPECT_EQ(telephony.attempts, 0u);
  queue.run();
  EXPECT_EQ(telephony.attempts, 1u);
  EXPECT_TRUE(ports.hasLocalPort(channel));
  EXPECT_THAT(pages(), SizeIs(1));
}

TEST_F(TextViewerTest, WhileNothingArrivesTheOneMorePageSaysSo) {
  queue.advance(60s);
  EXPECT_THAT(pages(), ElementsAre("Connecting...\n",
                                   "Connecting...\nNotice: Connected to a modem of the technology "
                                   "\"kalvi-lte\", but nothing has arrived yet\n"));
}

TEST_F(TextViewerTest, TheNoticeStandsBetweenStatusAndTreeALineForEachMatter) {
  queue.run();
  link.report.serverNote = "The replay has ended";
  link.report.droppedByServer = 12;
  show(2);
  EXPECT_THAT(pages().back(),
              StartsWith("Updated 2024-03-01 at 14:05:09\n"
                         "Notice: The replay has ended\n"
                         "Notice: Messages that the server dropped, since they were read too slowly: 12\n"
                         "Serving Cell Info\n"));
}

TEST_F(TextViewerTest, ANoticeThatComesOrGoesIsAPageOfItsOwn) {
  queue.run();
  show(2);
  ASSERT_THAT(pages(), SizeIs(2));
  link.report.serverNote = "The replay has ended";
  queue.advance(60s);
  ASSERT_THAT(pages(), SizeIs(3));
  EXPECT_THAT(pages()[2], StartsWith("Updated 2024-03-01 at 14:05:09\nNotice: The replay has ended\n"));
  link.report = {};
  queue.advance(60s);
  ASSERT_THAT(pages(), SizeIs(4));
  EXPECT_EQ(pages()[3], pages()[1]);
}

TEST_F(TextViewerTest, WhyItIsConnectingIsToldAfterThreeSeconds) {
  telephony.refusesConnections = true;
  link.report.trouble = "No server is in /run/varnel";
  queue.advance(3s);
  EXPECT_THAT(pages(),
              ElementsAre("Connecting...\n", "Connecting...\nNotice: No server is in /run/varnel\n"));
}

TEST_F(TextViewerTest, TheStatusIsRightAsSoonAsTheLinkIsBack) {
  queue.run();
  show(2);
  telephony.refusesConnections = true;
  ports.invalidateLocalPort(channel);
  ASSERT_THAT(pages().back(), StartsWith("Connecting...\n"));
  telephony.refusesConnections = false;
  host.clock.set({1709298309, 0});
  queue.advance(5s);
  EXPECT_THAT(pages().back(), StartsWith("Updated 2024-03-01 at 14:05:09\nNotice: The display stands still "
                                         "since 2024-03-01 at 15:05:09,"));
}

TEST_F(TextViewerTest, TheFirstStatusStaysUntilTheFirstRefresh) {
  queue.run();
  telephony.refusesConnections = true;
  ports.invalidateLocalPort(channel);
  telephony.refusesConnections = false;
  queue.advance(5s);
  EXPECT_THAT(pages().back(), StartsWith("Connecting...\n"));
}

TEST_F(TextViewerTest, EachRefreshShowsTheTimeOfTheLocalZoneAndTheTree) {
  queue.run();
  show(2);
  ASSERT_THAT(pages(), SizeIs(2));
  EXPECT_THAT(pages()[1], StartsWith("Updated 2024-03-01 at 14:05:09\n"));
  EXPECT_THAT(pages()[1], EndsWith("Serving Cell Info\n  Num Tx Antennas  2\n"));
  host.clock.set({1709294711, 0});
  show(4);
  ASSERT_THAT(pages(), SizeIs(3));
  EXPECT_THAT(pages()[2], StartsWith("Updated 2024-03-01 at 14:05:11\n"));
  EXPECT_THAT(pages()[2], EndsWith("Serving Cell Info\n  Num Tx Antennas  4\n"));
}

TEST_F(TextViewerTest, ARefreshWithoutAConnectionShowsThatItIsConnectingAndTheTree) {
  queue.run();
  show(2);
  ports.deliver(channel, 0, antennas(4));
  ports.endRemotePorts();
  telephony.refusesConnections = true;
  queue.advance(2s);
  ASSERT_THAT(pages(), SizeIs(4));
  EXPECT_THAT(pages()[3], StartsWith("Connecting...\n"));
  EXPECT_THAT(pages()[3], EndsWith("Serving Cell Info\n  Num Tx Antennas  4\n"));
}

TEST_F(TextViewerTest, ALostLinkTurnsTheStatusAndLeavesTheTree) {
  queue.run();
  show(2);
  telephony.refusesConnections = true;
  ports.invalidateLocalPort(channel);
  ASSERT_THAT(pages(), SizeIs(3));
  EXPECT_THAT(pages()[2], StartsWith("Connecting...\n"));
  EXPECT_THAT(pages()[2], EndsWith("Serving Cell Info\n  Num Tx Antennas  2\n"));
}

TEST_F(TextViewerTest, ARefreshWithoutATreeShowsTheStatusAlone) {
  viewer.updateViewControllerFromModel();
  EXPECT_THAT(pages(), ElementsAre("Connecting...\n", "Connecting...\n"));
}

TEST_F(TextViewerTest, CallsTheTaskOnceWhenThatManyRefreshesHaveBeenShown) {
  std::vector<std::size_t> pagesAtCall;
  viewer.afterUpdates(2, [&] { pagesAtCall.push_back(pages().size()); });
  queue.run();
  show(1);
  EXPECT_THAT(pagesAtCall, IsEmpty());
  show(2);
  EXPECT_THAT(pagesAtCall, ElementsAre(3u)) << "the first status is no refresh";
  show(3);
  show(4);
  EXPECT_THAT(pagesAtCall, SizeIs(1));
}

TEST_F(TextViewerTest, CountsRefreshesFromTheCallOn) {
  unsigned calls = 0;
  queue.run();
  show(1);
  viewer.afterUpdates(1, [&] { ++calls; });
  EXPECT_EQ(calls, 0u);
  show(2);
  EXPECT_EQ(calls, 1u);
}

TEST_F(TextViewerTest, SavesASnapshotWithAnEmptyDescriptionOnAnInternalDevice) {
  files.existing = {marker};
  queue.run();
  show(2);
  viewer.save();
  ASSERT_THAT(files.writes, SizeIs(1));
  EXPECT_EQ(files.writes[0].path, "/var/mobile/Library/Logs/CrashReporter/VarnelSnapshot-1709294709.varnel");
  const Dictionary* contents = files.writes[0].list.dictionary();
  ASSERT_TRUE(contents);
  EXPECT_EQ(*contents->get("Timestamp").string(), "2024-03-01 12:05:09 +0000");
  ASSERT_TRUE(contents->get("Description").string());
  EXPECT_EQ(*contents->get("Description").string(), "");
  const Array* data = contents->get("Data").array();
  ASSERT_TRUE(data);
  ASSERT_THAT(*data, SizeIs(2));
  EXPECT_EQ(*data->front().dictionary()->get("Description").string(), "Snapshot (2024-03-01 12:05:09 +0000)");
  // The 161 bytes of the report, and the 22 bytes of the packet without the first.
  EXPECT_EQ(*data->back().dictionary()->get("Description").string(), "DLF binary (182 bytes)");
}

TEST_F(TextViewerTest, SavesNothingWithoutTheMarkerOfAnInternalDevice) {
  queue.run();
  show(2);
  log.take();
  viewer.save();
  EXPECT_THAT(files.writes, IsEmpty());
  EXPECT_THAT(log.take(), SizeIs(1)) << "the reason";
  EXPECT_THAT(pages().back(), HasSubstr("\nNotice: Not saved: this device allows no snapshots"));
}

TEST_F(TextViewerTest, ASnapshotThatCannotBeWrittenIsLogged) {
  files.existing = {marker};
  files.refusesWrites = true;
  queue.run();
  show(2);
  log.take();
  viewer.save();
  EXPECT_THAT(log.takeTexts(), ElementsAre("<3>Unable to write snapshot to "
                                           "/var/mobile/Library/Logs/CrashReporter/"
                                           "VarnelSnapshot-1709294709.varnel"));
  EXPECT_THAT(pages().back(), HasSubstr("\nNotice: Not saved: /var/mobile/Library/Logs/CrashReporter/"
                                        "VarnelSnapshot-1709294709.varnel: No space left on device\n"));
}

TEST_F(TextViewerTest, ASecondSnapshotOfASecondSaysThatItHasReplacedTheFirst) {
  files.existing = {marker};
  queue.run();
  show(2);
  viewer.save();
  EXPECT_THAT(pages().back(), HasSubstr("VarnelSnapshot-1709294709.varnel\n"));
  viewer.save();
  EXPECT_THAT(pages().back(), HasSubstr("VarnelSnapshot-1709294709.varnel, in place of the snapshot of the "
                                        "same second\n"));
}

TEST_F(TextViewerTest, AfterAReconnectionTheDisplayStaysAsItWasUntilOneStartsOver) {
  queue.run();
  show(2);
  ports.invalidateLocalPort(channel);
  show(4);
  EXPECT_THAT(pages().back(), EndsWith("Serving Cell Info\n  Num Tx Antennas  2\n"));
  viewer.startOver();
  queue.run();
  show(8);
  EXPECT_THAT(pages().back(), EndsWith("Serving Cell Info\n  Num Tx Antennas  8\n"));
}

TEST_F(TextViewerTest, StartingOverShowsTheFirstStatusAgainAndConnectsAnew) {
  queue.run();
  show(2);
  viewer.startOver();
  EXPECT_EQ(pages().back(), "Connecting...\n");
  EXPECT_FALSE(ports.hasLocalPort(channel));
  queue.run();
  EXPECT_EQ(telephony.attempts, 2u);
  EXPECT_TRUE(ports.hasLocalPort(channel));
  queue.advance(3s);
  EXPECT_EQ(queue.liveTimers(), 1u);
}

TEST_F(TextViewerTest, StartingOverEmptiesTheHistory) {
  files.existing = {marker};
  queue.run();
  show(2);
  show(4);
  viewer.startOver();
  queue.run();
  show(8);
  viewer.save();
  ASSERT_THAT(files.writes, SizeIs(1));
  EXPECT_THAT(*files.writes[0].list.dictionary()->get("Data").array(), SizeIs(2))
      << "a snapshot and the binary log";
}

TEST_F(TextViewerTest, TheTaskAfterRefreshesMayStartOver) {
  viewer.afterUpdates(1, [&] { viewer.startOver(); });
  queue.run();
  show(2);
  EXPECT_EQ(pages().back(), "Connecting...\n");
  show(4);
  EXPECT_THAT(pages().back(), EndsWith("Serving Cell Info\n  Num Tx Antennas  4\n"));
}

TEST_F(TextViewerTest, StartingOverWhileARetryIsPendingLeavesOneModelThatConnects) {
  telephony.refusesConnections = true;
  queue.run();
  viewer.startOver();
  queue.run();
  EXPECT_EQ(telephony.attempts, 2u);
  queue.advance(5s);
  EXPECT_EQ(telephony.attempts, 3u);
}

}  // namespace
}  // namespace varnel
