#include "app/Snapshot.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tests/support/DictionaryOf.h"
#include "tests/support/FakeClock.h"
#include "tests/support/FakeDeviceFiles.h"
#include "tests/support/RecordingLog.h"

namespace varnel {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

// Nearly a second after 2024-03-01 14:05:09 UTC.
constexpr Time friday{1709301909, 999999999};

Value saveContents() {
  return Value::ofArray({dictionaryOf({{"Description", "Snapshot (2024-03-01 14:05:08 +0000)"}})});
}

TEST(Snapshot, TheMarkerOfInternalDevices) {
  EXPECT_EQ(internalDeviceMarker, "/OrvaneInternal/Library/PreferenceBundles/Carrier Settings.bundle");
}

TEST(Snapshot, HoldsTimestampDataAndDescriptionInThisOrder) {
  const Value contents = snapshotContents(friday, saveContents(), "in the lift");
  ASSERT_TRUE(contents.dictionary());
  std::vector<std::string> keys;
  for (const Dictionary::Entry& entry : *contents.dictionary()) keys.push_back(entry.key);
  EXPECT_THAT(keys, ElementsAre("Timestamp", "Data", "Description"));
}

TEST(Snapshot, TheTimestampIsTheMomentOfItsCreationInUTC) {
  const Value contents = snapshotContents(friday, saveContents(), "");
  EXPECT_EQ(*contents.dictionary()->get("Timestamp").string(), "2024-03-01 14:05:09 +0000");
}

TEST(Snapshot, TheDataAreTheSaveContents) {
  const Value contents = snapshotContents(friday, saveContents(), "");
  const Array* data = contents.dictionary()->get("Data").array();
  ASSERT_TRUE(data);
  ASSERT_EQ(data->size(), 1u);
  EXPECT_EQ(*data->front().dictionary()->get("Description").string(), "Snapshot (2024-03-01 14:05:08 +0000)");
}

TEST(Snapshot, WithoutSaveContentsTheDataAreEmpty) {
  const Value contents = snapshotContents(friday, Value(), "");
  const Array* data = contents.dictionary()->get("Data").array();
  ASSERT_TRUE(data);
  EXPECT_TRUE(data->empty());
}

TEST(Snapshot, TheDescriptionIsTheGivenText) {
  EXPECT_EQ(
      *snapshotContents(friday, saveContents(), "in the lift").dictionary()->get("Description").string(),
      "in the lift");
}

TEST(Snapshot, AnEmptyDescriptionIsAnEmptyText) {
  const Value contents = snapshotContents(friday, saveContents(), "");
  ASSERT_TRUE(contents.dictionary()->get("Description").string());
  EXPECT_EQ(*contents.dictionary()->get("Description").string(), "");
}

TEST(Snapshot, WithoutADescriptionThereIsNone) {
  EXPECT_FALSE(snapshotContents(friday, saveContents(), std::nullopt).dictionary()->has("Description"));
}

class SnapshotFile : public testing::Test {
 protected:
  SnapshotFile() { clock.set(friday); }
  FileWriting write() { return writeSnapshot(files, clock, contents); }

  RecordingLog log;
  FakeClock clock;
  FakeDeviceFiles files;
  const Value contents = snapshotContents({0, 0}, saveContents(), "");
};

TEST_F(SnapshotFile, IsNamedByTheWholeSecondsOfTheMomentOfWriting) {
  EXPECT_TRUE(write().isDone());
  ASSERT_EQ(files.writes.size(), 1u);
  EXPECT_EQ(files.writes[0].path, "/var/mobile/Library/Logs/CrashReporter/VarnelSnapshot-1709301909.varnel");
}

TEST_F(SnapshotFile, HoldsTheContents) {
  write();
  ASSERT_EQ(files.writes.size(), 1u);
  EXPECT_EQ(files.writes[0].list.dictionary(), contents.dictionary());
}

TEST_F(SnapshotFile, OfTheSameSecondIsTheSameFile) {
  write();
  clock.set({1709301909, 0});
  write();
  ASSERT_EQ(files.writes.size(), 2u);
  EXPECT_EQ(files.writes[0].path, files.writes[1].path);
}

TEST_F(SnapshotFile, ThatIsWrittenNeedsNoLine) {
  write();
  EXPECT_THAT(log.take(), IsEmpty());
}

TEST_F(SnapshotFile, ThatCannotBeWrittenIsLoggedWithItsPath) {
  files.refusesWrites = true;
  EXPECT_EQ(write().failure, "No space left on device");
  const auto lines = log.take();
  ASSERT_EQ(lines.size(), 1u);
  EXPECT_EQ(lines[0].priority, 3);
  EXPECT_EQ(
      lines[0].text,
      "Unable to write snapshot to /var/mobile/Library/Logs/CrashReporter/VarnelSnapshot-1709301909.varnel");
}

}  // namespace
}  // namespace varnel
