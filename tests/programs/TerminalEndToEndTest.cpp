#include <fcntl.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/ioctl.h>
#include <sys/stat.h>
#include <termios.h>

#include <algorithm>
#include <filesystem>
#include <optional>
#include <regex>

#include "host/FileDescriptor.h"
#include "tests/support/Tmux.h"

namespace varnel {
namespace {

using testing::AnyOf;
using testing::HasSubstr;
using testing::Not;
using testing::StartsWith;

// A real server, and a real viewer on a terminal.
class TerminalEndToEnd : public testing::Test {
 protected:
  TerminalEndToEnd() { std::filesystem::permissions(_runtime.path(), std::filesystem::perms::owner_all); }

  std::unique_ptr<Process> server(const std::string& technology = "kalvi-lte") const {
    return std::make_unique<Process>(
        VARNEL_TELEPHONYD_PROGRAM,
        std::vector<std::string>{"--simulate", technology, "--seed", "7", "--runtime-dir", _runtime.path()});
  }
  std::string viewerLine(const std::string& more = {}) const {
    return std::string("'") + VARNEL_PROGRAM + "' --runtime-dir '" + _runtime.path().string() +
           "' --device-root '" + _device.path().string() + "' " + more;
  }
  // Starts the viewer from the shell, which tells its end.
  void start(const Tmux& terminal, const std::string& more = {}) const {
    terminal.command("clear; echo before; stty -a >'" + modeFile("before") + "'; " + viewerLine(more) +
                     "; echo \"status $?\"; stty -a >'" + modeFile("after") + "'; echo told");
  }
  std::string modeFile(const std::string& when) const { return _device.file(when); }

  void allowSnapshots() const {
    std::filesystem::create_directories(_device.path() /
                                        "OrvaneInternal/Library/PreferenceBundles/Carrier Settings.bundle");
    std::filesystem::create_directories(logs());
  }
  std::filesystem::path logs() const { return _device.path() / "var/mobile/Library/Logs/CrashReporter"; }

  // The viewer has ended with this status, and the terminal is as it was before.
  void expectLeft(const Tmux& terminal, const std::string& status) const {
    ASSERT_TRUE(terminal.shows("status " + status + "\n"));
    ASSERT_TRUE(terminal.shows("told"));
    EXPECT_THAT(terminal.screen(), StartsWith("before\n"));
    EXPECT_EQ(terminal.state("#{alternate_on} #{cursor_flag} #{mouse_any_flag} #{keypad_cursor_flag}"),
              "0 1 0 0");
    EXPECT_EQ(contentsOf(modeFile("after")), contentsOf(modeFile("before")));
  }
  // The identifier of the viewer, which the shell has started.
  static pid_t viewerOf(const Tmux& terminal) {
    const std::string shell = terminal.state("#{pane_pid}");
    return static_cast<pid_t>(std::stol(contentsOf("/proc/" + shell + "/task/" + shell + "/children")));
  }
  static void signal(const Tmux& terminal, int number) { ::kill(viewerOf(terminal), number); }

  // A capture whose one message is no property list, which ends a viewer of object messages.
  std::string brokenObjectStream() const {
    std::ofstream file(_device.file("broken.pcap"), std::ios::binary);
    const std::string message = "no property list";
    const std::string size{static_cast<char>(message.size()), '\0', '\0', '\0'};
    file << std::string("\x4D\x3C\xB2\xA1\x02\0\x04\0\0\0\0\0\0\0\0\0\0\0\x04\0\x93\0\0\0", 24)
         << std::string(8, '\0') << size << size << message;
    return _device.file("broken.pcap");
  }

