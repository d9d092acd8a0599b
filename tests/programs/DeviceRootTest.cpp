#include "programs/varnel/DeviceRoot.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <fstream>

#include "tests/support/Process.h"

namespace varnel {
namespace {

namespace fs = std::filesystem;

constexpr const char* marker = "OrvaneInternal/Library/PreferenceBundles/Carrier Settings.bundle";
constexpr const char* logs = "var/mobile/Library/Logs/CrashReporter";

class DeviceRootTest : public testing::Test {
 protected:
  void SetUp() override { ::setenv("XDG_STATE_HOME", _state.path().c_str(), 1); }
  void TearDown() override { ::unsetenv("XDG_STATE_HOME"); }

  TemporaryFolder _machine;
  TemporaryFolder _state;
};

TEST_F(DeviceRootTest, IsTheFolderThatTheUserNamesAndNothingIsMadeThere) {
  const TemporaryFolder named;
  const DeviceRoot root = deviceRoot(named.path().string(), _machine.path());
  EXPECT_EQ(root.folder, named.path());
  EXPECT_EQ(root.failure, "");
  EXPECT_TRUE(fs::is_empty(named.path()));
  EXPECT_TRUE(fs::is_empty(_state.path()));
}

TEST_F(DeviceRootTest, IsTheMachineWhereThatIsADevice) {
  fs::create_directories(_machine.path() / marker);
  EXPECT_EQ(deviceRoot({}, _machine.path()).folder, _machine.path());
  EXPECT_FALSE(fs::exists(_machine.path() / logs));
  EXPECT_TRUE(fs::is_empty(_state.path()));
}

TEST_F(DeviceRootTest, IsElseTheStateFolderWithMarkerAndSnapshotFolder) {
  for (int start = 0; start < 2; ++start) {
    const DeviceRoot root = deviceRoot({}, _machine.path());
    EXPECT_EQ(root.folder, _state.path() / "varnel");
    EXPECT_EQ(root.failure, "");
    EXPECT_TRUE(fs::is_directory(_state.path() / "varnel" / marker));
    EXPECT_TRUE(fs::is_directory(_state.path() / "varnel" / logs));
  }
  EXPECT_EQ(fs::status(_state.path() / "varnel").permissions(), fs::perms::owner_all);
  EXPECT_TRUE(fs::is_empty(_machine.path()));
}

TEST_F(DeviceRootTest, SaysWhyTheStateFolderCannotBeLaidOut) {
  std::ofstream(_state.path() / "varnel") << "in the way";
  const DeviceRoot root = deviceRoot({}, _machine.path());
  EXPECT_EQ(root.folder, _state.path() / "varnel");
  EXPECT_EQ(root.failure, "the folder for snapshots cannot be made in " +
                              (_state.path() / "varnel").string() + ": Not a directory");
}

TEST_F(DeviceRootTest, IsTheMachineForWhomHasNoHome) {
  ::unsetenv("XDG_STATE_HOME");
  const std::string home = std::getenv("HOME") ? std::getenv("HOME") : "";
  ::unsetenv("HOME");
  const DeviceRoot root = deviceRoot({}, _machine.path());
  ::setenv("HOME", home.c_str(), 1);
  EXPECT_EQ(root.folder, _machine.path());
  EXPECT_EQ(root.failure, "the environment names no home, so there is no folder for snapshots");
}

}  // namespace
}  // namespace varnel
