#include "app/VarnelApp.h"

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
#include "tests/support/RecordingPreferences.h"
#include "tests/support/RecordingUserInterface.h"
#include "tests/support/TestServices.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::SizeIs;

constexpr std::string_view channel = "com.orvane.BasebandStateReport.LogChannel";
constexpr const char* marker = "/OrvaneInternal/Library/PreferenceBundles/Carrier Settings.bundle";
constexpr const char* connecting = "[wheel] [Connecting...] [space]";
constexpr const char* updated = "[hidden wheel] [Updated 2024-03-01 at 14:05:09] [space]";

// This many packet-data contexts, as the telephony server reports them.
Bytes contexts(std::size_t count) {
  const Value list = Value::ofArray();
  for (std::size_t i = 0; i < count; ++i)
    list.array()->push_back(dictionaryOf({{"APN", "internet" + std::to_string(i)}}));
  return serverMessage(0xFF0002, list);
}

class VarnelAppTest : public testing::Test {
 protected:
  VarnelAppTest() {
    host.resources.add("LTE", dictionaryOf({{"PDP Context Info", Value::ofArray()},
                                            {"Serving Cell Info", Value::ofDictionary()}}));
    host.resources.add(
        "VarnelSaveViewController",
        dictionaryOf(
            {{"Rows",
              Value::ofArray({Value::ofArray({
                  dictionaryOf({{"Kind", "Button"}, {"Title", "Save"}, {"Action", "savePressed:"}}),
                  dictionaryOf({{"Kind", "Button"}, {"Title", "Cancel"}, {"Action", "cancelPressed:"}}),
                  dictionaryOf({{"Kind", "Table"}, {"Outlet", "saveContentTable"}}),
                  dictionaryOf({{"Kind", "TextField"}, {"Outlet", "saveDescription"}}),
              })})}}));
    // In a zone two hours east of UTC it is 14:05:09.
    host.clock.set({1709294709, 0});
    host.clock.setZone({7200, false});
    ports.answer = [](const MemoryPorts::Request&) {
      return RemotePort::SendResult{0, writeXmlPropertyList(dictionaryOf({{"GetTechnology", "kalvi-lte"}}))};
    };
  }

  void launch() { app.applicationDidFinishLaunching(); }
  // Launches and connects the application and shows this many contexts.
  void launchWith(std::size_t count) {
    launch();
    queue.run();
    receive(count);
  }
  // Delivers a message and lets the display timer notice it.
  void receive(std::size_t count) {
    ports.deliver(channel, 0, contexts(count));
    queue.advance(2s);
  }
  void loseTheLink() {
    telephony.refusesConnections = true;
    ports.invalidateLocalPort(channel);
  }
  RecordingStack& stack() const { return *userInterface.stack; }
  RecordingPane& pane() const { return stack().pane(); }
  const std::string& title() const { return static_cast<RecordingWindow&>(*app.window()).title; }
  std::string path() const { return static_cast<VarnelPaneController&>(*stack().topController()).path(); }
  // Opens the first row of the root pane, and the row with this number in the pane below it.
  void openContext(std::size_t row) {
    pane().table().select(0);
    pane().table().select(row);
    userInterface.events.clear();
  }

  RecordingLog log;
  TestServices host;
  FakeQueue queue;
  MemoryPorts ports;
  FakeTelephony telephony;
  FakeDeviceFiles files;
  FakeLinkReports link;
  RecordingPreferences preferences;
  RecordingUserInterface userInterface;
  ValueHistory history;
  VarnelApp app{{.model = {ports, telephony, queue, host.services, writeXmlPropertyList, &link},
                 .files = files,
                 .preferences = preferences,
                 .userInterface = userInterface,
                 .history = &history}};
};

TEST_F(VarnelAppTest, LaunchShowsAWindowAsLargeAsTheScreen) {
  launch();
  EXPECT_THAT(userInterface.events, ElementsAre("window made", "window gets its root", "window visible"));
  EXPECT_EQ(userInterface.windowFrame, (Rect{0, 0, 320, 480}));
  EXPECT_TRUE(app.window());
}

TEST_F(VarnelAppTest, TheRootPaneIsAnEmptyOneTitledVarnel) {
  launch();
  ASSERT_THAT(stack().controllers(), SizeIs(1));
  EXPECT_EQ(path(), "/");
  EXPECT_EQ(pane().title, "Varnel");
  EXPECT_EQ(pane().table().rows(), 0u);
  EXPECT_TRUE(stack().isToolbarShown);
}

TEST_F(VarnelAppTest, TheVeryFirstStatusHasNoDots) {
  launch();
  EXPECT_EQ(pane().toolbarText(), "[wheel] [Connecting] [space]");
  EXPECT_EQ(app.updateMessage(), "Connecting...");
}

