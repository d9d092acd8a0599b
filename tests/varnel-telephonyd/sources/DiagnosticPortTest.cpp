#include "programs/varnel-telephonyd/sources/DiagnosticPort.h"

#include <fcntl.h>
#include <gmock/gmock.h>
#include <grp.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <termios.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>
#include <string>

#include "host/FileDescriptor.h"
#include "programs/varnel-telephonyd/sources/PortHolders.h"
#include "programs/varnel-telephonyd/sources/PortTrouble.h"
#include "tests/support/EventLoop.h"
#include "tests/support/Process.h"

namespace varnel {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testing::StartsWith;

class DiagnosticPortTest : public testing::Test {
 protected:
  DiagnosticPortTest() : _line(::posix_openpt(O_RDWR | O_NOCTTY | O_CLOEXEC)) {
    if (::grantpt(_line.number()) != 0 || ::unlockpt(_line.number()) != 0)
      ADD_FAILURE() << "no pseudo-terminal";
    _name = ::ptsname(_line.number());
  }
  std::optional<std::string> open(DiagnosticPort& port) {
    return port.open({.bytesCame = [this](ByteView bytes) { _came.append(bytes.begin(), bytes.end()); },
                      .wentAway = [this] { _hasGone = true; }});
  }
  void write(const std::string& bytes) const {
    EXPECT_EQ(::write(_line.number(), bytes.data(), bytes.size()), static_cast<ssize_t>(bytes.size()));
  }

