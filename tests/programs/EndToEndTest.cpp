#include <fcntl.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/stat.h>

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <memory>
#include <regex>

#include "host/FileDescriptor.h"
#include "tests/support/Process.h"
#include "tests/support/RawSocket.h"

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

const std::string streaming = "<3>Starting the display update timer\n";
const std::string connecting = "Connecting...\n";
const std::string lost = "<3> ***** INVALIDATED 0x";
const std::string noLink = "<3>Could not create the ports necessary\n";

// A real server with a simulated LTE modem, and real viewers, in their own runtime folder.
class EndToEnd : public testing::Test {
 protected:
  std::unique_ptr<Process> server() {
    return std::make_unique<Process>(
        VARNEL_TELEPHONYD_PROGRAM,
        std::vector<std::string>{"--simulate", "kalvi-lte", "--seed", "7", "--runtime-dir", _runtime.path()});
  }
  std::unique_ptr<Process> viewer(std::vector<std::string> more = {}, const Terminal* terminal = nullptr) {
    std::vector<std::string> arguments{"--ui",          "text",         "--runtime-dir", _runtime.path(),
                                       "--device-root", _device.path(), "--log-level",   "3"};
    arguments.insert(arguments.end(), more.begin(), more.end());
    return std::make_unique<Process>(VARNEL_PROGRAM, arguments, std::vector<std::string>(), terminal);
  }

  // A viewer that shall open a window. The environment names no display but this one.
  std::unique_ptr<Process> window(std::vector<std::string> more, const std::string& display,
                                  const std::string& userInterface = "window",
                                  const std::vector<std::string>& environment = {}) {
    std::vector<std::string> arguments{"--ui",          userInterface,  "--runtime-dir", _runtime.path(),
                                       "--device-root", _device.path(), "--log-level",   "3"};
    arguments.insert(arguments.end(), more.begin(), more.end());
    std::vector<std::string> whole{"QT_QPA_PLATFORM",
                                   "WAYLAND_DISPLAY",
                                   "DISPLAY",
                                   "DBUS_SESSION_BUS_ADDRESS",
                                   "XDG_STATE_HOME=" + _device.path().string(),
                                   display};
    whole.insert(whole.end(), environment.begin(), environment.end());
    return std::make_unique<Process>(VARNEL_PROGRAM, arguments, whole);
  }
  // How often a viewer has logged the line. Without a link it tries every five seconds and logs each time, so
  // the number depends on which program was faster.
  static std::size_t logged(const Process& viewer, const std::string& line) {
    return occurrences(viewer.error(), line);
  }
  // Waits until the viewer has logged the line more often than before.
  static testing::AssertionResult logsAgain(const Process& viewer, const std::string& line,
                                            std::size_t before = 0) {
    if (eventually([&] { return logged(viewer, line) > before; })) return testing::AssertionSuccess();
    return testing::AssertionFailure() << "not logged: " << line << "but:\n" << viewer.error();
  }
  std::string preference() const {
    return contentsOf(_device.path() / "var/mobile/Library/Preferences/com.orvane.dockhall.plist");
  }

  TemporaryFolder _runtime;
  TemporaryFolder _device;
};

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

// A packet of the modem: log type, record length, code, timestamp, payload.
std::string packetOf(const std::string& prefix, std::uint16_t code, const std::string& payload) {
  const auto size = static_cast<char>(12 + payload.size());
  return prefix + '\x01' + size + '\0' + static_cast<char>(code & 0xFF) + static_cast<char>(code >> 8) +
         std::string(8, '\0') + payload;
}

