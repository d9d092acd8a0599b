#include "app/VarnelSaveViewController.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include "base/PropertyList.h"
#include "host/FileResources.h"
#include "host/RootedFiles.h"
#include "host/WholeFile.h"
#include "tests/support/Describe.h"
#include "tests/support/DictionaryOf.h"
#include "tests/support/FakeClock.h"
#include "tests/support/FakeResources.h"
#include "tests/support/FakeSaveControl.h"
#include "tests/support/Process.h"
#include "tests/support/RecordingLog.h"
#include "tests/support/RecordingUserInterface.h"

namespace varnel {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

namespace fs = std::filesystem;

constexpr const char* failedToWrite =
    "<3>Unable to write snapshot to /var/mobile/Library/Logs/CrashReporter/VarnelSnapshot-1709301909.varnel";
constexpr const char* alert = "alert File Error: Unable to write file to disk [Close]";

// The shipped screen on a device with its own folder. It opens at 14:05:07 and is used at 14:05:09.
class SaveScreen : public testing::Test {
 protected:
  SaveScreen() {
    fs::create_directories(folder());
    clock.set({1709301907, 0});
  }

  void open(const Value& saveHistory) {
    controller = VarnelSaveViewController::initWithSaveHistory(host, saveHistory);
    ASSERT_TRUE(controller);
    controller->viewDidLoad();
    controller->viewWillAppear(Animation::Animated);
    table().appear();
    clock.set({1709301909, 500000000});
  }
  void open() {
    open(Value::ofArray({dictionaryOf({{"DisplayState", Value::ofData({1, 2})},
                                       {"Description", "Snapshot (2024-03-01 14:05:06 +0000)"}}),
                         dictionaryOf({{"Description", "DLF binary (162 bytes)"}})}));
  }
  RecordingModalScreen& screen() const { return static_cast<RecordingModalScreen&>(controller->screen()); }
  RecordingTable& table() const { return screen().tables.at("saveContentTable"); }
  RecordingTextField& field() const { return screen().fields.at("saveDescription"); }

  fs::path folder() const { return device.path() / "var/mobile/Library/Logs/CrashReporter"; }
  std::string saved(const std::string& name = "VarnelSnapshot-1709301909.varnel") const {
    const auto bytes = readWholeFile(folder() / name);
    const auto list = bytes ? readPropertyList(*bytes) : std::nullopt;
    return list ? described(*list) : "nothing";
  }
  std::size_t filesSaved() const {
    return static_cast<std::size_t>(std::distance(fs::directory_iterator(folder()), {}));
  }

