#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <memory>

#include "tests/support/Process.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;
using testing::HasSubstr;
using testing::Not;
using testing::StartsWith;

std::size_t occurrences(const std::string& text, const std::string& part) {
  std::size_t count = 0;
  for (std::size_t at = text.find(part); at != std::string::npos; at = text.find(part, at + part.size()))
    ++count;
  return count;
}

// A real server with a simulated LTE modem and real viewers, in a runtime folder of their own.
class EndToEnd : public testing::Test {
 protected:
  std::unique_ptr<Process> server() {
    return std::make_unique<Process>(
        VARNEL_TELEPHONYD_PROGRAM,
        std::vector<std::string>{"--simulate", "kalvi-lte", "--seed", "7", "--runtime-dir", _runtime.path()});
  }
  std::unique_ptr<Process> viewer(std::vector<std::string> more = {}) {
    std::vector<std::string> arguments{"--ui",          "text",         "--runtime-dir", _runtime.path(),
                                       "--device-root", _device.path(), "--log-level",   "3"};
    arguments.insert(arguments.end(), more.begin(), more.end());
    return std::make_unique<Process>(VARNEL_PROGRAM, arguments);
  }

  TemporaryFolder _runtime;
  TemporaryFolder _device;
};

const std::string streaming = "<3>Starting the display update timer\n";

TEST_F(EndToEnd, ALivingTreeAppears) {
  const auto telephony = server();
  const auto varnel = viewer({"--updates", "4"});
  ASSERT_TRUE(varnel->waitForEnd());
  EXPECT_EQ(varnel->exitStatus(), 0) << varnel->error();
  const std::string output = varnel->output();
  EXPECT_THAT(output, StartsWith("Connecting...\n"));
  EXPECT_EQ(occurrences(output, "Updated 20"), 4u);
  EXPECT_THAT(output, HasSubstr("Serving Cell Info\n"));
  EXPECT_THAT(output, HasSubstr("  Physical Cell ID"));
  EXPECT_THAT(output, HasSubstr("PDP Context Info\n"));
  EXPECT_THAT(output, testing::ContainsRegex("EF-ICCID +[0-9]"));
}

TEST_F(EndToEnd, AKilledServerIsNoticedAndItsReturnWithinFiveSeconds) {
  auto telephony = server();
  const auto varnel = viewer();
  ASSERT_TRUE(eventually([&] { return occurrences(varnel->error(), streaming) == 1; })) << varnel->error();
  telephony->signal(SIGKILL);
  ASSERT_TRUE(eventually([&] { return occurrences(varnel->error(), "<3> ***** INVALIDATED 0x") == 1; }, 5s));
  EXPECT_THAT(varnel->error(), HasSubstr("<3>Could not create the ports necessary\n"));
  telephony = server();
  EXPECT_TRUE(eventually([&] { return occurrences(varnel->error(), streaming) == 2; }, 6s))
      << varnel->error();
}

TEST_F(EndToEnd, AViewerWithoutAServerKeepsTrying) {
  const auto varnel = viewer();
  ASSERT_TRUE(eventually(
      [&] { return occurrences(varnel->error(), "<3>Could not create the ports necessary\n") == 1; }));
  const auto telephony = server();
  EXPECT_TRUE(eventually([&] { return occurrences(varnel->error(), streaming) == 1; }, 7s))
      << varnel->error();
}

TEST_F(EndToEnd, ASecondViewerWaitsForTheChannelName) {
  const auto telephony = server();
  auto first = viewer();
  ASSERT_TRUE(eventually([&] { return occurrences(first->error(), streaming) == 1; }));
  const auto second = viewer();
  ASSERT_TRUE(eventually(
      [&] { return occurrences(second->error(), "<3>Local messsage port already exists\n") == 1; }));
  first->signal(SIGTERM);
  ASSERT_TRUE(first->waitForEnd());
  EXPECT_EQ(first->exitStatus(), 0);
  EXPECT_TRUE(eventually([&] { return occurrences(second->error(), streaming) == 1; }, 7s))
      << second->error();
}

TEST_F(EndToEnd, StartingOverShowsALivingTreeAgain) {
  const auto telephony = server();
  const auto varnel = viewer();
  ASSERT_TRUE(eventually([&] { return occurrences(varnel->output(), "EF-ICCID") >= 1; }));
  varnel->signal(SIGUSR1);
  ASSERT_TRUE(eventually([&] { return occurrences(varnel->output(), "Connecting...\n") == 2; }));
  const std::size_t before = occurrences(varnel->output(), "EF-ICCID");
  EXPECT_TRUE(eventually([&] { return occurrences(varnel->output(), "EF-ICCID") > before; }))
      << varnel->error();
}

TEST_F(EndToEnd, ASnapshotIsSavedOnlyWithTheMarker) {
  namespace fs = std::filesystem;
  const fs::path logs = _device.path() / "var/mobile/Library/Logs/CrashReporter";
  fs::create_directories(logs);
  const auto telephony = server();
  const auto varnel = viewer();
  ASSERT_TRUE(eventually([&] { return occurrences(varnel->output(), "EF-ICCID") >= 1; }));
  varnel->signal(SIGUSR2);
  ASSERT_TRUE(eventually([&] { return occurrences(varnel->error(), "nothing is saved") == 1; }));
  EXPECT_TRUE(fs::is_empty(logs));

  fs::create_directories(_device.path() / "OrvaneInternal/Library/PreferenceBundles/Carrier Settings.bundle");
  varnel->signal(SIGUSR2);
  ASSERT_TRUE(eventually([&] { return !fs::is_empty(logs); }));
  const fs::path snapshot = fs::directory_iterator(logs)->path();
  EXPECT_THAT(snapshot.filename().string(), testing::MatchesRegex("VarnelSnapshot-[0-9]+\\.varnel"));
  EXPECT_EQ(fs::status(snapshot).permissions(), fs::perms::owner_read | fs::perms::owner_write);
  EXPECT_TRUE(eventually([&] { return contentsOf(snapshot).find("DLF binary (") != std::string::npos; }));
}

TEST_F(EndToEnd, AWrongOptionIsOneLineAndStatusTwo) {
  const auto varnel = viewer({"--ui", "hologram"});
  ASSERT_TRUE(varnel->waitForEnd());
  EXPECT_EQ(varnel->exitStatus(), 2);
  EXPECT_EQ(varnel->output(), "");
  EXPECT_EQ(occurrences(varnel->error(), "\n"), 1u) << varnel->error();
}

}  // namespace
}  // namespace varnel