TEST_F(VarnelAppTest, ConnectsOnceLaunchHasReturned) {
  launch();
  EXPECT_EQ(telephony.attempts, 0u);
  EXPECT_EQ(queue.waitingTasks(), 1u);
  queue.run();
  EXPECT_EQ(telephony.attempts, 1u);
  EXPECT_TRUE(ports.hasLocalPort(channel));
}

TEST_F(VarnelAppTest, TheFirstStatusStaysUntilTheFirstRefresh) {
  launch();
  queue.advance(60s);
  EXPECT_EQ(pane().toolbarText(), "[wheel] [Connecting] [space]");
}

TEST_F(VarnelAppTest, TheSaveButtonIsOfferedOnInternalDevicesOnly) {
  launch();
  EXPECT_FALSE(app.allowSaveButton());
  EXPECT_EQ(pane().toolbarText(), "[wheel] [Connecting] [space]");
}

TEST_F(VarnelAppTest, TheSaveButtonIsDecidedOnAtLaunch) {
  files.existing = {marker};
  launch();
  EXPECT_TRUE(app.allowSaveButton());
  files.existing.clear();
  queue.run();
  receive(1);
  EXPECT_EQ(pane().toolbarText(), "[hidden wheel] [Updated 2024-03-01 at 14:05:09] [space] [Save]");
}

TEST_F(VarnelAppTest, ARefreshShowsTheTreeAndTheLocalTimeOfTheUpdate) {
  launchWith(1);
  EXPECT_EQ(pane().title, "Varnel");
  EXPECT_EQ(pane().table().rows(), 2u);
  EXPECT_EQ(pane().toolbarText(), updated);
  EXPECT_EQ(app.updateMessage(), "Updated 2024-03-01 at 14:05:09");
}

TEST_F(VarnelAppTest, EachRefreshHasItsTime) {
  launchWith(1);
  host.clock.set({1709294711, 0});
  receive(1);
  EXPECT_EQ(pane().toolbarText(), "[hidden wheel] [Updated 2024-03-01 at 14:05:11] [space]");
}

TEST_F(VarnelAppTest, ARefreshShowsEveryPaneItsNewNode) {
  launchWith(1);
  pane().table().select(0);
  EXPECT_EQ(path(), "/PDP Context Info");
  EXPECT_EQ(pane().table().rows(), 1u);
  receive(3);
  EXPECT_EQ(pane().title, "PDP Context Info");
  EXPECT_EQ(pane().table().rows(), 3u);
  EXPECT_EQ(stack().pane(0).table().reloads, 2u);
  EXPECT_EQ(stack().pane(1).table().reloads, 1u);
}

TEST_F(VarnelAppTest, OnlyTheTopPaneGetsTheNewStatus) {
  launchWith(1);
  pane().table().select(0);
  host.clock.set({1709294711, 0});
  receive(1);
  EXPECT_EQ(stack().pane(0).toolbarText(), updated);
  EXPECT_EQ(stack().pane(1).toolbarText(), "[hidden wheel] [Updated 2024-03-01 at 14:05:11] [space]");
}

TEST_F(VarnelAppTest, APaneThatIsAboutToBeShownGetsThePresentStatus) {
  launchWith(1);
  pane().table().select(0);
  EXPECT_EQ(pane().toolbarText(), updated);
  host.clock.set({1709294711, 0});
  receive(1);
  stack().goBack();
  EXPECT_EQ(pane().toolbarText(), "[hidden wheel] [Updated 2024-03-01 at 14:05:11] [space]");
}

TEST_F(VarnelAppTest, APaneWhoseNodeIsGoneIsPoppedAndItsParentShowsTheNewData) {
  launchWith(2);
  openContext(1);
  EXPECT_EQ(path(), "/PDP Context Info/1");
  host.clock.set({1709294711, 0});
  receive(1);
  EXPECT_THAT(userInterface.events, ElementsAre("pop animated"));
  EXPECT_EQ(path(), "/PDP Context Info");
  EXPECT_EQ(pane().table().rows(), 1u);
  EXPECT_EQ(pane().toolbarText(), "[hidden wheel] [Updated 2024-03-01 at 14:05:11] [space]");
}