TEST_F(EndToEnd, OfSeveralSimCardsAViewerShowsTheOneThatItIsAskedFor) {
  // A number of antennas from the second card, then a measurement without a card.
  const std::string antennas = packetOf("\x81\x02", 0xB0C1, std::string("\0\0\0\0\0\0\0\x04\0", 9)),
                    measurement = packetOf("", 0xB17F, std::string(20, '\0'));
  const std::string capture = _device.file("two.pcap");
  std::ofstream file(capture, std::ios::binary);
  file << std::string("\x4D\x3C\xB2\xA1\x02\0\x04\0\0\0\0\0\0\0\0\0\0\0\x04\0\x93\0\0\0", 24);
  for (const std::string& message : {antennas, measurement}) {
    const std::string size{static_cast<char>(message.size()), '\0', '\0', '\0'};
    file << std::string(8, '\0') << size << size << message;
  }
  file.close();
  const auto shown = [&](const char* card) {
    const Process telephony(VARNEL_TELEPHONYD_PROGRAM, {"--replay", capture, "--technology", "kalvi-lte",
                                                        "--runtime-dir", _runtime.path()});
    const auto varnel = viewer({"--sim", card, "--updates", "1"});
    EXPECT_TRUE(varnel->waitForEnd());
    return varnel->output();
  };
  const std::string second = shown("2"), first = shown("1");
  EXPECT_THAT(second, testing::ContainsRegex("Num Tx Antennas +4\n"));
  EXPECT_THAT(second, HasSubstr("Average RSRP"));
  EXPECT_THAT(first, Not(testing::ContainsRegex("Num Tx Antennas +4\n")));
  EXPECT_THAT(first, HasSubstr("Average RSRP"));
}

// A pipe whose reader is the server.
class ReplayedPipe : public EndToEnd {
 protected:
  ReplayedPipe() {
    if (::mkfifo(path().c_str(), 0600) != 0) ADD_FAILURE() << "no pipe";
    // With both ends, opening does not wait for the server.
    _writer = FileDescriptor(::open(path().c_str(), O_RDWR | O_CLOEXEC));
  }
  std::string path() const { return _device.file("pipe"); }

  std::unique_ptr<Process> server(const std::vector<std::string>& more = {}) const {
    std::vector<std::string> arguments{"-c",
                                       "exec \"$0\" \"$@\" <'" + path() + "'",
                                       VARNEL_TELEPHONYD_PROGRAM,
                                       "--replay",
                                       "-",
                                       "--runtime-dir",
                                       _runtime.path()};
    arguments.insert(arguments.end(), more.begin(), more.end());
    return std::make_unique<Process>("/bin/sh", arguments);
  }
  void write(const std::string& bytes) const {
    EXPECT_EQ(::write(_writer.number(), bytes.data(), bytes.size()), static_cast<ssize_t>(bytes.size()));
  }
  void writeHeader() const {
    write(std::string("\x4D\x3C\xB2\xA1\x02\0\x04\0\0\0\0\0\0\0\0\0\0\0\x04\0\x93\0\0\0", 24));
  }
  // A record of version 1 that says how many antennas there are.
  void writeAntennas(char second, char antennas) const {
    const std::string message = packetOf("", 0xB0C1, '\1' + std::string(6, '\0') + antennas + '\0');
    const std::string size{static_cast<char>(message.size()), '\0', '\0', '\0'};
    write(second + std::string(7, '\0') + size + size + message);
  }
  void closeWriter() { _writer = FileDescriptor(); }

  static testing::AssertionResult tells(const Process& program, const std::string& part) {
    if (eventually([&] { return program.error().find(part) != std::string::npos; }))
      return testing::AssertionSuccess();
    return testing::AssertionFailure() << "not told: " << part << ", but:\n" << program.error();
  }
  static testing::AssertionResult shows(const Process& viewer, const std::string& antennas) {
    const std::regex row(" Antennas +" + antennas + "\n");
    if (eventually([&] { return std::regex_search(viewer.output(), row); }))
      return testing::AssertionSuccess();
    return testing::AssertionFailure() << "not shown: " << antennas << ", but:\n" << viewer.output();
  }

 private:
  FileDescriptor _writer;
};

