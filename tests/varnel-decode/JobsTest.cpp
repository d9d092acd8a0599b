#include "programs/varnel-decode/Jobs.h"

#include <gmock/gmock.h>
#include <unistd.h>

#include <chrono>
#include <csignal>
#include <cstdio>
#include <thread>

#include "tests/varnel-decode/DecodeProgram.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;
using ::testing::HasSubstr;

// The files that the jobs leave in a folder tell how many of them ran at the same time.
class JobsTest : public ::testing::Test {
 protected:
  static std::vector<std::string> names(std::size_t count) {
    return std::vector<std::string>(count, "piece");
  }

  static std::size_t filesIn(const TemporaryFolder& folder) {
    return static_cast<std::size_t>(std::distance(std::filesystem::directory_iterator(folder.path()), {}));
  }

  TemporaryFolder folder;
};

TEST_F(JobsTest, OutputsComeInOrderWhicheverPieceIsDoneFirst) {
  ::testing::internal::CaptureStdout();
  ::testing::internal::CaptureStderr();
  const int status = runJobs(names(4), 4, [this](std::size_t piece) {
    std::printf("begin %zu\n", piece);
    std::fflush(stdout);
    // The last one ends first: each of the others waits for the next one.
    const auto mark = [this](std::size_t which) { return folder.file(std::to_string(which)); };
    if (piece < 3 && !eventually([&] { return std::filesystem::exists(mark(piece + 1)); })) return 1;
    std::ofstream(mark(piece)).flush();
    std::printf("end %zu\n", piece);
    std::fprintf(stderr, "error %zu\n", piece);
    return 0;
  });
  EXPECT_EQ(status, 0);
  EXPECT_EQ(::testing::internal::GetCapturedStdout(),
            "begin 0\nend 0\nbegin 1\nend 1\nbegin 2\nend 2\nbegin 3\nend 3\n");
  EXPECT_EQ(::testing::internal::GetCapturedStderr(), "error 0\nerror 1\nerror 2\nerror 3\n");
}

TEST_F(JobsTest, AsManyRunAtTheSameTimeAsAllowedAndNoMore) {
  for (const unsigned most : {1U, 3U}) {
    const TemporaryFolder begun;
    ::testing::internal::CaptureStdout();
    runJobs(names(9), most, [&](std::size_t piece) {
      const std::string mark = folder.file(std::to_string(piece));
      std::ofstream(mark).flush();
      // No job ends before as many have begun as may run at once. So the last of these sees them all.
      std::printf("%zu ", filesIn(folder));
      std::ofstream(begun.file(std::to_string(piece))).flush();
      const bool haveMetAll = eventually([&] { return filesIn(begun) >= most; });
      std::filesystem::remove(mark);
      return haveMetAll ? 0 : 1;
    });
    const std::string seen = ::testing::internal::GetCapturedStdout();
    EXPECT_THAT(seen, HasSubstr(std::to_string(most) + ' '));
    for (std::size_t more = most + 1; more <= 9; ++more)
      EXPECT_THAT(seen, ::testing::Not(HasSubstr(std::to_string(more) + ' ')));
  }
}

TEST_F(JobsTest, TheWorstStatusIsReturned) {
  EXPECT_EQ(runJobs(names(4), 2, [](std::size_t piece) { return piece == 1 ? 2 : piece == 3 ? 1 : 0; }), 2);
}

TEST_F(JobsTest, AProcessThatASignalEndsIsToldAndTheOthersGoOn) {
  ::testing::internal::CaptureStdout();
  ::testing::internal::CaptureStderr();
  const int status = runJobs({"a.pcap", "b.pcap"}, 2, [](std::size_t piece) {
    if (piece == 0) ::raise(SIGKILL);
    std::printf("done\n");
    return 0;
  });
  EXPECT_EQ(status, 1);
  EXPECT_EQ(::testing::internal::GetCapturedStdout(), "done\n");
  EXPECT_EQ(::testing::internal::GetCapturedStderr(),
            "varnel-decode: decoding a.pcap was ended by a signal: Killed\n");
}

TEST_F(JobsTest, MorePiecesThanFilesMayBeOpenAreDone) {
  ::testing::internal::CaptureStdout();
  EXPECT_EQ(runJobs(names(700), 64,
                    [](std::size_t piece) {
                      if (piece == 0) std::this_thread::sleep_for(1s);
                      std::printf("%zu\n", piece);
                      return 0;
                    }),
            0);
  EXPECT_EQ(linesOf(::testing::internal::GetCapturedStdout()), 700u);
}