TEST_F(VarnelAppTest, APaneThatIsGoneTakesThoseAboveItAlongUnreloaded) {
  const Value deep = dictionaryOf({{"A", dictionaryOf({{"B", Value::ofDictionary()}})}});
  launch();
  queue.run();
  ports.deliver(channel, 0, serverMessage(0xFF0002, Value::ofArray({deep})));
  queue.advance(2s);
  for (const std::size_t row : {0u, 0u, 0u, 0u}) pane().table().select(row);
  ASSERT_EQ(path(), "/PDP Context Info/0/A/B");
  const auto panes = stack().controllers();
  receive(0);
  EXPECT_EQ(path(), "/PDP Context Info");
  EXPECT_EQ(pane().table().rows(), 0u);
  for (const std::size_t i : {2u, 3u, 4u}) {
    EXPECT_EQ(static_cast<RecordingPane&>(panes[i]->pane()).table().reloads, 0u) << i;
    EXPECT_EQ(panes[i]->navigationController(), nullptr);
  }
}

TEST_F(VarnelAppTest, APaneWhosePathExistsSurvives) {
  launchWith(2);
  openContext(1);
  receive(2);
  EXPECT_THAT(userInterface.events, IsEmpty());
  EXPECT_EQ(path(), "/PDP Context Info/1");
  EXPECT_EQ(pane().title, "1");
}

TEST_F(VarnelAppTest, ARefreshWithoutAConnectionShowsTheTreeAndThatItIsConnecting) {
  launchWith(1);
  ports.deliver(channel, 0, contexts(3));
  telephony.refusesConnections = true;
  ports.endRemotePorts();
  host.clock.set({1709294711, 0});
  queue.advance(2s);
  EXPECT_EQ(pane().toolbarText(), connecting);
  EXPECT_EQ(app.updateMessage(), "Updated 2024-03-01 at 14:05:09") << "the time when it was connected";
  pane().table().select(0);
  EXPECT_EQ(pane().table().rows(), 3u);
}

TEST_F(VarnelAppTest, ALostLinkTurnsTheStatusAndLeavesTheRows) {
  launchWith(2);
  pane().table().select(0);
  EXPECT_EQ(pane().toolbarText(), updated);
  loseTheLink();
  EXPECT_EQ(pane().toolbarText(), connecting);
  EXPECT_EQ(pane().table().rows(), 2u);
}

TEST_F(VarnelAppTest, APaneThatIsShownWhileTheLinkIsLostIsConnecting) {
  launchWith(1);
  loseTheLink();
  pane().table().select(0);
  EXPECT_EQ(pane().toolbarText(), connecting);
}

TEST_F(VarnelAppTest, TheStatusReturnsWithTheLink) {
  launchWith(1);
  loseTheLink();
  pane().table().select(0);
  telephony.refusesConnections = false;
  queue.advance(5s);
  receive(1);
  EXPECT_EQ(pane().toolbarText(), updated);
}

TEST_F(VarnelAppTest, TheStatusIsRightAsSoonAsTheLinkIsBack) {
  launchWith(1);
  loseTheLink();
  pane().table().select(0);
  ASSERT_EQ(pane().toolbarText(), connecting);
  telephony.refusesConnections = false;
  host.clock.set({1709298309, 0});
  queue.advance(5s);
  EXPECT_EQ(pane().toolbarText(), updated) << "of the last refresh";
  EXPECT_EQ(stack().pane(0).toolbarText(), connecting) << "only the top pane is told";
}

TEST_F(VarnelAppTest, ALinkThatIsBackBeforeTheFirstRefreshLeavesTheStatus) {
  launch();
  queue.run();
  loseTheLink();
  ASSERT_EQ(pane().toolbarText(), connecting);
  telephony.refusesConnections = false;
  queue.advance(5s);
  EXPECT_EQ(pane().toolbarText(), connecting);
  receive(1);
  EXPECT_EQ(pane().toolbarText(), updated);
}

TEST_F(VarnelAppTest, TheTitleBarNamesSectionTechnologyAndProgram) {
  launch();
  EXPECT_EQ(title(), "Varnel");
  queue.run();
  EXPECT_EQ(title(), "kalvi-lte — Varnel");
  receive(1);
  pane().table().select(0);
  EXPECT_EQ(title(), "PDP Context Info — kalvi-lte — Varnel");
  EXPECT_EQ(pane().title, "PDP Context Info");
  pane().table().select(0);
  EXPECT_EQ(title(), "0 — kalvi-lte — Varnel");
  stack().goBack();
  EXPECT_EQ(title(), "PDP Context Info — kalvi-lte — Varnel");
  app.startOver();
  EXPECT_EQ(title(), "Varnel");
}

TEST_F(VarnelAppTest, TheNoticeTellsAfterThreeSecondsWhyItIsConnecting) {
  telephony.refusesConnections = true;
  link.report.trouble = "No server is in /run/varnel";
  launch();
  queue.advance(3s - 1ms);
  EXPECT_EQ(stack().notice, "");
  queue.advance(1ms);
  EXPECT_EQ(stack().notice, "No server is in /run/varnel");
  EXPECT_EQ(pane().toolbarText(), "[wheel] [Connecting] [space]");
}