TEST_F(ReplayedPipe, IsALiveViewForOneViewerAfterAnother) {
  const auto telephony = server({"--log-level", "5"});
  ASSERT_TRUE(tells(*telephony, "waiting for the beginning of standard input"));
  writeHeader();
  ASSERT_TRUE(tells(*telephony, "serving all-radios in "));
  auto varnel = viewer();
  writeAntennas(1, 4);
  EXPECT_TRUE(shows(*varnel, "4"));
  writeAntennas(100, 1);
  EXPECT_TRUE(shows(*varnel, "1"));
  varnel.reset();
  ASSERT_TRUE(tells(*telephony, "A log channel is closed"));
  writeAntennas(101, 2);
  varnel = viewer();
  EXPECT_TRUE(shows(*varnel, "2"));
  EXPECT_THAT(varnel->output(), Not(testing::ContainsRegex(" Antennas +[14]\n")));
  closeWriter();
  ASSERT_TRUE(tells(*telephony, "the replay of standard input has ended\n"));
  varnel.reset();
  varnel = viewer();
  ASSERT_TRUE(eventually([&] {
    return varnel->output().find("Notice: The replay of standard input has ended") != std::string::npos;
  })) << varnel->output();
  telephony->signal(SIGTERM);
  ASSERT_TRUE(telephony->waitForEnd());
  EXPECT_EQ(telephony->exitStatus(), 0);
  EXPECT_EQ(occurrences(telephony->error(), "the replay of standard input has ended"), 1u)
      << telephony->error();
  EXPECT_THAT(telephony->error(), HasSubstr("messages: 3 received, 3 delivered, 0 dropped"));
}

TEST_F(ReplayedPipe, IsServedAtOnceWhenTheTechnologyIsNamedAndTheServerEndsWhileItWaits) {
  const auto telephony = server({"--technology", "kalvi-utran-2"});
  ASSERT_TRUE(tells(*telephony, "serving kalvi-utran-2 in "));
  const auto varnel = viewer();
  ASSERT_TRUE(logsAgain(*varnel, streaming));
  telephony->signal(SIGTERM);
  ASSERT_TRUE(telephony->waitForEnd());
  EXPECT_EQ(telephony->exitStatus(), 0) << telephony->error();
}

TEST_F(EndToEnd, AStandardInputThatCannotBeReplayedIsOneLine) {
  Process empty(VARNEL_TELEPHONYD_PROGRAM, {"--replay", "-", "--runtime-dir", _runtime.path()});
  ASSERT_TRUE(empty.waitForEnd());
  EXPECT_EQ(empty.exitStatus(), 1);
  EXPECT_EQ(empty.error(), "varnel-telephonyd: standard input is empty, and so no capture\n");
  const Terminal terminal;
  Process typed(VARNEL_TELEPHONYD_PROGRAM, {"--replay", "-", "--runtime-dir", _runtime.path()}, {},
                &terminal);
  ASSERT_TRUE(typed.waitForEnd());
  EXPECT_EQ(typed.exitStatus(), 2);
  EXPECT_EQ(typed.error(),
            "varnel-telephonyd: --replay - needs a pipe, and standard input is a terminal; see "
            "varnel-telephonyd --help\n");
}

TEST_F(EndToEnd, AKilledServerIsNoticedAndSoIsItsReturn) {
  auto telephony = server();
  const auto varnel = viewer();
  ASSERT_TRUE(logsAgain(*varnel, streaming));
  const std::size_t links = logged(*varnel, streaming), losses = logged(*varnel, lost),
                    failures = logged(*varnel, noLink);
  telephony->signal(SIGKILL);
  ASSERT_TRUE(logsAgain(*varnel, lost, losses));
  ASSERT_TRUE(logsAgain(*varnel, noLink, failures));
  telephony = server();
  EXPECT_TRUE(logsAgain(*varnel, streaming, links));
}

TEST_F(EndToEnd, TheServerSaysWhatItServesAndWhatBecameOfItsMessages) {
  const auto telephony = server();
  const std::string folder = _runtime.path().string();
  ASSERT_TRUE(eventually([&] { return !telephony->error().empty(); }));
  EXPECT_EQ(telephony->error(), "varnel-telephonyd: serving kalvi-lte in " + folder +
                                    "; now start varnel --runtime-dir " + folder + "\n");
  const auto varnel = viewer({"--updates", "1"});
  ASSERT_TRUE(varnel->waitForEnd());
  telephony->signal(SIGTERM);
  ASSERT_TRUE(telephony->waitForEnd());
  EXPECT_EQ(telephony->exitStatus(), 0);
  EXPECT_THAT(
      telephony->error(),
      testing::ContainsRegex("\nvarnel-telephonyd: messages: [1-9][0-9]* received, [1-9][0-9]* delivered, "
                             "0 dropped, 0 refused \\(0 too long for the channel, 0 not asked for\\)\n"));
  EXPECT_TRUE(std::filesystem::is_empty(_runtime.path()));
}