  FileDescriptor _line;
  std::string _name;
  std::string _came;
  bool _hasGone = false;
};

TEST_F(DiagnosticPortTest, BytesPassUnchangedInBothDirections) {
  DiagnosticPort port(_name);
  ASSERT_EQ(open(port), std::nullopt);
  const std::string bytes("\x03\r\n\x11\x13\x7F\x04\0\xFF\x1A", 10);
  write(bytes);
  ASSERT_TRUE(runUntil([&] { return _came.size() >= bytes.size(); }));
  EXPECT_EQ(_came, bytes);
  port.send(Bytes(bytes.begin(), bytes.end()));
  std::string got(20, '\0');
  got.resize(static_cast<std::size_t>(::read(_line.number(), got.data(), got.size())));
  EXPECT_EQ(got, bytes);
}

TEST_F(DiagnosticPortTest, TellsWhenItIsUnpluggedAndMayBeOpenedAgain) {
  DiagnosticPort port(_name);
  ASSERT_EQ(open(port), std::nullopt);
  _line = FileDescriptor();
  ASSERT_TRUE(runUntil([&] { return _hasGone; }));
  EXPECT_TRUE(open(port));
}

TEST_F(DiagnosticPortTest, IsForOneProgramAloneUntilItIsClosed) {
  DiagnosticPort first(_name), second(_name);
  ASSERT_EQ(open(first), std::nullopt);
  EXPECT_THAT(
      open(second).value_or(""),
      StartsWith("another program uses " + _name + "; find it with sudo fuser -v " + _name + ", and end it"));
  first.close();
  EXPECT_EQ(open(second), std::nullopt);
}

TEST_F(DiagnosticPortTest, ASerialLineHasItsSettingsBackWhenItIsClosed) {
  const FileDescriptor other(::open(_name.c_str(), O_RDWR | O_NOCTTY | O_CLOEXEC));
  const auto settings = [&] {
    termios now{};
    EXPECT_EQ(::tcgetattr(other.number(), &now), 0);
    return now;
  };
  const auto echoesLines = [&] { return (settings().c_lflag & (ICANON | ECHO)) == (ICANON | ECHO); };
  termios twoStopBits = settings();
  twoStopBits.c_cflag |= CSTOPB;
  twoStopBits.c_cc[VMIN] = 7;
  ASSERT_EQ(::tcsetattr(other.number(), TCSANOW, &twoStopBits), 0);
  ASSERT_TRUE(echoesLines());
  DiagnosticPort port(_name);
  ASSERT_EQ(open(port), std::nullopt);
  EXPECT_FALSE(echoesLines());
  port.close();
  EXPECT_TRUE(echoesLines());
  EXPECT_NE(settings().c_cflag & CSTOPB, 0u);
  EXPECT_NE(settings().c_oflag & OPOST, 0u);
  EXPECT_EQ(settings().c_cc[VMIN], 7);
}

// A child with a terminal of its own.
TEST_F(DiagnosticPortTest, TheTerminalOfTheServerIsRefused) {
  const pid_t child = ::fork();
  ASSERT_GE(child, 0);
  if (child == 0) {
    // The first terminal that a new session opens is its own.
    if (::setsid() < 0 || ::open(_name.c_str(), O_RDWR | O_CLOEXEC) < 0) ::_exit(2);
    DiagnosticPort general("/dev/tty"), named(_name);
    const std::string rest =
        " is the terminal of this server and no modem's port; name a port of the modem (ls -l "
        "/dev/serial/by-id)";
    ::_exit(open(general) == "/dev/tty" + rest && open(named) == _name + rest ? 0 : 1);
  }
  int status = 0;
  ASSERT_EQ(::waitpid(child, &status, 0), child);
  ASSERT_TRUE(WIFEXITED(status));
  EXPECT_EQ(WEXITSTATUS(status), 0);
}

TEST_F(DiagnosticPortTest, ADeviceThatIsNoSerialLineNeedsNoSettings) {
  DiagnosticPort port("/dev/zero");
  ASSERT_EQ(open(port), std::nullopt);
  EXPECT_TRUE(runUntil([&] { return _came.size() > 100'000; }));
  EXPECT_FALSE(_hasGone);
}

TEST_F(DiagnosticPortTest, SaysWhatIsNotThere) {
  DiagnosticPort missing("/dev/no-such-device"), below("/dev/null/port");
  EXPECT_EQ(
      open(missing),
      "there is no device /dev/no-such-device; plug the modem in, or look for its ports with ls /dev/tty* "
      "/dev/wwan*");
  EXPECT_THAT(open(below).value_or(""), StartsWith("there is no device /dev/null/port; "));
}

TEST_F(DiagnosticPortTest, AFileIsNoDevice) {
  const TemporaryFolder folder;
  std::ofstream(folder.file("walk.pcap")) << "x";
  DiagnosticPort port(folder.file("walk.pcap"));
  EXPECT_EQ(open(port), folder.file("walk.pcap") + " is no device; to play a file back, type --replay " +
                            folder.file("walk.pcap"));
}

TEST_F(DiagnosticPortTest, AFolderIsNoDeviceAndCannotBePlayedBack) {
  const TemporaryFolder folder;
  DiagnosticPort port(folder.path());
  EXPECT_EQ(open(port), folder.path().string() +
                            " is no device; look for the modem's ports with ls /dev/tty* /dev/wwan*");
}

TEST_F(DiagnosticPortTest, WhoMayNotOpenItLearnsWhichGroupMay) {
  const uid_t user = ::geteuid();
  if (user == 0) {
    ASSERT_EQ(::chown(_name.c_str(), 65534, 65534), 0);
  }
  ASSERT_EQ(::chmod(_name.c_str(), 0060), 0);
  struct stat status {};
  ASSERT_EQ(::stat(_name.c_str(), &status), 0);
  if (user == 0) {
    ASSERT_EQ(::seteuid(65534), 0);  // root may open everything
  }
  DiagnosticPort port(_name);
  const std::string ofGroup = open(port).value_or("");
  ASSERT_EQ(::seteuid(user), 0);
  const group* const owner = ::getgrgid(status.st_gid);
  const std::string name = owner ? owner->gr_name : std::to_string(status.st_gid);
  EXPECT_EQ(ofGroup, "you may not open " + _name + ", which belongs to the group " + name +
                         "; type sudo usermod -aG " + name + " $USER, log out, and log in again");
}

// A folder of processes as the system shows them: process 7 has the device open.
TEST_F(DiagnosticPortTest, HoldersAreNamedAsFarAsTheSystemShowsThem) {
  const TemporaryFolder folder;
  for (const char* process : {"7", "8", "self"})
    std::filesystem::create_directories(folder.path() / process / "fd");
  std::ofstream(folder.path() / "7" / "comm") << "ModemManager\n";
  std::filesystem::create_symlink("/dev/null", folder.path() / "7" / "fd" / "3");
  std::filesystem::create_symlink(_name, folder.path() / "7" / "fd" / "4");
  std::filesystem::create_symlink("/dev/null", folder.path() / "8" / "fd" / "3");
  std::filesystem::create_symlink(_name, folder.path() / "self" / "fd" / "3");
  std::filesystem::create_directories(folder.path() / "9" / "fd");
  std::ofstream(folder.path() / "9" / "cmdline") << "/usr/bin/a-program-of-long-name" << '\0' << "-x";
  std::ofstream(folder.path() / "9" / "comm") << "a-program-of-lo\n";
  struct stat status {};
  ASSERT_EQ(::stat(_name.c_str(), &status), 0);
  EXPECT_THAT(holdersOf(status.st_rdev, folder.path()), ElementsAre("ModemManager (process 7)"));
  std::filesystem::create_symlink(_name, folder.path() / "8" / "fd" / "4");
  std::filesystem::create_symlink(_name, folder.path() / "9" / "fd" / "4");
  EXPECT_THAT(
      holdersOf(status.st_rdev, folder.path()),
      ElementsAre("ModemManager (process 7)", "a program (process 8)", "a-program-of-long-name (process 9)"));
  EXPECT_THAT(holdersOf(status.st_rdev, folder.path() / "none"), IsEmpty());
}

// A user sees the name of a process of root, and not what it has open.
TEST_F(DiagnosticPortTest, ModemManagerRunsWhenAProcessHasItsName) {
  const TemporaryFolder folder;
  const auto add = [&](const char* process, const char* name) {
    std::filesystem::create_directories(folder.path() / process);
    std::ofstream(folder.path() / process / "comm") << name << '\n';
  };
  EXPECT_FALSE(runsModemManager(folder.path() / "none"));
  add("7", "NetworkManager");
  add("bus", "ModemManager");
  EXPECT_FALSE(runsModemManager(folder.path()));
  add("812", "ModemManager");
  EXPECT_TRUE(runsModemManager(folder.path()));
}

TEST_F(DiagnosticPortTest, WhatPlaysAModemOnAPseudoTerminalDoesNotHoldIt) {
  struct stat status {};
  ASSERT_EQ(::stat(_name.c_str(), &status), 0);
  const TemporaryFolder folder;
  std::filesystem::create_directories(folder.path() / "7" / "fd");
  std::filesystem::create_directories(folder.path() / "7" / "fdinfo");
  std::filesystem::create_symlink(_name, folder.path() / "7" / "fd" / "4");
  std::filesystem::create_symlink("/dev/ptmx", folder.path() / "7" / "fd" / "5");
  const std::string number = _name.substr(_name.rfind('/') + 1);
  std::ofstream(folder.path() / "7" / "fdinfo" / "5") << "pos:\t0\ntty-index:\t" + number + "1\n";
  EXPECT_THAT(holdersOf(status.st_rdev, folder.path()), ElementsAre("a program (process 7)"));
  std::ofstream(folder.path() / "7" / "fdinfo" / "5") << "pos:\t0\ntty-index:\t" + number + "\n";
  EXPECT_THAT(holdersOf(status.st_rdev, folder.path()), IsEmpty());
}

TEST_F(DiagnosticPortTest, AnotherProcessThatHoldsItIsNamed) {
  const Process holder("/bin/sh", {"-c", "exec sleep 600 <" + _name});
  struct stat status {};
  ASSERT_EQ(::stat(_name.c_str(), &status), 0);
  const auto isSleep = testing::Contains(StartsWith("sleep (process "));
  ASSERT_TRUE(eventually([&] { return testing::Value(holdersOf(status.st_rdev), isSleep); }))
      << testing::PrintToString(holdersOf(status.st_rdev));
  DiagnosticPort port(_name);
  EXPECT_THAT(open(port).value_or(""),
              testing::MatchesRegex("sleep \\(process [0-9]+\\) uses .*; end it first"));
}

TEST(PortTroubles, SayWhatToDo) {
  EXPECT_EQ(
      troubleOfPermission("/dev/ttyUSB0", "dialout"),
      "you may not open /dev/ttyUSB0, which belongs to the group dialout; type sudo usermod -aG dialout "
      "$USER, log out, and log in again");
  EXPECT_EQ(troubleOfPermission("/dev/ttyUSB0", ""),
            "you may not open /dev/ttyUSB0, and no group may; start the server with sudo");
  EXPECT_EQ(troubleOfUnknownHolder("/dev/ttyUSB0", false),
            "another program uses /dev/ttyUSB0; find it with sudo fuser -v /dev/ttyUSB0, and end it");
  EXPECT_EQ(
      troubleOfUnknownHolder("/dev/ttyUSB0", true),
      "another program uses /dev/ttyUSB0; find it with sudo fuser -v /dev/ttyUSB0, and end it. "
      "ModemManager runs and may be that program; --inhibit asks it to leave the modem alone, which cuts "
      "the modem's data connection");
  EXPECT_EQ(troubleOfBusy("/dev/ttyUSB0", {"ModemManager (process 812)"}),
            "ModemManager (process 812) uses /dev/ttyUSB0; type --inhibit too, which cuts the modem's data "
            "connection, or sudo systemctl stop ModemManager");
  EXPECT_EQ(troubleOfBusy("/dev/ttyUSB0", {"minicom (process 812)"}),
            "minicom (process 812) uses /dev/ttyUSB0; end it first");
  EXPECT_EQ(troubleOfBusy("/dev/ttyUSB0", {"a (process 1)", "b (process 2)"}),
            "a (process 1) and b (process 2) use /dev/ttyUSB0; end them first");
  EXPECT_EQ(troubleOfBusy("/dev/ttyUSB0", {"a (process 1)", "b (process 2)", "c (process 3)"}),
            "a (process 1), b (process 2), and c (process 3) use /dev/ttyUSB0; end them first");
  EXPECT_EQ(troubleOfBusy("/dev/ttyUSB0", {"a (process 1)", "b (process 2)", "c (process 3)", "d (process 4)",
                                           "e (process 5)"}),
            "a (process 1), b (process 2), c (process 3), and 2 more use /dev/ttyUSB0; end them first");
  EXPECT_EQ(troubleOf({PortFailure::Kind::AnswersText}, "/dev/ttyUSB2"),
            "/dev/ttyUSB2 takes AT commands and is no diagnostic port; a modem has several ports, so try the "
            "next one (ls -l /dev/serial/by-id)");
  EXPECT_EQ(troubleOf({PortFailure::Kind::AnswersNothing}, "/dev/ttyUSB1"),
            "/dev/ttyUSB1 does not answer as a diagnostic port, and may be the modem's port for AT commands; "
            "a modem "
            "has several ports, so try the next one (ls -l /dev/serial/by-id), or unplug the modem and plug "
            "it in again");
}

}  // namespace
}  // namespace varnel