TEST_F(VarnelAppTest, TheNoticeTellsHowToStartADisplayThatStandsStill) {
  launchWith(1);
  ports.invalidateLocalPort(channel);
  EXPECT_EQ(
      stack().notice,
      "The display stands still since 2024-03-01 at 14:05:09, when the link was opened anew; press Ctrl+R "
      "to start over");
  app.startOver();
  EXPECT_EQ(stack().notice, "");
}

TEST_F(VarnelAppTest, TheNoticeTellsWhereASnapshotWasSaved) {
  files.existing = {marker};
  launchWith(1);
  for (const char* outcome : {"", ", in place of the snapshot of the same second"}) {
    pane().pressSave();
    stack().screen().press("Save");
    queue.run();
    EXPECT_EQ(stack().notice,
              "Saved: /var/mobile/Library/Logs/CrashReporter/VarnelSnapshot-1709294709.varnel" +
                  std::string(outcome));
  }
}

TEST_F(VarnelAppTest, StatusAndSnapshotsHaveTheTimeOfTheUsersClock) {
  FakeClock users;
  users.set({1709298309, 0});
  users.setZone({7200, false});
  RecordingUserInterface otherInterface;
  VarnelApp other({.model = {ports, telephony, queue, host.services, writeXmlPropertyList, &link},
                   .files = files,
                   .preferences = preferences,
                   .userInterface = otherInterface,
                   .usersClock = &users});
  files.existing = {marker};
  other.applicationDidFinishLaunching();
  queue.run();
  receive(1);
  EXPECT_EQ(other.updateMessage(), "Updated 2024-03-01 at 15:05:09");
  other.save();
  EXPECT_EQ(otherInterface.stack->notice,
            "Saved: /var/mobile/Library/Logs/CrashReporter/VarnelSnapshot-1709298309.varnel");
}

TEST_F(VarnelAppTest, TheNoticeTellsWhyASnapshotWasNotSaved) {
  launchWith(1);
  app.save();
  EXPECT_THAT(stack().notice, testing::StartsWith("Not saved: this device allows no snapshots"));
  files.existing = {marker};
  files.refusesWrites = true;
  app.save();
  EXPECT_EQ(
      stack().notice,
      "Not saved: /var/mobile/Library/Logs/CrashReporter/VarnelSnapshot-1709294709.varnel: No space left "
      "on device");
}

TEST_F(VarnelAppTest, ASaveScreenWithoutDataSaysThatNothingHasArrivedYet) {
  files.existing = {marker};
  launch();
  pane().pressSave();
  EXPECT_TRUE(stack().isPresenting());
  EXPECT_EQ(stack().notice, "Nothing has arrived yet: a snapshot saved now is empty");
}

TEST_F(VarnelAppTest, SaveOpensOneScreenHoweverOftenItIsPressed) {
  files.existing = {marker};
  launchWith(1);
  userInterface.events.clear();
  pane().pressSave();
  pane().pressSave();
  EXPECT_THAT(userInterface.events, ElementsAre("present animated"));
  EXPECT_TRUE(stack().isPresenting());
  EXPECT_TRUE(app.saveViewController());
}

TEST_F(VarnelAppTest, TheSaveScreenListsTheModelsSaveContents) {
  files.existing = {marker};
  launchWith(1);
  pane().pressSave();
  const RecordingTable& table = stack().screen().tables.at("saveContentTable");
  ASSERT_EQ(table.rows(), 2u);
  EXPECT_EQ(table.cellView(0).text, "Snapshot (2024-03-01 12:05:09 +0000)");
}

TEST_F(VarnelAppTest, BeforeAnythingArrivesTheSaveScreenIsEmpty) {
  files.existing = {marker};
  launch();
  pane().pressSave();
  EXPECT_EQ(stack().screen().tables.at("saveContentTable").rows(), 0u);
}

TEST_F(VarnelAppTest, SavingWritesTheSnapshotAndClosesTheScreenAfterwards) {
  files.existing = {marker};
  launchWith(1);
  pane().pressSave();
  userInterface.events.clear();
  stack().screen().fields.at("saveDescription").typed = "in the lift";
  stack().screen().press("Save");
  ASSERT_THAT(files.writes, SizeIs(1));
  EXPECT_EQ(files.writes[0].path, "/var/mobile/Library/Logs/CrashReporter/VarnelSnapshot-1709294709.varnel");
  EXPECT_EQ(*files.writes[0].list.dictionary()->get("Description").string(), "in the lift");
  EXPECT_TRUE(stack().isPresenting()) << "the button's action has yet to return";
  queue.run();
  EXPECT_FALSE(stack().isPresenting());
  EXPECT_FALSE(app.saveViewController());
  EXPECT_THAT(userInterface.events, ElementsAre("dismiss animated"));
}