TEST_F(EndToEnd, TheServerTellsTheServiceManagerWhenItServesAndWhenItEnds) {
  const RawSocket manager = RawSocket::receivingAt(_device.file("notify"));
  const auto told = [&] {
    const Bytes bytes = manager.receive();
    return std::string(bytes.begin(), bytes.end());
  };
  Process telephony(VARNEL_TELEPHONYD_PROGRAM, {"--simulate", "kalvi-lte", "--runtime-dir", _runtime.path()},
                    {"NOTIFY_SOCKET=" + _device.file("notify")});
  EXPECT_EQ(told(), "READY=1");
  EXPECT_TRUE(std::filesystem::exists(_runtime.file("com.orvane.TelephonyServer")));
  telephony.signal(SIGTERM);
  EXPECT_EQ(told(), "STOPPING=1");
  ASSERT_TRUE(telephony.waitForEnd());
  EXPECT_EQ(telephony.exitStatus(), 0);
}

// A group of the test itself: every process may give its folders to it.
TEST_F(EndToEnd, AServerCanShareItsFolderWithAGroup) {
  const std::string folder = _runtime.file("shared");
  const Process telephony(VARNEL_TELEPHONYD_PROGRAM, {"--simulate", "kalvi-lte", "--runtime-dir", folder,
                                                      "--allow-group", std::to_string(::getegid())});
  ASSERT_TRUE(eventually([&] { return telephony.error().find("serving") != std::string::npos; }));
  const auto modeOf = [](const std::string& path) {
    struct stat status {};
    return ::stat(path.c_str(), &status) == 0 ? status.st_mode & 07777 : 0;
  };
  EXPECT_EQ(modeOf(folder), 03770u);
  EXPECT_EQ(modeOf(folder + "/com.orvane.TelephonyServer"), 0660u);
  Process varnel(VARNEL_PROGRAM, {"--ui", "text", "--runtime-dir", folder, "--device-root", _device.path(),
                                  "--updates", "2"});
  ASSERT_TRUE(varnel.waitForEnd());
  EXPECT_THAT(varnel.output(), HasSubstr("Serving Cell Info\n"));
}

TEST_F(EndToEnd, AGroupThatIsNotThereIsOneLineAndStatusOne) {
  Process telephony(VARNEL_TELEPHONYD_PROGRAM, {"--simulate", "kalvi-lte", "--runtime-dir", _runtime.path(),
                                                "--allow-group", "no such group"});
  ASSERT_TRUE(telephony.waitForEnd());
  EXPECT_EQ(telephony.exitStatus(), 1);
  EXPECT_EQ(
      telephony.error(),
      "varnel-telephonyd: there is no group no such group; name one that is there with --allow-group\n");
}

TEST_F(EndToEnd, AViewerWithoutAServerKeepsTrying) {
  const auto varnel = viewer();
  ASSERT_TRUE(logsAgain(*varnel, noLink));
  const auto telephony = server();
  EXPECT_TRUE(logsAgain(*varnel, streaming));
}

TEST_F(EndToEnd, ASecondViewerWaitsForTheChannelName) {
  const auto telephony = server();
  auto first = viewer();
  ASSERT_TRUE(logsAgain(*first, streaming));
  const auto second = viewer();
  ASSERT_TRUE(logsAgain(*second, "<3>Local messsage port already exists\n"));
  first->signal(SIGTERM);
  ASSERT_TRUE(first->waitForEnd());
  EXPECT_EQ(first->exitStatus(), 0);
  EXPECT_TRUE(logsAgain(*second, streaming));
}