// Only jobs that wait with an output hold files.
TEST_F(JobsTest, APieceThatTakesLongLetsAllOthersGoOn) {
  EXPECT_EQ(runJobs(names(1200), 2,
                    [this](std::size_t piece) {
                      const std::string last = folder.file("last");
                      if (piece == 1199) std::ofstream(last).flush();
                      return piece > 0 || eventually([&] { return std::filesystem::exists(last); }) ? 0 : 1;
                    }),
            0);
}

TEST_F(JobsTest, AfterAFailureThePiecesThatHaveEndedAreTold) {
  const auto pieces = names(3);
  std::vector<std::size_t> told;
  const JobPlan plan{.names = pieces,
                     .mostAtATime = 2,
                     .work =
                         [](std::size_t piece, JobContext&) {
                           while (piece == 0) ::pause();
                           return 0;
                         },
                     .isLeft = [](std::size_t piece) -> bool {
                       if (piece == 2) throw std::runtime_error("the system has no more files");
                       return false;
                     },
                     .ended = [&](const JobEnd& end) { told.push_back(end.piece); }};
  EXPECT_THROW(runJobs(plan), std::runtime_error);
  EXPECT_THAT(told, ::testing::ElementsAre(1u));
}

class DecodeSeveral : public DecodeProgram {
 protected:
  std::string capture(const std::string& name, char count) const {
    return write(name, pcapHeader() + pcapRecord(afternoon, 0, antennas(count)));
  }
};

TEST_F(DecodeSeveral, TextNamesEachCaptureAndLinesOfJsonDoNot) {
  const std::string a = capture("a", 2), b = capture("b", 4);
  const Result paths = run({"--technology", "kalvi-lte", "--jobs", "2", "--format", "paths", a, b});
  EXPECT_EQ(paths.status, 0) << paths.error;
  EXPECT_THAT(paths.output, ::testing::StartsWith("==> " + a + " <==\n/\n"));
  EXPECT_THAT(paths.output, HasSubstr("\n\n==> " + b + " <==\n/\n"));
  const Result json = run({"--technology", "kalvi-lte", "--jobs", "2", "--format", "json", a, b});
  EXPECT_EQ(linesOf(json.output), 2u);
  EXPECT_LT(json.output.find(R"("Num Tx Antennas":"2")"), json.output.find('\n'));
  EXPECT_GT(json.output.find(R"("Num Tx Antennas":"4")"), json.output.find('\n'));
}

TEST_F(DecodeSeveral, TablesHaveOneHeaderAndAColumnForTheCapture) {
  const std::string a = capture("a,b", 2), b = capture("c", 4);
  const Result result = run(
      {"--technology", "kalvi-lte", a, b, "--csv", "Serving Cell Info/Num Tx Antennas", "--log-level", "-1"});
  EXPECT_EQ(result.output, "Capture,Time,Serving Cell Info/Num Tx Antennas\n\"" + a +
                               "\",2024-03-01T14:05:09.000Z,2\n" + b + ",2024-03-01T14:05:09.000Z,4\n");
}

TEST_F(DecodeSeveral, OneThatAbortsOrIsMissingLeavesTheOthersAndIsStatusOne) {
  const std::string good = capture("good", 2);
  const std::string bad = write("bad", pcapHeader() + pcapRecord(afternoon, 0, packet(0xFF, 0, "?")));
  const Result result = run({"--technology", "kalvi-lte", "--log-level", "-1", "--every", "--jobs", "3", bad,
                             folder.file("missing"), good});
  EXPECT_EQ(result.status, 1);
  EXPECT_EQ(linesOf(result.output), 1u) << result.output;
  EXPECT_THAT(result.output, ::testing::StartsWith("{\"Capture\":\"" + good + "\","));
  EXPECT_THAT(result.error, HasSubstr("decoding " + bad + " was ended by a signal: Aborted\n"));
  EXPECT_THAT(result.error, HasSubstr("cannot open " + folder.file("missing")));
}

TEST_F(DecodeSeveral, ACaptureAmongSnapshotsNeedsNoTechnology) {
  const std::string saved = folder.file("saved");
  const std::string a = capture("a", 2);
  EXPECT_EQ(run({"--technology", "kalvi-lte", "--snapshot", saved, a}).status, 0);
  EXPECT_EQ(run({saved, saved}).status, 0);
  EXPECT_EQ(run({saved, a}).status, 0);
}

TEST_F(DecodeSeveral, AnOutputThatCannotBeWrittenIsOneLineAndStatusOne) {
  const Result result =
      runInShell("--log-level -1 " + capture("a", 2) + ' ' + capture("b", 4) + " >/dev/full");
  EXPECT_EQ(result.status, 1);
  EXPECT_EQ(linesOf(result.error), 1u) << result.error;
  EXPECT_THAT(result.error, HasSubstr("standard output"));
}

}  // namespace
}  // namespace varnel