  TemporaryFolder _runtime;
  TemporaryFolder _device;
};

TEST_F(TerminalEndToEnd, AUserBrowsesToARowOfAListAndBack) {
  const auto telephony = server();
  const Tmux terminal;
  start(terminal);
  ASSERT_TRUE(terminal.shows(" kalvi-lte — Varnel\n"));
  ASSERT_TRUE(terminal.shows("Neighbor Cells List"));
  ASSERT_TRUE(terminal.shows(" Updated 20"));
  terminal.press({"Down", "Down", "Down", "Enter"});
  ASSERT_TRUE(terminal.shows(" Neighbor Cells List  "));
  terminal.press({"l"});
  ASSERT_TRUE(terminal.shows(" Neighbor Cells List › 0"));
  ASSERT_TRUE(terminal.shows("Measured RSRP"));
  // A value changes: the row is marked.
  ASSERT_TRUE(terminal.shows("•Measured RSRP"));
  terminal.press({"Escape"});
  ASSERT_TRUE(terminal.showsNoMore("Measured RSRP"));
  terminal.press({"h"});
  ASSERT_TRUE(terminal.shows("SIM Info"));
  terminal.press({"q"});
  expectLeft(terminal, "0");
}

TEST_F(TerminalEndToEnd, FindGoesToARowAnywhere) {
  const auto telephony = server();
  const Tmux terminal;
  start(terminal);
  ASSERT_TRUE(terminal.shows("Serving Cell Measurements"));
  terminal.press({"/"});
  terminal.type("serving average rsrp");
  ASSERT_TRUE(terminal.shows("Serving Cell Measurements › Average RSRP"));
  terminal.press({"Enter"});
  ASSERT_TRUE(terminal.shows(" Serving Cell Measurements  "));
  terminal.press({"?"});
  ASSERT_TRUE(terminal.shows("This row: Serving Cell Measurements > Average RSRP"));
  ASSERT_TRUE(terminal.shows("Defined in: 3GPP TS 36.214, 5.1.1"));
  terminal.press({"C-q"});
  expectLeft(terminal, "0");
}

TEST_F(TerminalEndToEnd, CtrlSSavesASnapshot) {
  allowSnapshots();
  const auto telephony = server();
  const Tmux terminal;
  start(terminal);
  ASSERT_TRUE(terminal.shows("s Save"));
  terminal.press({"C-s"});
  ASSERT_TRUE(terminal.shows("[ Cancel ]"));
  terminal.type("drive");
  ASSERT_TRUE(terminal.shows("[drive "));
  terminal.press({"C-s"});
  ASSERT_TRUE(terminal.shows("Saved:"));
  EXPECT_FALSE(std::filesystem::is_empty(logs()));
  terminal.press({"q"});
  expectLeft(terminal, "0");
}

TEST_F(TerminalEndToEnd, TheViewerOutlivesItsServer) {
  auto telephony = server();
  const Tmux terminal;
  start(terminal);
  ASSERT_TRUE(terminal.shows(" Updated 20"));
  telephony.reset();
  ASSERT_TRUE(terminal.shows(" Connecting..."));
  ASSERT_TRUE(terminal.shows("Serving Cell Info")) << "the last display stays";
  telephony = server();
  ASSERT_TRUE(terminal.shows(" Updated 20"));
  terminal.press({"q"});
  expectLeft(terminal, "0");
}

TEST_F(TerminalEndToEnd, FollowsTheSizeOfTheTerminal) {
  const auto telephony = server("all-radios");
  const Tmux terminal;
  start(terminal);
  ASSERT_TRUE(terminal.shows("SIM 1"));
  terminal.press({"Enter"});
  terminal.resize(120, 30);
  ASSERT_TRUE(terminal.shows("│"));
  terminal.resize(20, 5);
  ASSERT_TRUE(terminal.showsNoMore("│"));
  ASSERT_TRUE(terminal.shows(" Updated 20"));
  terminal.resize(1, 1);
  terminal.resize(80, 24);
  ASSERT_TRUE(terminal.shows(" SIM 1  "));
  ASSERT_TRUE(terminal.shows("? Help"));
  terminal.press({"q"});
  ASSERT_TRUE(terminal.shows("status 0"));
}

TEST_F(TerminalEndToEnd, CtrlCAndSignalsLeaveTheTerminalAsItWas) {
  const auto telephony = server();
  const Tmux terminal;
  for (const int number : {0, SIGTERM, SIGINT, SIGHUP}) {
    start(terminal);
    ASSERT_TRUE(terminal.shows(" Updated 20"));
    EXPECT_EQ(terminal.state("#{alternate_on}"), "1");
    if (number == 0) {
      terminal.press({"C-c"});
    } else {
      signal(terminal, number);
    }
    expectLeft(terminal, "0");
  }
}

// A terminal that shows nothing, and whose other end the test reads, or not.
class BareTerminal {
 public:
  explicit BareTerminal(const std::string& shellLine) {
    _other = FileDescriptor(::posix_openpt(O_RDWR | O_NOCTTY | O_CLOEXEC));
    if (::grantpt(_other.number()) != 0 || ::unlockpt(_other.number()) != 0) ADD_FAILURE() << "no terminal";
    const std::string name = ::ptsname(_other.number());
    _own = FileDescriptor(::open(name.c_str(), O_RDWR | O_NOCTTY | O_CLOEXEC));
    const winsize size{24, 80, 0, 0};
    ::ioctl(_own.number(), TIOCSWINSZ, &size);
    ::tcgetattr(_own.number(), &_mode);
    const std::string whole =
        "exec setsid -c sh -c 'exec " + shellLine + "' <" + name + " >" + name + " 2>" + name;
    _program.emplace("/bin/sh", std::vector<std::string>{"-c", whole},
                     std::vector<std::string>{"TERM=xterm-256color", "LC_ALL=C.UTF-8", "NO_COLOR"});
    ::fcntl(_other.number(), F_SETFL, O_NONBLOCK);
  }
  Process& program() { return *_program; }
  void type(std::string_view keys) const {
    EXPECT_EQ(::write(_other.number(), keys.data(), keys.size()), static_cast<ssize_t>(keys.size()));
  }
  // All that was written since the last call and can be had now.
  std::string read() const {
    std::string text;
    char piece[4096];
    for (ssize_t count = 0; (count = ::read(_other.number(), piece, sizeof piece)) > 0;)
      text.append(piece, static_cast<std::size_t>(count));
    return text;
  }
  // How many keys the program has not read.
  int unreadKeys() const {
    int count = 0;
    ::ioctl(_own.number(), FIONREAD, &count);
    return count;
  }
  bool hasItsModeBack() const {
    termios now{};
    ::tcgetattr(_own.number(), &now);
    return now.c_lflag == _mode.c_lflag && now.c_iflag == _mode.c_iflag && now.c_oflag == _mode.c_oflag;
  }

