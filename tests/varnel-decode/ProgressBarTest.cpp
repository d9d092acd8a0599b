#include "programs/varnel-decode/ProgressBar.h"

#include <gmock/gmock.h>
#include <pty.h>
#include <unistd.h>

#include <cstdio>
#include <cstdlib>

#include "tests/varnel-decode/DecodeProgram.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;
using ::testing::ElementsAre;
using ::testing::EndsWith;
using ::testing::HasSubstr;
using ::testing::StartsWith;

// Gets the log lines while the bar is visible.
struct NotingLog final : LogSink {
  void write(int /*priority*/, std::string_view text) override { lines.emplace_back(text); }
  std::vector<std::string> lines;
};

// While the test runs, standard error is a terminal, and on demand standard output too.
class ProgressBarTest : public ::testing::Test {
 protected:
  ProgressBarTest() {
    ::setenv("TERM", "xterm", 1);
    EXPECT_EQ(::openpty(&screen, &terminal, nullptr, nullptr, nullptr), 0);
    ::dup2(terminal, STDERR_FILENO);
    std::string records;
    for (int i = 0; i < 1000; ++i) records += pcapRecord(afternoon, 0, std::string(9000, 'x'));
    std::ofstream(folder.file("capture"), std::ios::binary) << pcapHeader() << records;
  }
  ~ProgressBarTest() override {
    ::dup2(standardError, STDERR_FILENO);
    ::dup2(standardOutput, STDOUT_FILENO);
    for (const int file : {screen, terminal, standardError, standardOutput}) ::close(file);
    setLogSink(nullptr, -1);
  }

  // Reads this many records with a bar. Returns what was on the screen last, before the bar disappeared.
  std::string shown(int records, std::chrono::milliseconds delay = 0ms,
                    ProgressBar::Output output = ProgressBar::Output::LeavesTerminalAlone) {
    const auto capture = openCapture(folder.file("capture"));
    setLogSink(&log, 3);
    {
      ProgressBar bar(*capture, output, log, 3, delay);
      CaptureRecord record;
      for (int i = 0; i < records && capture->next(record); ++i) bar.recordRead();
      if (withLogLine) logError("a line");
    }
    EXPECT_EQ(logSink(), &log) << "the log is back in its place";
    // The text marks the end of what there is to read.
    std::fputs("END", stderr);
    std::string text;
    char part[4096];
    while (!text.ends_with("END")) {
      const ssize_t count = ::read(screen, part, sizeof part);
      if (count <= 0) break;
      text.append(part, static_cast<std::size_t>(count));
    }
    return text;
  }

  TemporaryFolder folder;
  NotingLog log;
  bool withLogLine = false;
  int screen = -1, terminal = -1;
  const int standardError = ::dup(STDERR_FILENO), standardOutput = ::dup(STDOUT_FILENO);
};

TEST_F(ProgressBarTest, ShowsTheShareThatIsReadAndGoesAtTheEnd) {
  // 256 records of 9016 bytes and the file's header, read in pieces of 4 KiB or more: a quarter.
  EXPECT_THAT(shown(256), ::testing::MatchesRegex(
                              "\r\\[##########\\.*\\]  2[56] %  2\\.[23] of 8\\.6 MiB\x1b\\[K\r\x1b\\[KEND"));
}

TEST_F(ProgressBarTest, ShowsNothingBeforeItHasTakenAWhile) { EXPECT_EQ(shown(1000, 1h), "END"); }

TEST_F(ProgressBarTest, ShowsNothingOnWhatIsNoTerminal) {
  ::setenv("TERM", "dumb", 1);
  EXPECT_EQ(shown(1000), "END");
  ::unsetenv("TERM");
  EXPECT_EQ(shown(1000), "END");
}

TEST_F(ProgressBarTest, ALineOfTheLogTakesThePlaceOfTheBar) {
  withLogLine = true;
  EXPECT_THAT(shown(256), EndsWith("MiB\x1b[K\r\x1b[KEND"));
  EXPECT_THAT(log.lines, ElementsAre("a line"));
}

TEST_F(ProgressBarTest, StaysAwayFromLinesThatGoToTheSameTerminal) {
  ::fflush(stdout);
  ::dup2(terminal, STDOUT_FILENO);
  EXPECT_EQ(shown(1000, 0ms, ProgressBar::Output::GoesToTerminalAlongside), "END");
  EXPECT_THAT(shown(256, 0ms, ProgressBar::Output::LeavesTerminalAlone), StartsWith("\r["));
}

TEST_F(ProgressBarTest, IsDrawnBesideLinesThatGoElsewhere) {
  const int nowhere = ::open("/dev/null", O_WRONLY);
  ::fflush(stdout);
  ::dup2(nowhere, STDOUT_FILENO);
  ::close(nowhere);
  EXPECT_THAT(shown(256, 0ms, ProgressBar::Output::GoesToTerminalAlongside), HasSubstr(" %  "));
}

}  // namespace
}  // namespace varnel