TEST_F(VarnelAppTest, PacketsThatArriveWhileTheScreenIsOpenAreNotSaved) {
  files.existing = {marker};
  launchWith(2);
  pane().pressSave();
  receive(1);
  stack().screen().press("Save");
  ASSERT_THAT(files.writes, SizeIs(1));
  const Array& data = *files.writes[0].list.dictionary()->get("Data").array();
  ASSERT_THAT(data, SizeIs(2)) << "one display and the binary log";
  const Dictionary& saved = *data[0].dictionary()->get("Display").dictionary();
  EXPECT_THAT(*saved.get("PDP Context Info").array(), SizeIs(2));
}

TEST_F(VarnelAppTest, AFailureIsAlertedAndTheScreenStillCloses) {
  files.existing = {marker};
  files.refusesWrites = true;
  launchWith(1);
  pane().pressSave();
  userInterface.events.clear();
  stack().screen().press("Save");
  queue.run();
  EXPECT_THAT(userInterface.events,
              ElementsAre("alert File Error: Unable to write file to disk [Close]", "dismiss animated"));
}

TEST_F(VarnelAppTest, CancellingClosesTheScreenAndItOpensAgain) {
  files.existing = {marker};
  launchWith(1);
  pane().pressSave();
  stack().screen().press("Cancel");
  queue.run();
  EXPECT_FALSE(stack().isPresenting());
  EXPECT_THAT(files.writes, IsEmpty());
  pane().pressSave();
  EXPECT_TRUE(stack().isPresenting());
}

TEST_F(VarnelAppTest, PressingSaveTwiceOnTheScreenClosesItOnce) {
  files.existing = {marker};
  launchWith(1);
  pane().pressSave();
  userInterface.events.clear();
  stack().screen().press("Save");
  stack().screen().press("Save");
  queue.run();
  EXPECT_THAT(userInterface.events, ElementsAre("dismiss animated"));
}

TEST_F(VarnelAppTest, ClosingWithoutASaveScreenDoesNothing) {
  launch();
  userInterface.events.clear();
  app.closeSaveView();
  EXPECT_THAT(userInterface.events, IsEmpty());
}

TEST_F(VarnelAppTest, WithoutItsInterfaceResourceTheSaveScreenStaysClosed) {
  files.existing = {marker};
  host.resources.add("VarnelSaveViewController", Value("no layout"));
  launchWith(1);
  pane().pressSave();
  EXPECT_FALSE(stack().isPresenting());
  EXPECT_FALSE(app.saveViewController());
}

TEST_F(VarnelAppTest, TheScreenIsClosedByNobodyOnceTheApplicationIsGone) {
  FakeQueue later;
  {
    VarnelApp other{
        {{ports, telephony, later, host.services, writeXmlPropertyList}, files, preferences, userInterface}};
    other.applicationDidFinishLaunching();
    other.showSaveView();
    stack().screen().press("Cancel");
  }
  userInterface.events.clear();
  later.run();
  EXPECT_THAT(userInterface.events, IsEmpty());
}

TEST_F(VarnelAppTest, TheEndWritesThePreferenceSynchronisesAndNotifies) {
  launchWith(1);
  EXPECT_THAT(preferences.events, IsEmpty());
  app.applicationWillTerminate();
  EXPECT_THAT(preferences.events,
              ElementsAre("set com.orvane.dockhall DHShowGSMRSSI false", "synchronise com.orvane.dockhall",
                          "notify com.orvane.dockhall DHShowGSMRSSI"));
}

TEST_F(VarnelAppTest, TheEndTakesTheWindowOffTheScreenAndClosesTheLink) {
  launchWith(1);
  userInterface.events.clear();
  app.applicationWillTerminate();
  EXPECT_THAT(userInterface.events, ElementsAre("window hidden", "window destroyed"));
  EXPECT_FALSE(app.window());
  EXPECT_FALSE(app.updateMessage());
  EXPECT_FALSE(ports.hasLocalPort(channel));
  EXPECT_EQ(queue.liveTimers(), 0u);
}

TEST_F(VarnelAppTest, TheEndForgetsTheSaveScreen) {
  files.existing = {marker};
  launchWith(1);
  pane().pressSave();
  stack().screen().press("Save");
  app.applicationWillTerminate();
  EXPECT_FALSE(app.saveViewController());
  queue.advance(10s);
  EXPECT_FALSE(app.saveViewController());
}