TEST_F(EndToEnd, StartingOverShowsALivingTreeAgain) {
  const auto telephony = server();
  const auto varnel = viewer();
  ASSERT_TRUE(eventually([&] { return occurrences(varnel->output(), "EF-ICCID") >= 1; }));
  const std::size_t starts = occurrences(varnel->output(), connecting);
  varnel->signal(SIGUSR1);
  ASSERT_TRUE(eventually([&] { return occurrences(varnel->output(), connecting) > starts; }));
  const std::size_t before = occurrences(varnel->output(), "EF-ICCID");
  EXPECT_TRUE(eventually([&] { return occurrences(varnel->output(), "EF-ICCID") > before; }))
      << varnel->error();
}

TEST_F(EndToEnd, KeysOfATerminalStartOverSaveAndEnd) {
  const auto telephony = server();
  for (const std::string keys : {"rsq", "RSQ"}) {
    const Terminal terminal;
    const auto varnel = viewer({}, &terminal);
    ASSERT_TRUE(eventually([&] { return occurrences(varnel->output(), "EF-ICCID") >= 1; }));
    EXPECT_FALSE(terminal.showsLines());
    const std::size_t starts = occurrences(varnel->output(), connecting);
    terminal.type("x\n" + keys.substr(0, 1));
    ASSERT_TRUE(eventually([&] { return occurrences(varnel->output(), connecting) > starts; }));
    terminal.type(keys.substr(1, 1));
    ASSERT_TRUE(eventually([&] { return occurrences(varnel->error(), "nothing is saved") == 1; }));
    terminal.type(keys.substr(2, 1));
    ASSERT_TRUE(varnel->waitForEnd());
    EXPECT_EQ(varnel->exitStatus(), 0) << varnel->error();
    EXPECT_TRUE(terminal.showsLines());
  }
}

TEST_F(EndToEnd, AViewerEndsWithItsTerminal) {
  const auto telephony = server();
  auto terminal = std::make_unique<Terminal>();
  const auto varnel = viewer({}, terminal.get());
  ASSERT_TRUE(eventually([&] { return occurrences(varnel->output(), "EF-ICCID") >= 1; }));
  terminal.reset();
  EXPECT_TRUE(varnel->waitForEnd());
  EXPECT_EQ(varnel->exitStatus(), 0) << varnel->error();
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
  // A file that is still being written can be beside it.
  fs::path snapshot;
  ASSERT_TRUE(eventually([&] {
    for (const auto& entry : fs::directory_iterator(logs)) {
      if (std::regex_match(entry.path().filename().string(), std::regex("VarnelSnapshot-[0-9]+\\.varnel")))
        snapshot = entry.path();
    }
    return !snapshot.empty();
  }));
  EXPECT_EQ(fs::status(snapshot).permissions(), fs::perms::owner_read | fs::perms::owner_write);
  EXPECT_TRUE(eventually([&] { return contentsOf(snapshot).find("DLF binary (") != std::string::npos; }));
}

// This machine is no device, so the viewer has one of its own.
TEST_F(EndToEnd, WithoutADeviceSnapshotsGoToTheStateFolderAndTheNoticeSaysWhere) {
  namespace fs = std::filesystem;
  const fs::path logs = _device.path() / "varnel/var/mobile/Library/Logs/CrashReporter";
  const auto telephony = server();
  const Process varnel(VARNEL_PROGRAM, {"--ui", "text", "--runtime-dir", _runtime.path(), "--log-level", "3"},
                       {"XDG_STATE_HOME=" + _device.path().string()});
  ASSERT_TRUE(eventually([&] { return occurrences(varnel.output(), "EF-ICCID") >= 1; }));
  varnel.signal(SIGUSR2);
  const std::string place = (logs / "VarnelSnapshot-").string();
  ASSERT_TRUE(eventually([&] {
    return varnel.output().find("Notice: Saved: " + place) != std::string::npos;
  })) << varnel.output();
  EXPECT_EQ(std::distance(fs::directory_iterator(logs), fs::directory_iterator()), 1);

  fs::remove_all(logs);
  varnel.signal(SIGUSR2);
  ASSERT_TRUE(eventually([&] {
    return varnel.output().find("Notice: Not saved: " + place) != std::string::npos;
  })) << varnel.output();
  EXPECT_THAT(varnel.error(), HasSubstr("<3>Unable to write snapshot to "));
  EXPECT_FALSE(fs::exists(logs));
}

