#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <csignal>
#include <fstream>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "app/Snapshot.h"
#include "host/CaptureWriter.h"
#include "tests/support/Process.h"

namespace varnel {
namespace {

namespace fs = std::filesystem;
using testing::HasSubstr;
using testing::Not;
using testing::StartsWith;
using Texts = std::vector<std::string>;

// Real viewers that show a file, as text. The server that each of them starts is found in PATH.
class OpenFileEndToEnd : public testing::Test {
 protected:
  // A packet of which the LTE technology shows the number of antennas.
  std::string captureOf(const std::optional<std::string>& technology) const {
    const std::string path = _files.file("capture.pcap");
    CaptureWriter writer(path, ExistingRecording::Replaced, technology);
    Bytes message(22, 0);
    message[0] = 1;
    message[1] = 21;
    message[3] = 0xC1;
    message[4] = 0xB0;
    message[13] = 1;
    message[20] = 2;
    writer.write({1'700'000'000, 0}, message);
    return path;
  }
  std::unique_ptr<Process> viewer(Texts arguments) const {
    arguments.insert(arguments.end(), {"--ui", "text", "--device-root", _device.path()});
    return std::make_unique<Process>(
        VARNEL_PROGRAM, arguments,
        Texts{"XDG_RUNTIME_DIR=" + _session.path().string(),
              "PATH=" + fs::path(VARNEL_TELEPHONYD_PROGRAM).parent_path().string()});
  }
  static testing::AssertionResult shows(const Process& viewer, const std::string& part) {
    if (eventually([&] { return viewer.output().find(part) != std::string::npos; }))
      return testing::AssertionSuccess();
    return testing::AssertionFailure() << viewer.output() << viewer.error();
  }
  // The server that the viewer has started; 0 when there is none.
  static pid_t serverOf(const Process& viewer) {
    const std::string id = std::to_string(viewer.id());
    const std::string children = contentsOf("/proc/" + id + "/task/" + id + "/children");
    return children.empty() ? 0 : std::stoi(children);
  }
  bool hasPrivateFolder() const {
    for (const auto& entry : fs::directory_iterator(_session.path()))
      if (entry.path().filename().string().starts_with("varnel-own-")) return true;
    return false;
  }

  TemporaryFolder _session, _device, _files;
};

TEST_F(OpenFileEndToEnd, ACaptureIsShownAsThatOfTheTechnologyThatItNames) {
  const auto varnel = viewer({captureOf("kalvi-lte"), "--updates", "1"});
  ASSERT_TRUE(varnel->waitForEnd());
  EXPECT_EQ(varnel->exitStatus(), 0) << varnel->error();
  EXPECT_THAT(varnel->output(), StartsWith("Connecting...\n"));
  EXPECT_THAT(varnel->output(), HasSubstr("\nServing Cell Info\n"));
  EXPECT_FALSE(hasPrivateFolder());
}

TEST_F(OpenFileEndToEnd, ACaptureThatNamesNoTechnologyIsOfAllRadios) {
  const auto varnel = viewer({captureOf({}), "--updates", "1"});
  ASSERT_TRUE(varnel->waitForEnd());
  EXPECT_THAT(varnel->output(), HasSubstr("\nLTE\n  Serving Cell\n"));
}

TEST_F(OpenFileEndToEnd, TheTechnologyOfTheUserComesFirst) {
  const auto varnel = viewer({captureOf("all-radios"), "--technology", "kalvi-lte", "--updates", "1"});
  ASSERT_TRUE(varnel->waitForEnd());
  EXPECT_THAT(varnel->output(), HasSubstr("\nServing Cell Info\n"));
}

TEST_F(OpenFileEndToEnd, AsTextASnapshotIsAllOfItsDisplays) {
  const std::string path = _files.file("saved.varnel");
  std::ofstream(path) << R"(<?xml version="1.0" encoding="UTF-8"?>
<plist version="1.0"><dict><key>Timestamp</key><string>2023-11-14 22:13:30 +0000</string><key>Data</key><array>
<dict><key>Display</key><dict><key>RSRP</key><string>-90 dBm</string></dict>
<key>Date</key><string>2023-11-14 22:13:20 +0000</string></dict>
<dict><key>Display</key><dict><key>RSRP</key><string>-91 dBm</string></dict>
<key>Date</key><string>2023-11-14 22:13:22 +0000</string></dict>
</array></dict></plist>)";
  ::setenv("TZ", "UTC", 1);
  const auto varnel = viewer({path});
  ASSERT_TRUE(varnel->waitForEnd());
  EXPECT_EQ(varnel->exitStatus(), 0) << varnel->error();
  EXPECT_EQ(varnel->output(),
            "Display of 2023-11-14 at 22:13:20\nRSRP  -90 dBm\n"
            "Display of 2023-11-14 at 22:13:22\nRSRP  -91 dBm\n");
  const auto first = viewer({path, "--updates", "1"});
  ASSERT_TRUE(first->waitForEnd());
  EXPECT_EQ(first->output(), "Display of 2023-11-14 at 22:13:20\nRSRP  -90 dBm\n");
}

TEST_F(OpenFileEndToEnd, AsTextADisplayHasTheTimeOfTheCaptureAndTheStatusThatOfTheUser) {
  fs::create_directories(_device.path().string() + std::string(internalDeviceMarker));
  const fs::path folder = _device.path().string() + std::string(snapshotFolder);
  fs::create_directories(folder);
  const auto varnel = viewer({captureOf("kalvi-lte")});
  ASSERT_TRUE(shows(*varnel, "\nServing Cell Info\n"));
  EXPECT_THAT(varnel->output(), HasSubstr("\nUpdated "));
  EXPECT_THAT(varnel->output(), Not(HasSubstr("\nUpdated 2023-11-14 ")));
  varnel->signal(SIGUSR2);
  std::string saved;
  ASSERT_TRUE(eventually([&] {
    for (const auto& entry : fs::directory_iterator(folder)) saved = contentsOf(entry.path());
    return saved.ends_with("</plist>\n");
  })) << varnel->output();
  EXPECT_THAT(saved, HasSubstr("<string>2023-11-14 22:13:20 +0000</string>"));
  EXPECT_THAT(saved, HasSubstr("<key>Timestamp</key>"));
  EXPECT_FALSE(fs::exists(folder / "VarnelSnapshot-1700000000.varnel"));
}

TEST_F(OpenFileEndToEnd, AFileMayBeNamedLikeAnOption) {
  fs::copy(captureOf("kalvi-lte"), _files.path() / "--ui");
  fs::current_path(_files.path());
  const auto varnel = viewer({"--updates", "1", "./--ui"});
  ASSERT_TRUE(varnel->waitForEnd());
  EXPECT_THAT(varnel->output(), HasSubstr("\nServing Cell Info\n"));
  fs::current_path("/");
}

TEST_F(OpenFileEndToEnd, AFileThatCannotBePlayedIsOneLineAndStatusOne) {
  const std::string text = _files.file("text");
  std::ofstream(text) << "a text of some length, which is no capture of a modem at all\n";
  for (const std::string& path : {text, std::string("/no such file"), _files.path().string()}) {
    const auto varnel = viewer({path});
    ASSERT_TRUE(varnel->waitForEnd());
    EXPECT_EQ(varnel->exitStatus(), 1);
    EXPECT_EQ(varnel->output(), "");
    EXPECT_THAT(varnel->error(), testing::MatchesRegex("varnel: [^\n]*" + path + "[^\n]*\n"));
  }
  EXPECT_FALSE(hasPrivateFolder());
}

TEST_F(OpenFileEndToEnd, MistakesAreOneLineAndStatusTwo) {
  const std::string capture = captureOf({});
  for (const Texts& arguments :
       {Texts{"-"}, Texts{""}, Texts{capture, capture}, Texts{"--technology", "kalvi-lte"},
        Texts{capture, "--technology", "gsm"}, Texts{capture, "--runtime-dir", "x"}}) {
    const auto varnel = viewer(arguments);
    ASSERT_TRUE(varnel->waitForEnd());
    EXPECT_EQ(varnel->exitStatus(), 2) << varnel->error();
    EXPECT_THAT(varnel->error(), testing::MatchesRegex("varnel: [^\n]*; see varnel --help\n"));
  }
}

TEST_F(OpenFileEndToEnd, TheServerEndsWithAViewerThatIsKilled) {
  const auto varnel = viewer({captureOf("kalvi-lte")});
  ASSERT_TRUE(shows(*varnel, "Serving Cell Info"));
  const pid_t server = serverOf(*varnel);
  ASSERT_NE(server, 0);
  varnel->signal(SIGKILL);
  EXPECT_TRUE(eventually([server] { return ::kill(server, 0) != 0; }));
}

TEST_F(OpenFileEndToEnd, AServerThatIsKilledIsTold) {
  const std::string capture = captureOf("kalvi-lte");
  const auto varnel = viewer({capture});
  ASSERT_TRUE(shows(*varnel, "Serving Cell Info"));
  ::kill(serverOf(*varnel), SIGKILL);
  EXPECT_TRUE(
      shows(*varnel, "\nNotice: The server that plays " + capture +
                         " has ended: the server was ended by a signal; start varnel again to see the "
                         "file again\n"));
  varnel->signal(SIGTERM);
  ASSERT_TRUE(varnel->waitForEnd());
  EXPECT_FALSE(hasPrivateFolder());
}

}  // namespace
}  // namespace varnel