 private:
  FileDescriptor _other;
  FileDescriptor _own;
  termios _mode{};
  std::optional<Process> _program;
};

TEST_F(TerminalEndToEnd, SignalsEndTheProgramWhileNobodyReadsTheTerminal) {
  const auto telephony = server();
  for (const int number : {SIGTERM, SIGHUP, SIGINT}) {
    BareTerminal terminal("\"" VARNEL_PROGRAM "\" --ui terminal --runtime-dir " + _runtime.path().string() +
                          " --device-root " + _device.path().string());
    std::string shown;
    ASSERT_TRUE(eventually([&] {
      return (shown += terminal.read()).find("Updated 20") != std::string::npos;
    })) << shown;
    // From now on the test reads nothing, and makes the program draw until it waits for the terminal.
    ASSERT_TRUE(eventually([&] {
      terminal.type("\x0C");
      if (terminal.unreadKeys() == 0) return false;
      return !eventually([&] { return terminal.unreadKeys() == 0; }, std::chrono::seconds(1));
    }));
    terminal.program().signal(number);
    ASSERT_TRUE(terminal.program().waitForEnd(std::chrono::seconds(60))) << number;
    EXPECT_EQ(terminal.program().exitStatus(), 0);
    EXPECT_TRUE(terminal.hasItsModeBack());
    EXPECT_THAT(terminal.read(), HasSubstr("\x1b[?1049l")) << "the end is there for a reader who comes back";
  }
}

TEST_F(TerminalEndToEnd, AProgramThatAbortsLeavesTheTerminalAsItWas) {
  const auto telephony = server();
  const Tmux terminal;
  for (const int number : {SIGABRT, SIGSEGV, SIGQUIT, SIGALRM, SIGRTMIN}) {
    start(terminal);
    ASSERT_TRUE(terminal.shows(" Updated 20"));
    signal(terminal, number);
    expectLeft(terminal, std::to_string(128 + number));
  }
}

TEST_F(TerminalEndToEnd, WhatEndedTheProgramIsToldBelowTheScreenThatWas) {
  const Process telephony(VARNEL_TELEPHONYD_PROGRAM, {"--replay", brokenObjectStream(), "--technology",
                                                      "ifx-gsm", "--runtime-dir", _runtime.path()});
  const Tmux terminal;
  start(terminal);
  ASSERT_TRUE(terminal.shows("varnel: ended by "));
  expectLeft(terminal, "134");
}

TEST_F(TerminalEndToEnd, CtrlZGivesTheShellBackAndFgReturns) {
  const auto telephony = server();
  const Tmux terminal;
  terminal.command("clear; echo before");
  terminal.command(viewerLine());
  ASSERT_TRUE(terminal.shows(" Updated 20"));
  terminal.press({"C-z"});
  ASSERT_TRUE(terminal.shows("Stopped"));
  EXPECT_EQ(terminal.state("#{alternate_on} #{cursor_flag} #{mouse_any_flag}"), "0 1 0");
  terminal.command("stty -a | grep -o ' icanon.*iexten' && echo in $((1 + 1)) lines");
  ASSERT_TRUE(terminal.shows("in 2 lines"));
  terminal.command("fg");
  ASSERT_TRUE(terminal.shows("Serving Cell Info"));
  EXPECT_EQ(terminal.state("#{alternate_on} #{cursor_flag} #{mouse_any_flag}"), "1 0 1");
  terminal.press({"q"});
  ASSERT_TRUE(terminal.showsNoMore("Serving Cell Info"));
  terminal.command("echo \"status $?\"");
  ASSERT_TRUE(terminal.shows("status 0\n"));
}

TEST_F(TerminalEndToEnd, AViewerThatIsStoppedEndsWhenTheShellAsksForIt) {
  const auto telephony = server();
  for (const bool isInBackground : {false, true}) {
    const Tmux terminal;
    terminal.command(viewerLine(isInBackground ? "&" : ""));
    if (!isInBackground) {
      ASSERT_TRUE(terminal.shows(" Updated 20"));
      terminal.press({"C-z"});
    }
    // The shell tells what its jobs do before it asks for the next line.
    ASSERT_TRUE(eventually([&] {
      terminal.press({"Enter"});
      return terminal.screen().find("Stopped") != std::string::npos;
    })) << terminal.screen();
    const pid_t viewer = viewerOf(terminal);
    terminal.command("bg");
    // This shell does not continue a job that it ends.
    terminal.command("kill %1; bg");
    EXPECT_TRUE(eventually([&] {
      terminal.press({"Enter"});
      return ::kill(viewer, 0) != 0;
    })) << terminal.screen();
    EXPECT_EQ(terminal.state("#{alternate_on}"), "0");
  }
}

TEST_F(TerminalEndToEnd, AProgramThatWasStoppedWithoutWarningGoesOn) {
  const auto telephony = server();
  const Tmux terminal;
  start(terminal);
  ASSERT_TRUE(terminal.shows(" Updated 20"));
  signal(terminal, SIGSTOP);
  ASSERT_TRUE(terminal.shows("Stopped"));
  // This shell leaves the mode as it is, so Return is no end of a line.
  terminal.type("fg");
  terminal.press({"C-j"});
  ASSERT_TRUE(terminal.showsNoMore("Stopped"));
  terminal.press({"l"});
  ASSERT_TRUE(terminal.shows("Tracking Area Code"));
  terminal.press({"q"});
  ASSERT_TRUE(terminal.showsNoMore("Tracking Area Code"));
}

TEST_F(TerminalEndToEnd, LogLinesComeOutAfterTheScreenAndUnderL) {
  const auto telephony = server();
  const Tmux terminal(80, 40);
  start(terminal, "--log-level 3");
  ASSERT_TRUE(terminal.shows(" Updated 20"));
  EXPECT_THAT(terminal.screen(), Not(HasSubstr("Starting the display update timer")));
  terminal.press({"L"});
  ASSERT_TRUE(terminal.shows("<3>Starting the display update timer"));
  terminal.press({"q"});
  ASSERT_TRUE(terminal.showsNoMore("Starting"));
  terminal.press({"q"});
  expectLeft(terminal, "0");
  const std::string screen = terminal.screen();
  EXPECT_THAT(screen, HasSubstr("<3>Starting the display update timer\n"));
  EXPECT_THAT(screen, HasSubstr("Deallocing LTEClassIndex\n")) << "a line for standard output";
}

TEST_F(TerminalEndToEnd, AnUnknownTerminalIsOneLine) {
  const Tmux terminal;
  for (const char* name : {"TERM=no-such-terminal", "TERM=dumb", "TERM="}) {
    terminal.command(std::string("clear; ") + name + " " + viewerLine("--ui terminal") + " 2>'" +
                     _device.file("error") + "'; echo status $?");
    ASSERT_TRUE(terminal.shows("status 1"));
    const std::string error = contentsOf(_device.file("error"));
    EXPECT_THAT(error,
                AnyOf(StartsWith(std::string("varnel: the terminal ") + name + ' '),
                      StartsWith("varnel: TERM is not set, so the kind of this terminal is not known; ")));
    EXPECT_EQ(std::ranges::count(error, '\n'), 1) << error;
  }
}

TEST_F(TerminalEndToEnd, WithoutATerminalThereIsOneLine) {
  Process varnel(VARNEL_PROGRAM,
                 {"--ui", "terminal", "--runtime-dir", _runtime.path(), "--device-root", _device.path()});
  ASSERT_TRUE(varnel.waitForEnd());
  EXPECT_EQ(varnel.exitStatus(), 1);
  EXPECT_EQ(varnel.error(),
            "varnel: --ui terminal needs a terminal as standard input and standard output; --ui text needs "
            "none\n");
}

TEST_F(TerminalEndToEnd, WithoutATerminalAutoIsText) {
  const auto telephony = server();
  Process varnel(VARNEL_PROGRAM,
                 {"--updates", "1", "--runtime-dir", _runtime.path(), "--device-root", _device.path()},
                 {"DISPLAY", "WAYLAND_DISPLAY", "QT_QPA_PLATFORM"});
  ASSERT_TRUE(varnel.waitForEnd());
  EXPECT_EQ(varnel.exitStatus(), 0) << varnel.error();
  EXPECT_THAT(varnel.output(), StartsWith("Connecting...\n"));
}

TEST_F(TerminalEndToEnd, AClosedTerminalEndsTheProgramAlsoWhenItIgnoresHangUps) {
  const auto telephony = server();
  for (const char* trap : {":", "trap '' HUP"}) {
    pid_t viewer = 0;
    {
      const Tmux terminal;
      terminal.command(trap);
      start(terminal);
      ASSERT_TRUE(terminal.shows(" Updated 20"));
      viewer = viewerOf(terminal);
    }
    EXPECT_TRUE(eventually([&] { return ::kill(viewer, 0) != 0; })) << trap;
  }
}

TEST_F(TerminalEndToEnd, NoColorIsKept) {
  const auto telephony = server();
  const std::regex color("\x1b\\[[0-9;]*3[0-9]m");
  for (const char* environment : {"NO_COLOR=1", "NO_COLOR="}) {
    const Tmux terminal;
    const std::string bytes = _device.file(environment);
    terminal.command(std::string("export ") + environment);
    terminal.copyBytesTo(bytes);
    start(terminal);
    ASSERT_TRUE(terminal.shows("•Serving Cell"));
    terminal.press({"q"});
    expectLeft(terminal, "0");
    EXPECT_EQ(std::regex_search(contentsOf(bytes), color), std::string_view(environment) == "NO_COLOR=");
  }
}

TEST_F(TerminalEndToEnd, AClickOpensARow) {
  const auto telephony = server();
  const Tmux terminal;
  start(terminal);
  ASSERT_TRUE(terminal.shows("Serving Cell Info"));
  // Button 1 is pressed and released in the fifth column of the second row.
  terminal.type("\x1b[M %\"\x1b[M#%\"");
  ASSERT_TRUE(terminal.shows(" Serving Cell Info                  "));
  ASSERT_TRUE(terminal.shows("Tracking Area Code"));
  terminal.press({"q"});
  expectLeft(terminal, "0");
}

TEST_F(TerminalEndToEnd, AnAsciiTerminalGetsAscii) {
  const auto telephony = server();
  const Tmux terminal;
  terminal.command("export LC_ALL=C");
  start(terminal);
  ASSERT_TRUE(terminal.shows("Serving Cell Info"));
  ASSERT_TRUE(terminal.shows("*Serving Cell"));
  EXPECT_THAT(terminal.screen(), HasSubstr(" kalvi-lte - Varnel\n"));
  for (const char character : terminal.screen()) ASSERT_LT(static_cast<unsigned char>(character), 0x80);
  terminal.press({"q"});
  expectLeft(terminal, "0");
}

// A server that replays a pipe, so that the test decides what changes.
class TerminalOnAPipe : public TerminalEndToEnd {
 protected:
  TerminalOnAPipe() {
    if (::mkfifo(pipe().c_str(), 0600) != 0) ADD_FAILURE() << "no pipe";
    // With both ends, opening does not wait for the server.
    _writer = FileDescriptor(::open(pipe().c_str(), O_RDWR | O_CLOEXEC));
  }
  std::string pipe() const { return _device.file("pipe"); }
  void write(const std::string& bytes) const {
    EXPECT_EQ(::write(_writer.number(), bytes.data(), bytes.size()), static_cast<ssize_t>(bytes.size()));
  }
  void writeHeader() const {
    write(std::string("\x4D\x3C\xB2\xA1\x02\0\x04\0\0\0\0\0\0\0\0\0\0\0\x04\0\x93\0\0\0", 24));
  }
  // A record of an LTE modem that says how many antennas there are: log code 0xB0C1, version 1.
  void writeAntennas(char second, char antennas) const {
    std::string message = std::string("\x01\x15\0\xC1\xB0", 5) + std::string(8, '\0') + '\1' +
                          std::string(6, '\0') + antennas + '\0';
    message[1] = static_cast<char>(message.size() - 1);
    const std::string size{static_cast<char>(message.size()), '\0', '\0', '\0'};
    write(second + std::string(7, '\0') + size + size + message);
  }