TEST_F(EndToEnd, AViewerThatCannotMakeItsSnapshotFolderSaysSoAndGoesOn) {
  const auto telephony = server();
  std::ofstream(_device.file("varnel")) << "in the way";
  Process varnel(VARNEL_PROGRAM, {"--ui", "text", "--runtime-dir", _runtime.path(), "--updates", "1"},
                 {"XDG_STATE_HOME=" + _device.path().string()});
  ASSERT_TRUE(varnel.waitForEnd());
  EXPECT_EQ(varnel.exitStatus(), 0);
  EXPECT_EQ(varnel.error(), "varnel: the folder for snapshots cannot be made in " + _device.file("varnel") +
                                ": Not a directory; name one that stands for a device with --device-root\n");
}

TEST_F(EndToEnd, TheWindowEndsAfterItsUpdatesAndPutsThePreferenceBack) {
  const auto telephony = server();
  const auto varnel = window({"--updates", "2"}, "QT_QPA_PLATFORM=offscreen");
  ASSERT_TRUE(varnel->waitForEnd());
  EXPECT_EQ(varnel->exitStatus(), 0) << varnel->error();
  EXPECT_THAT(varnel->error(), HasSubstr(streaming));
  EXPECT_THAT(preference(), HasSubstr("DHShowGSMRSSI"));
}

TEST_F(EndToEnd, SignalsEndTheWindowInOrder) {
  for (const int signal : {SIGTERM, SIGINT, SIGHUP}) {
    const auto telephony = server();
    const auto varnel = window({}, "QT_QPA_PLATFORM=offscreen");
    ASSERT_TRUE(logsAgain(*varnel, streaming));
    const std::size_t links = logged(*varnel, streaming);
    varnel->signal(SIGUSR1);
    ASSERT_TRUE(logsAgain(*varnel, streaming, links));
    varnel->signal(SIGUSR2);
    ASSERT_TRUE(eventually([&] { return occurrences(varnel->error(), "nothing is saved") == 1; }));
    EXPECT_EQ(preference(), "");
    varnel->signal(signal);
    ASSERT_TRUE(varnel->waitForEnd());
    EXPECT_EQ(varnel->exitStatus(), 0) << varnel->error();
    EXPECT_THAT(preference(), HasSubstr("DHShowGSMRSSI"));
    std::filesystem::remove_all(_device.path() / "var");
  }
}

TEST_F(EndToEnd, AHangUpEndsTheTextViewerInOrder) {
  const auto telephony = server();
  const auto varnel = viewer();
  ASSERT_TRUE(eventually([&] { return occurrences(varnel->error(), streaming) == 1; })) << varnel->error();
  varnel->signal(SIGHUP);
  ASSERT_TRUE(varnel->waitForEnd());
  EXPECT_EQ(varnel->exitStatus(), 0) << varnel->error();
}

TEST_F(EndToEnd, AWindowWithoutADisplayIsOneLineAndStatusOne) {
  for (const char* display : {"DISPLAY", "DISPLAY=:7655", "QT_QPA_PLATFORM=hologram"}) {
    const auto varnel = window({}, display);
    ASSERT_TRUE(varnel->waitForEnd());
    EXPECT_EQ(varnel->exitStatus(), 1) << varnel->error();
    EXPECT_EQ(occurrences(varnel->error(), "\n"), 1u) << varnel->error();
    EXPECT_THAT(varnel->error(), HasSubstr("display"));
    EXPECT_THAT(varnel->error(), HasSubstr("--ui text"));
  }
}

TEST_F(EndToEnd, AutoIsTextWithoutADisplayAndTheWindowWithOne) {
  const auto telephony = server();
  const auto text = window({"--updates", "1"}, "DISPLAY=:7655", "auto");
  ASSERT_TRUE(text->waitForEnd());
  EXPECT_THAT(text->output(), StartsWith("Connecting...\n"));
  const auto shown = window({"--updates", "1"}, "QT_QPA_PLATFORM=offscreen", "auto");
  ASSERT_TRUE(shown->waitForEnd());
  EXPECT_THAT(shown->output(), Not(HasSubstr("Connecting")));
  EXPECT_EQ(shown->exitStatus(), 0) << shown->error();
}