TEST_F(VarnelAppTest, ARefreshThatIsUnderWayAtTheEndDoesNothing) {
  launchWith(1);
  ports.deliver(channel, 0, contexts(2));
  queue.advance(2s - 1ms);
  app.applicationWillTerminate();
  const unsigned reloads = pane().table().reloads;
  queue.advance(10s);
  EXPECT_EQ(pane().table().reloads, reloads);
}

TEST_F(VarnelAppTest, PanesThatAreTouchedAfterTheEndDoNoHarm) {
  files.existing = {marker};
  launchWith(1);
  app.applicationWillTerminate();
  pane().pressSave();
  pane().table().select(0);
  EXPECT_FALSE(app.saveViewController());
  EXPECT_EQ(pane().toolbarText(), "[wheel] [Connecting...] [space] [Save]");
}

TEST_F(VarnelAppTest, TheEndBeforeLaunchOnlyWritesThePreference) {
  app.applicationWillTerminate();
  EXPECT_THAT(preferences.events, SizeIs(3));
  EXPECT_THAT(userInterface.events, IsEmpty());
}

TEST_F(VarnelAppTest, LaunchedAgainAfterItsEndItBeginsAnew) {
  launchWith(2);
  openContext(1);
  app.applicationWillTerminate();
  files.existing = {marker};
  launch();
  ASSERT_THAT(stack().controllers(), SizeIs(1));
  EXPECT_EQ(pane().table().rows(), 0u);
  EXPECT_EQ(pane().toolbarText(), "[wheel] [Connecting] [space] [Save]");
  queue.run();
  receive(1);
  EXPECT_EQ(pane().table().rows(), 2u);
  EXPECT_EQ(telephony.attempts, 2u);
}

TEST_F(VarnelAppTest, StartingOverGoesBackToAnEmptyRootInTheSameWindow) {
  launchWith(2);
  openContext(1);
  app.startOver();
  ASSERT_THAT(stack().controllers(), SizeIs(1));
  EXPECT_EQ(pane().table().rows(), 0u);
  EXPECT_EQ(pane().title, "Varnel");
  EXPECT_EQ(pane().toolbarText(), "[wheel] [Connecting] [space]");
  EXPECT_EQ(app.updateMessage(), "Connecting...");
  EXPECT_THAT(userInterface.events, testing::Not(testing::Contains("window made")));
  EXPECT_THAT(preferences.events, IsEmpty());
  queue.run();
  receive(1);
  EXPECT_EQ(pane().table().rows(), 2u);
  EXPECT_EQ(telephony.attempts, 2u);
}

TEST_F(VarnelAppTest, StartingOverClosesTheSaveScreen) {
  files.existing = {marker};
  launchWith(1);
  pane().pressSave();
  ASSERT_TRUE(app.saveViewController());
  app.startOver();
  EXPECT_FALSE(app.saveViewController());
}

TEST_F(VarnelAppTest, StartingOverInPlaceKeepsThePanesAndTheirRowsUntilTheNextDisplay) {
  launchWith(2);
  openContext(1);
  app.startOverInPlace();
  EXPECT_EQ(path(), "/PDP Context Info/1");
  EXPECT_EQ(pane().table().rows(), 1u);
  EXPECT_EQ(pane().toolbarText(), connecting);
  queue.run();
  EXPECT_EQ(telephony.attempts, 2u);
  EXPECT_EQ(pane().toolbarText(), updated);
  receive(3);
  EXPECT_EQ(path(), "/PDP Context Info/1");
  stack().goBack();
  EXPECT_EQ(pane().table().rows(), 3u) << "of the new model";
}

TEST_F(VarnelAppTest, APaneThatTheNewDisplayLacksIsOpenedWhenALaterOneHasIt) {
  launchWith(2);
  openContext(1);
  app.startOverInPlace();
  queue.run();
  receive(1);
  EXPECT_EQ(path(), "/PDP Context Info");
  receive(2);
  EXPECT_EQ(path(), "/PDP Context Info/1");
  receive(1);
  EXPECT_EQ(path(), "/PDP Context Info");
  receive(2);
  EXPECT_EQ(path(), "/PDP Context Info") << "it was opened again once";
}

TEST_F(VarnelAppTest, APaneIsNotOpenedAgainForAUserWhoHasGoneElsewhere) {
  launchWith(2);
  openContext(1);
  app.startOverInPlace();
  queue.run();
  receive(1);
  ASSERT_EQ(path(), "/PDP Context Info");
  stack().goBack();
  receive(2);
  EXPECT_EQ(path(), "/");
}