 private:
  FileDescriptor _writer;
};

TEST_F(TerminalOnAPipe, ARefreshThatChangesOneValueTakesLessThan200Bytes) {
  const Process telephony(
      "/bin/sh", {"-c", "exec \"$0\" \"$@\" <'" + pipe() + "'", VARNEL_TELEPHONYD_PROGRAM, "--replay", "-",
                  "--technology", "kalvi-lte", "--runtime-dir", _runtime.path()});
  writeHeader();
  const Tmux terminal;
  start(terminal);
  writeAntennas(1, 1);
  ASSERT_TRUE(terminal.shows("Serving Cell Info"));
  terminal.press({"Enter"});
  ASSERT_TRUE(terminal.shows("Num Tx Antennas"));
  writeAntennas(2, 2);
  ASSERT_TRUE(terminal.shows("•Num Tx Antennas"));
  // The next refresh takes the mark away again, unless it changes the value too.
  writeAntennas(3, 2);
  ASSERT_TRUE(terminal.shows(" Num Tx Antennas"));
  const std::string bytes = _device.file("bytes");
  terminal.copyBytesTo(bytes);
  writeAntennas(4, 4);
  ASSERT_TRUE(terminal.shows("•Num Tx Antennas"));
  ASSERT_TRUE(eventually([&] { return contentsOf(bytes).find('4') != std::string::npos; }));
  const std::size_t written = contentsOf(bytes).size();
  RecordProperty("bytes", std::to_string(written));
  EXPECT_LT(written, 200u) << contentsOf(bytes);
  EXPECT_GT(written, 0u);
  terminal.press({"q"});
  ASSERT_TRUE(terminal.shows("status 0"));
}

}  // namespace
}  // namespace varnel