TEST_F(EndToEnd, AViewerThatFindsNoServerSaysWhereAndWhatToType) {
  const auto varnel = viewer();
  EXPECT_TRUE(eventually([&] {
    return occurrences(varnel->output(), "Connecting...\nNotice: No telephony server serves in " +
                                             _runtime.path().string() + "; start varnel-telephonyd") == 1;
  })) << varnel->output();
}

TEST_F(EndToEnd, AViewerEndsWithTheReaderOfItsPages) {
  const std::string command = std::string("exec ") + VARNEL_PROGRAM + " --ui text --runtime-dir " +
                              _runtime.path().string() + " --device-root " + _device.path().string();
  Process pipeline("/bin/sh", {"-c", command + " | head -n 1"});
  ASSERT_TRUE(pipeline.waitForEnd());
  EXPECT_EQ(pipeline.output(), "Connecting...\n");
  EXPECT_EQ(pipeline.error(), "");
}

TEST_F(EndToEnd, APageThatCannotBeWrittenIsOneLineAndStatusOne) {
  const std::string command = std::string("exec ") + VARNEL_PROGRAM + " --ui text --runtime-dir " +
                              _runtime.path().string() + " --device-root " + _device.path().string();
  Process full("/bin/sh", {"-c", command + " > /dev/full"});
  ASSERT_TRUE(full.waitForEnd());
  EXPECT_EQ(full.exitStatus(), 1);
  EXPECT_EQ(full.error(), "varnel: cannot write to standard output: No space left on device\n");
}

TEST_F(EndToEnd, WhatGeneratorsSayStandsBetweenPages) {
  const auto telephony = server();
  const auto varnel = viewer();
  ASSERT_TRUE(eventually([&] { return occurrences(varnel->output(), "EF-ICCID") >= 1; }));
  varnel->signal(SIGUSR1);
  EXPECT_TRUE(eventually([&] {
    return occurrences(varnel->output(), "\nDeallocing ClassIndex\nConnecting...\n") == 1;
  })) << varnel->output();
}

TEST_F(EndToEnd, AMissingResourceFolderIsOneLineAndStatusOne) {
  for (const std::string kind : {"text", "window"}) {
    const auto varnel = window({}, "QT_QPA_PLATFORM=offscreen", kind, {"VARNEL_RESOURCES=/some/where"});
    ASSERT_TRUE(varnel->waitForEnd());
    EXPECT_EQ(varnel->exitStatus(), 1) << varnel->error();
    EXPECT_EQ(varnel->output(), "");
    EXPECT_EQ(occurrences(varnel->error(), "\n"), 1u) << varnel->error();
    EXPECT_THAT(varnel->error(), HasSubstr("/some/where"));
  }
}

TEST_F(EndToEnd, AWrongOptionIsOneLineAndStatusTwo) {
  const auto varnel = viewer({"--ui", "hologram"});
  ASSERT_TRUE(varnel->waitForEnd());
  EXPECT_EQ(varnel->exitStatus(), 2);
  EXPECT_EQ(varnel->output(), "");
  EXPECT_EQ(occurrences(varnel->error(), "\n"), 1u) << varnel->error();
}

TEST_F(EndToEnd, NamesOfFilesDoNotSteerTheTerminal) {
  const std::string name = "no\x1b[31m.pcap";
  const std::vector<std::string> arguments{"--runtime-dir", _runtime.path(), "--replay", name};
  Process telephony(VARNEL_TELEPHONYD_PROGRAM, arguments);
  ASSERT_TRUE(telephony.waitForEnd());
  EXPECT_EQ(telephony.exitStatus(), 1);
  EXPECT_THAT(telephony.error(), HasSubstr("no\\u001B[31m.pcap"));
  EXPECT_EQ(telephony.error().find('\x1b'), std::string::npos);
}

}  // namespace
}  // namespace varnel