  RecordingLog log;
  TemporaryFolder device;
  RootedFiles files{device.path()};
  const FileResources resources{resourceFolder()};
  FakeClock clock;
  FakeSaveControl saveControl;
  RecordingUserInterface userInterface;
  const VarnelSaveViewController::Host host{userInterface, resources, files, clock, saveControl};
  std::shared_ptr<VarnelSaveViewController> controller;
};

TEST_F(SaveScreen, HasATableAFieldAndTheTwoButtons) {
  open();
  EXPECT_EQ(controller->saveContentTable(), &table());
  EXPECT_EQ(controller->saveDescription(), &field());
  screen().press("Save");
  screen().press("Cancel");
  EXPECT_EQ(saveControl.closings, 2u);
}

TEST_F(SaveScreen, WithoutItsInterfaceResourceThereIsNone) {
  FakeResources none;
  EXPECT_FALSE(VarnelSaveViewController::initWithSaveHistory({userInterface, none, files, clock, saveControl},
                                                             Value::ofArray()));
  EXPECT_THAT(none.requests(), ElementsAre("VarnelSaveViewController"));
  EXPECT_THAT(log.takeTexts(),
              ElementsAre("<3>Could not load the interface resource VarnelSaveViewController"));
}

TEST_F(SaveScreen, AnOutletThatTheResourceLacksIsNotUsed) {
  FakeResources bare;
  bare.add("VarnelSaveViewController",
           dictionaryOf({{"Rows", Value::ofArray()}, {"BackgroundAction", "backgroundTouched:"}}));
  controller = VarnelSaveViewController::initWithSaveHistory({userInterface, bare, files, clock, saveControl},
                                                             Value::ofArray());
  ASSERT_TRUE(controller);
  clock.set({1709301909, 0});
  controller->viewDidLoad();
  screen().touchBackground();
  controller->savePressed();
  EXPECT_EQ(saved(), "{Timestamp: \"2024-03-01 14:05:07 +0000\", Data: []}");
}

TEST_F(SaveScreen, LoadedItListensToTheFieldAndSizesTheTable) {
  controller = VarnelSaveViewController::initWithSaveHistory(host, Value::ofArray());
  EXPECT_EQ(field().delegate, nullptr);
  EXPECT_FALSE(table().isSizedToFit);
  controller->viewDidLoad();
  EXPECT_EQ(field().delegate, controller.get());
  EXPECT_TRUE(table().isSizedToFit);
}

TEST_F(SaveScreen, AppearingItTakesTheScreenLessTheStatusBar) {
  open();
  EXPECT_EQ(screen().frame, (Rect{0, 20, 320, 460}));
}

TEST_F(SaveScreen, ListsTheDescriptionsOfTheEntriesEachWithACheckMark) {
  open();
  EXPECT_EQ(controller->numberOfSectionsInTableView(table()), 1u);
  ASSERT_EQ(table().rows(), 2u);
  EXPECT_EQ(table().cellView(0).text, "Snapshot (2024-03-01 14:05:06 +0000)");
  EXPECT_EQ(table().cellView(1).text, "DLF binary (162 bytes)");
  for (const std::size_t row : {0u, 1u}) {
    EXPECT_EQ(table().cellView(row).accessory, CellAccessory::Checkmark);
    EXPECT_EQ(table().cellView(row).textFont, Font::named("Helvetica", 13));
    EXPECT_EQ(table().cellView(row).style, CellStyle::Default);
    EXPECT_EQ(table().cell(row).reuseIdentifier(), "SaveHistoryContentCell");
  }
}

TEST_F(SaveScreen, UsesItsCellsAgain) {
  open();
  table().reloadData();
  EXPECT_EQ(table().cellsMade, 2u);
  EXPECT_EQ(table().cellView(1).text, "DLF binary (162 bytes)");
}

TEST_F(SaveScreen, AnEntryWithoutADescriptionIsAnEmptyRow) {
  open(Value::ofArray({dictionaryOf({}), Value("no entry")}));
  EXPECT_EQ(table().cellView(0).text, "");
  EXPECT_EQ(table().cellView(1).text, "");
}

TEST_F(SaveScreen, WithoutSaveContentsTheTableIsEmpty) {
  open(Value());
  EXPECT_EQ(table().rows(), 0u);
}

TEST_F(SaveScreen, SelectingARowOnlyHidesTheKeyboard) {
  open();
  table().select(0);
  EXPECT_EQ(field().resignations, 1u);
  EXPECT_EQ(table().cellView(0).accessory, CellAccessory::Checkmark);
  EXPECT_THAT(table().deselections, IsEmpty());
}

TEST_F(SaveScreen, TouchingTheBackgroundHidesTheKeyboard) {
  open();
  screen().touchBackground();
  EXPECT_EQ(field().resignations, 1u);
  EXPECT_EQ(saveControl.closings, 0u);
}

TEST_F(SaveScreen, TheReturnKeyHidesTheKeyboardAndDoesItsOwn) {
  open();
  EXPECT_TRUE(field().delegate->textFieldShouldReturn(field()));
  EXPECT_EQ(field().resignations, 1u);
}

TEST_F(SaveScreen, SaveWritesTimestampDataAndDescription) {
  open();
  field().typed = "in the lift";
  screen().press("Save");
  EXPECT_EQ(saved(),
            "{Timestamp: \"2024-03-01 14:05:07 +0000\", "
            "Data: [{DisplayState: <0102>, Description: \"Snapshot (2024-03-01 14:05:06 +0000)\"}, "
            "{Description: \"DLF binary (162 bytes)\"}], "
            "Description: \"in the lift\"}");
  EXPECT_EQ(filesSaved(), 1u);
  EXPECT_EQ(saveControl.closings, 1u);
  EXPECT_THAT(userInterface.events, IsEmpty());
  EXPECT_THAT(log.takeTexts(), IsEmpty());
}

TEST_F(SaveScreen, TheFileIsForItsOwnerAlone) {
  open();
  screen().press("Save");
  EXPECT_EQ(fs::status(folder() / "VarnelSnapshot-1709301909.varnel").permissions(), fs::perms(0600));
}

TEST_F(SaveScreen, AnEmptyDescriptionIsSavedAsTheEmptyString) {
  open(Value::ofArray());
  screen().press("Save");
  EXPECT_EQ(saved(), "{Timestamp: \"2024-03-01 14:05:07 +0000\", Data: [], Description: \"\"}");
}

TEST_F(SaveScreen, AFieldWithoutATextSavesNoDescription) {
  open(Value::ofArray());
  field().typed.reset();
  screen().press("Save");
  EXPECT_EQ(saved(), "{Timestamp: \"2024-03-01 14:05:07 +0000\", Data: []}");
}

TEST_F(SaveScreen, WhatChangesWhileItIsOpenIsNotSaved) {
  const Value section = dictionaryOf({{"RSSI", "-71 dBm"}});
  const Value list = Value::ofArray({dictionaryOf({{"ID", "1"}})});
  const Value history =
      Value::ofArray({dictionaryOf({{"Display", dictionaryOf({{"Cell", section}, {"List", list}})}})});
  open(history);
  section.dictionary()->set("RSSI", "-99 dBm");
  list.array()->clear();
  history.array()->push_back(dictionaryOf({}));
  EXPECT_EQ(table().rows(), 1u);
  screen().press("Save");
  EXPECT_EQ(saved(),
            "{Timestamp: \"2024-03-01 14:05:07 +0000\", "
            "Data: [{Display: {Cell: {RSSI: \"-71 dBm\"}, List: [{ID: \"1\"}]}}], Description: \"\"}");
}

TEST_F(SaveScreen, SavingTwiceWithinASecondReplacesTheFile) {
  open();
  field().typed = "first";
  screen().press("Save");
  open(Value::ofArray());
  field().typed = "second";
  screen().press("Save");
  EXPECT_EQ(filesSaved(), 1u);
  EXPECT_EQ(saved(), "{Timestamp: \"2024-03-01 14:05:09 +0000\", Data: [], Description: \"second\"}");
}

TEST_F(SaveScreen, CancelWritesNothingAndCloses) {
  open();
  screen().press("Cancel");
  EXPECT_EQ(filesSaved(), 0u);
  EXPECT_EQ(saveControl.closings, 1u);
}

TEST_F(SaveScreen, AMissingFolderIsLoggedAndAlertedAndStillCloses) {
  fs::remove(folder());
  open();
  screen().press("Save");
  EXPECT_THAT(log.takeTexts(), ElementsAre(failedToWrite));
  EXPECT_THAT(userInterface.events, ElementsAre(alert));
  EXPECT_EQ(saveControl.closings, 1u);
  EXPECT_FALSE(fs::exists(folder())) << "it is not made";
}

TEST_F(SaveScreen, AReadOnlyFolderIsLoggedAndAlertedAndStillCloses) {
  if (::geteuid() == 0) {
    // Root may write to every folder except those of the kernel.
    fs::remove(folder());
    fs::create_symlink("/proc/self/fdinfo", folder());
  } else {
    fs::permissions(folder(), fs::perms(0500));
  }
  open();
  screen().press("Save");
  EXPECT_THAT(log.takeTexts(), ElementsAre(failedToWrite));
  EXPECT_THAT(userInterface.events, ElementsAre(alert));
  EXPECT_EQ(saveControl.closings, 1u);
  if (::geteuid() != 0) fs::permissions(folder(), fs::perms(0700));
}

TEST_F(SaveScreen, ItsOutletsCanBeSet) {
  open();
  controller->setSaveDescription(nullptr);
  controller->setSaveContentTable(nullptr);
  EXPECT_EQ(controller->saveDescription(), nullptr);
  EXPECT_EQ(controller->saveContentTable(), nullptr);
  table().select(0);
  EXPECT_EQ(field().resignations, 0u);
}

}  // namespace
}  // namespace varnel
