#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>
#include <memory>
#include <string>
#include <vector>

#include "tests/support/Process.h"

namespace varnel {
namespace {

using Texts = std::vector<std::string>;

const std::string streaming = "<3>Starting the display update timer\n";
const std::string noPorts = "<3>Could not create the ports necessary\n";
const std::string noTechnology = "<3>No log generator technology works\n";

// Real servers that make a fault on demand, and a real viewer.
class FaultsEndToEnd : public testing::Test {
 protected:
  std::unique_ptr<Process> server(const std::string& fault = "") const {
    Texts arguments{"--simulate", "kalvi-lte", "--seed", "7", "--runtime-dir", _runtime.path()};
    if (!fault.empty()) arguments.insert(arguments.end(), {"--fault", fault});
    return std::make_unique<Process>(VARNEL_TELEPHONYD_PROGRAM, arguments);
  }
  std::unique_ptr<Process> viewer(const std::filesystem::path& folder) const {
    return std::make_unique<Process>(
        VARNEL_PROGRAM,
        Texts{"--ui", "text", "--runtime-dir", folder, "--device-root", _device.path(), "--log-level", "3"});
  }
  std::unique_ptr<Process> viewer() const { return viewer(_runtime.path()); }

  static std::size_t logged(const Process& program, const std::string& part) {
    const std::string error = program.error();
    std::size_t found = 0;
    for (auto at = error.find(part); at != std::string::npos; at = error.find(part, at + 1)) ++found;
    return found;
  }
  static testing::AssertionResult logs(const Process& program, const std::string& part,
                                       std::size_t times = 1) {
    if (eventually([&] { return logged(program, part) >= times; })) return testing::AssertionSuccess();
    return testing::AssertionFailure() << "not logged: " << part << "\n" << program.error();
  }

  TemporaryFolder _runtime, _device;
};

struct StartFailure {
  std::string name;
  std::string fault;    // of the server; no server when it is empty
  Texts lines;          // what the viewer logs
  bool isRace = false;  // the viewer may be faster now and then, and then streams for a moment
};

class StartFailures : public FaultsEndToEnd, public testing::WithParamInterface<StartFailure> {};

// All failures of a start that do not come from the viewer itself. After each the viewer tries again.
const StartFailure startFailures[] = {
    {"NoServer", "", {"<3>Could not create TKServerConnection\n", noPorts}},
    {"ARefusedChannel",
     "refuse-channel",
     {"<3>_TKServerConnectionNetworkMonitorCreateLogChannel returns error: 8!\n", noPorts}},
    {"AReplyWithoutAPort",
     "no-port",
     {"<3>Could not create a log channel (TK returned null port)!\n", noPorts}},
    {"APortThatIsNotThere", "wrong-port", {"<3>Could not create the remote port!\n", noPorts}},
    {"ALateReply",
     "late-reply",
     {"<3> ***** Could not send the GetTechnology command (got error=-2)\n", noTechnology}},
    {"NoReply", "silent", {"<3> ***** No response to GetTechnology; cannot configure\n", noTechnology}},
    {"AReplyThatIsNoPropertyList",
     "bad-reply",
     {"<3> ***** Could not parse reply to GetTechnology; cannot configure\n", noTechnology}},
    {"AReplyWithoutAnAnswer",
     "empty-reply",
     {"<3> ***** Reply to GetTechnology had no answer; cannot configure\n", noTechnology}},
    {"AnUnknownTechnology", "unknown-technology", {"<3>Got log generated: ", noTechnology}},
    {"AChannelThatEndsBeforeTheStart",
     "drop-after-reply",
     {"<3> ***** Could not send the START command (got error=-3)\n"},
     true},
};

TEST_P(StartFailures, IsLoggedAndTheViewerStreamsWithTheNextServer) {
  auto telephony = GetParam().fault.empty() ? nullptr : server(GetParam().fault);
  const auto varnel = viewer();
  for (const std::string& line : GetParam().lines) EXPECT_TRUE(logs(*varnel, line));
  if (!GetParam().isRace) {
    EXPECT_EQ(logged(*varnel, streaming), 0u) << varnel->error();
  }
  telephony.reset();
  const std::size_t former = logged(*varnel, streaming);
  telephony = server();
  EXPECT_TRUE(logs(*varnel, streaming, former + 1));
}

INSTANTIATE_TEST_SUITE_P(All, StartFailures, testing::ValuesIn(startFailures),
                         [](const auto& info) { return info.param.name; });

TEST_F(FaultsEndToEnd, AFolderForWhichNoSocketHasAnAddressIsLogged) {
  const std::filesystem::path folder = _device.path() / std::string(100, 'x');
  std::filesystem::create_directory(folder);
  std::filesystem::permissions(folder, std::filesystem::perms::owner_all);
  const auto varnel = viewer(folder);
  EXPECT_TRUE(logs(*varnel, "<3>Could not create local message port\n"));
  EXPECT_TRUE(logs(*varnel, noPorts));
}

TEST_F(FaultsEndToEnd, ASecondViewerIsLogged) {
  const auto telephony = server();
  const auto first = viewer();
  ASSERT_TRUE(logs(*first, streaming));
  const auto second = viewer();
  EXPECT_TRUE(logs(*second, "<3>Local messsage port already exists\n"));
  EXPECT_TRUE(logs(*second, noPorts));
}

TEST_F(FaultsEndToEnd, AChannelThatEndsIsOpenedAgainAtOnceEachTime) {
  const auto telephony = server("drop-channel@5");
  const auto varnel = viewer();
  EXPECT_TRUE(logs(*varnel, "<3> ***** INVALIDATED 0x", 3));
  EXPECT_TRUE(logs(*varnel, streaming, 4));
  // A viewer that was faster than its server has failed once before.
  const std::string error = varnel->error();
  EXPECT_EQ(error.find(noPorts, error.find(streaming)), std::string::npos) << error;
}

TEST_F(FaultsEndToEnd, AServerThatCrashesIsAbortedAndItsViewerStreamsFromTheNextOne) {
  auto telephony = server("crash@5");
  const auto varnel = viewer();
  ASSERT_TRUE(telephony->waitForEnd());
  EXPECT_EQ(telephony->exitStatus(), -SIGABRT);
  EXPECT_TRUE(logs(*varnel, "<3> ***** INVALIDATED 0x"));
  telephony = server();
  EXPECT_TRUE(logs(*varnel, streaming, 2));
}

TEST_F(FaultsEndToEnd, GarbageDoesNotDisturbTheStream) {
  const auto telephony = server("garbage@5");
  const auto varnel = viewer();
  EXPECT_TRUE(eventually([&] { return varnel->output().find("EF-ICCID") != std::string::npos; }));
  EXPECT_EQ(logged(*varnel, "INVALIDATED"), 0u) << varnel->error();
  EXPECT_EQ(logged(*varnel, streaming), 1u);
}

// `./dev soak` does this 200 times, and watches the memory.
TEST_F(FaultsEndToEnd, AServerThatIsKilledAgainAndAgainIsFoundWithTheNextRetry) {
  const auto varnel = viewer();
  for (std::size_t round = 1; round <= 3; ++round) {
    const auto telephony = server();
    ASSERT_TRUE(logs(*varnel, streaming, round));
    telephony->signal(SIGKILL);
    ASSERT_TRUE(logs(*varnel, "<3> ***** INVALIDATED 0x", round));
  }
}

}  // namespace
}  // namespace varnel