TEST_F(VarnelAppTest, ADisplayThatIsGivenIsShownWithoutALink) {
  launchWith(1);
  openContext(0);
  app.showDisplay(dictionaryOf({{"PDP Context Info", Value::ofArray({dictionaryOf({{"APN", "ims"}})})}}),
                  "Saved yesterday");
  EXPECT_FALSE(app.isConnected());
  EXPECT_TRUE(app.hasDisplay());
  EXPECT_EQ(path(), "/PDP Context Info/0");
  EXPECT_EQ(pane().table().rows(), 1u);
  EXPECT_EQ(pane().toolbarText(), "[hidden wheel] [Saved yesterday] [space]");
  queue.advance(1min);
  EXPECT_EQ(telephony.attempts, 1u);
  EXPECT_EQ(stack().notice, "");
  app.startOver();
  EXPECT_FALSE(app.hasDisplay());
  EXPECT_EQ(pane().toolbarText(), "[wheel] [Connecting] [space]");
  queue.run();
  EXPECT_EQ(telephony.attempts, 2u);
}

TEST_F(VarnelAppTest, ADisplayThatIsGivenHasItsOwnFormats) {
  launchWith(1);
  NumberFormats formats;
  formats.add("Cells", "RSRP", integer("about %d dBm"));
  const auto number = [&] { return app.recordsAt({"Cells"}).value().records.at(0).cells.at(0).number; };
  const Value display =
      dictionaryOf({{"Cells", Value::ofArray({dictionaryOf({{"RSRP", "about -93 dBm"}})})}});
  app.showDisplay(display, "Saved yesterday", formats);
  EXPECT_EQ(number(), -93.0);
  app.showDisplay(display, "Saved yesterday");
  EXPECT_EQ(number(), std::nullopt);
}

TEST_F(VarnelAppTest, ADisplayThatIsGivenIsNotSavedAgain) {
  files.existing = {marker};
  launch();
  app.showDisplay(dictionaryOf({{"Cell", Value::ofDictionary()}}), "Saved yesterday");
  pane().pressSave();
  EXPECT_FALSE(app.saveViewController());
  EXPECT_EQ(stack().notice, "Not saved: what is shown comes from a snapshot");
  app.save();
  EXPECT_THAT(files.writes, IsEmpty());
  queue.advance(30s);
  EXPECT_EQ(stack().notice, "");
}

TEST_F(VarnelAppTest, TellsItsObserverOfLinkAndDisplay) {
  std::string seen;
  app.setObserver([&] { seen += app.hasDisplay() ? 'd' : app.isConnected() ? 'c' : '-'; });
  telephony.refusesConnections = true;
  launch();
  queue.run();
  EXPECT_EQ(seen, "-");
  telephony.refusesConnections = false;
  queue.advance(5s);
  EXPECT_EQ(seen, "-c");
  receive(1);
  EXPECT_EQ(seen, "-cd");
}

TEST_F(VarnelAppTest, ShowsWhatHasArrivedWhenItIsAskedTo) {
  launchWith(1);
  ports.deliver(channel, 0, contexts(2));
  app.refresh();
  queue.run();
  openContext(0);
  stack().goBack();
  EXPECT_EQ(pane().table().rows(), 2u);
}

TEST_F(VarnelAppTest, StartingOverAndSavingDoNothingWhileNotLaunched) {
  app.startOver();
  app.startOverInPlace();
  app.showDisplay(Value::ofDictionary(), "");
  app.refresh();
  app.save();
  EXPECT_EQ(queue.waitingTasks(), 0u);
  EXPECT_THAT(files.writes, IsEmpty());
}

TEST_F(VarnelAppTest, SavesASnapshotWithAnEmptyDescriptionWhereTheDeviceAllowsIt) {
  launchWith(1);
  app.save();
  EXPECT_THAT(files.writes, IsEmpty());
  files.existing = {marker};
  app.save();
  ASSERT_THAT(files.writes, SizeIs(1));
  EXPECT_EQ(*files.writes[0].list.dictionary()->get("Description").string(), "");
  EXPECT_FALSE(app.saveViewController()) << "without the save screen";
}

TEST_F(VarnelAppTest, CallsTheTaskOnceWhenThatManyRefreshesHaveBeenShown) {
  std::vector<std::string> statuses;
  app.afterUpdates(2, [&] { statuses.push_back(pane().toolbarText()); });
  launchWith(1);
  EXPECT_THAT(statuses, IsEmpty());
  receive(1);
  receive(1);
  EXPECT_THAT(statuses, ElementsAre(updated));
}

// ---- The value history ----

TEST_F(VarnelAppTest, EachRefreshGoesIntoTheHistoryBeforeThePanesShowIt) {
  launch();
  queue.run();
  ports.deliver(channel, 0, PacketBuilder(0xB0C2, 38).bytes());
  queue.advance(2s);
  host.clock.set({1709294711, 0});
  ports.deliver(channel, 0, PacketBuilder(0xB0C2, 38).bytes());
  queue.advance(2s);
  const auto series = history.seriesOfKey("/Serving Cell Info/Physical Cell ID");
  ASSERT_TRUE(series);
  const auto samples = history.samples(*series, history.whole());
  ASSERT_EQ(samples.size(), 2u);
  EXPECT_EQ(samples[1].time, (Time{1709294711, 0}));
  EXPECT_TRUE(samples[1].isRenewed);
}

TEST_F(VarnelAppTest, TheHistoryKnowsTheUnitsOfTheModemsTechnology) {
  host.resources.add("LTE", dictionaryOf({{"Serving Cell Measurements", Value::ofDictionary()}}));
  launch();
  queue.run();
  ports.deliver(channel, 0, PacketBuilder(0xB17F, 33).bytes());
  queue.advance(2s);
  const auto series = history.seriesOfKey("/Serving Cell Measurements/Average RSRP");
  ASSERT_TRUE(series);
  EXPECT_EQ(history.unit(*series), "dBm");
}

TEST_F(VarnelAppTest, StartingOverForgetsTheHistory) {
  launch();
  queue.run();
  ports.deliver(channel, 0, PacketBuilder(0xB0C2, 38).bytes());
  queue.advance(2s);
  ASSERT_FALSE(history.series().empty());
  app.startOver();
  EXPECT_TRUE(history.series().empty());
}

TEST_F(VarnelAppTest, WithoutALinkTheRowsOfAllPanesAreDimmedWithoutAReload) {
  RowAnswers answers(host.resources, host.clock, history);
  VarnelApp viewer{{.model = {ports, telephony, queue, host.services, writeXmlPropertyList, &link},
                    .files = files,
                    .preferences = preferences,
                    .userInterface = userInterface,
                    .answers = &answers}};
  viewer.applicationDidFinishLaunching();
  queue.run();
  receive(1);
  const auto dimming = [this] {
    const auto shown = stack().controllers().front();
    return static_cast<RecordingPane&>(shown->pane()).table().cellView(0).facts.dimming;
  };
  pane().table().select(0);
  EXPECT_EQ(dimming(), CellDimming::None);
  const unsigned reloads = pane().table().reloads;
  loseTheLink();
  EXPECT_EQ(dimming(), CellDimming::All);
  EXPECT_EQ(pane().table().cellView(0).facts.dimming, CellDimming::All);
  EXPECT_EQ(pane().table().reloads, reloads);
}

TEST_F(VarnelAppTest, AValueThatNoPacketRenewsIsDimmedAfterAMinute) {
  RowAnswers answers(host.resources, host.clock, history);
  VarnelApp viewer{{.model = {ports, telephony, queue, host.services, writeXmlPropertyList, &link},
                    .files = files,
                    .preferences = preferences,
                    .userInterface = userInterface,
                    .answers = &answers}};
  viewer.applicationDidFinishLaunching();
  queue.run();
  receive(1);
  openContext(0);
  const auto dimming = [this] { return pane().table().cellView(0).facts.dimming; };
  EXPECT_EQ(dimming(), CellDimming::None);
  host.clock.set({1709294709 + 60, 0});
  queue.advance(2s);
  EXPECT_EQ(dimming(), CellDimming::Value);
}

TEST_F(VarnelAppTest, WhatTheHistoryHadToForgetIsInTheNotice) {
  ValueHistory small({}, {.bytes = 1000});
  VarnelApp viewer{{.model = {ports, telephony, queue, host.services, writeXmlPropertyList, &link},
                    .files = files,
                    .preferences = preferences,
                    .userInterface = userInterface,
                    .history = &small}};
  viewer.applicationDidFinishLaunching();
  queue.run();
  ports.deliver(channel, 0, PacketBuilder(0xB0C2, 38).bytes());
  queue.advance(2s);
  EXPECT_EQ(stack().notice,
            "The courses of all values do not fit into 0 MiB: those of the values that were silent longest "
            "are gone");
}

TEST_F(VarnelAppTest, ObserversLearnOfEachRefreshAndOfStartingOver) {
  std::vector<std::size_t> found;
  app.observeDisplay([&] { found.push_back(app.find("internet").size()); });
  launchWith(1);
  EXPECT_THAT(found, ElementsAre(1u));
  receive(2);
  EXPECT_THAT(found, ElementsAre(1u, 2u)) << "the panes show the new display already";
  app.startOver();
  EXPECT_THAT(found, ElementsAre(1u, 2u, 0u));
}

}  // namespace
}  // namespace varnel
