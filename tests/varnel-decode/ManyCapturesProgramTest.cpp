#include <fcntl.h>
#include <gmock/gmock.h>
#include <sys/stat.h>
#include <unistd.h>

#include <chrono>
#include <csignal>
#include <filesystem>

#include "tests/varnel-decode/DecodeProgram.h"

namespace varnel {
namespace {

namespace fs = std::filesystem;
using ::testing::EndsWith;
using ::testing::HasSubstr;
using ::testing::Not;
using ::testing::StartsWith;

// The program, in a folder that is the current one.
class ManyCaptures : public DecodeProgram {
 protected:
  ManyCaptures() { fs::current_path(folder.path()); }
  ~ManyCaptures() override { fs::current_path(before); }

  static void make(const std::string& name, const std::string& contents) {
    if (const fs::path parent = fs::path(name).parent_path(); !parent.empty()) fs::create_directories(parent);
    std::ofstream(name, std::ios::binary) << contents;
  }
  static void makeCapture(const std::string& name, char count) {
    make(name, pcapHeader() + pcapRecord(afternoon, 0, antennas(count)));
  }
  // Its decoder ends by an exception.
  static void makeBadCapture(const std::string& name) {
    make(name, pcapHeader() + pcapRecord(afternoon, 0, packet(0xFF, 0, "?")));
  }

  static Result runLte(std::vector<std::string> arguments) {
    arguments.insert(arguments.begin(), {"--technology", "kalvi-lte", "--log-level", "-1"});
    return run(std::move(arguments));
  }

  const fs::path before = fs::current_path();
};

TEST_F(ManyCaptures, AListNamesThemWithNewlinesOrNulCharacters) {
  makeCapture("a", 2);
  makeCapture("b", 4);
  make("newlines", "a\nb\n");
  make("nul", std::string("a\0b", 3));
  const Result expected = runLte({"a", "b"});
  EXPECT_THAT(expected.output, StartsWith("==> a <==\n"));
  EXPECT_EQ(runLte({"--files-from", "newlines"}).output, expected.output);
  EXPECT_EQ(runLte({"--files-from", "nul"}).output, expected.output);
  EXPECT_EQ(runInShell("--log-level -1 --files-from - <newlines").output, expected.output);
}

TEST_F(ManyCaptures, EvenAListOfOneNamesTheCapture) {
  makeCapture("a", 2);
  make("list", "a");
  EXPECT_THAT(runLte({"--files-from", "list", "--every"}).output, StartsWith("{\"Capture\":\"a\","));
}

TEST_F(ManyCaptures, AnEmptyListIsDoneAtOnce) {
  make("list", "");
  const Result result = runLte({"--files-from", "list", "--report", "report"});
  EXPECT_EQ(result.status, 0);
  EXPECT_EQ(result.output, "");
  EXPECT_EQ(contentsOf("report"), "");
}

TEST_F(ManyCaptures, AListThatIsMissingIsStatusOne) {
  const Result result = runLte({"--files-from", "nowhere"});
  EXPECT_EQ(result.status, 1);
  EXPECT_EQ(result.error, "varnel-decode: cannot read the list nowhere: No such file or directory\n");
}

TEST_F(ManyCaptures, ThePartsTogetherAreTheWhole) {
  for (const char* name : {"a", "b", "c"}) makeCapture(name, 2);
  make("list", "a\nb\nc\n");
  EXPECT_EQ(runLte({"--files-from", "list", "--part", "1/2", "--stats", "--format", "json"}).output,
            runLte({"--stats", "--format", "json", "a", "c"}).output);
  EXPECT_THAT(runLte({"--files-from", "list", "--part", "2/2", "--every"}).output,
              StartsWith("{\"Capture\":\"b\","));
  EXPECT_EQ(runLte({"--files-from", "list", "--part", "4/4", "--every"}).output, "");
}

TEST_F(ManyCaptures, AListWithSizesMakesTheSamePartsWhateverBecomesOfTheCaptures) {
  for (const char* name : {"a", "b", "c"}) makeCapture(name, 2);
  make("list", "a\nb\nc\n");
  const Result written = run({"--files-from", "list", "--write-list", "sized"});
  EXPECT_EQ(written.status, 0) << written.error;
  EXPECT_EQ(written.output, "");
  EXPECT_EQ(contentsOf("sized"), std::string("varnel-list 1\0"
                                             "62 a\0"
                                             "62 b\0"
                                             "62 c\0",
                                             29));
  fs::remove("a");
  EXPECT_THAT(runLte({"--files-from", "sized", "--part", "2/2", "--every"}).output,
              StartsWith("{\"Capture\":\"b\","));
  EXPECT_THAT(runLte({"--files-from", "list", "--part", "2/2", "--every"}).output,
              StartsWith("{\"Capture\":\"c\","))
      << "the sizes of now";
}

TEST_F(ManyCaptures, AListWithSizesIsWrittenAlone) {
  makeCapture("a", 2);
  makeCapture("list", 2);
  for (const std::vector<std::string>& arguments :
       std::vector<std::vector<std::string>>{{"--write-list", "sized", "--every", "a"},
                                             {"--write-list", "", "a"},
                                             {"--write-list", "a", "a"},
                                             {"--write-list", "list", "--files-from", "list"}})
    EXPECT_EQ(run(arguments).status, 2) << ::testing::PrintToString(arguments);
  EXPECT_FALSE(fs::exists("sized"));
}

TEST_F(ManyCaptures, AnInterruptedRunLeavesNoHiddenFile) {
  ASSERT_EQ(::mkfifo("pipe", 0600), 0);
  make("list", "pipe\n");
  Process process(VARNEL_DECODE_PROGRAM, {"--report", "report", "--every", "--files-from", "list"});
  // Without a reader, the pipe cannot be opened like that.
  int writer = -1;
  EXPECT_TRUE(eventually([&] { return (writer = ::open("pipe", O_WRONLY | O_NONBLOCK)) >= 0; },
                         std::chrono::seconds(20)));
  process.signal(SIGINT);
  EXPECT_TRUE(process.waitForEnd());
  ::close(writer);
  const auto names = fs::directory_iterator(".");
  EXPECT_EQ(std::distance(fs::begin(names), fs::end(names)), 2);
}

TEST_F(ManyCaptures, EachHasAnOutputOfItsOwnAsIfItWereAlone) {
  makeCapture("monday/a", 2);
  makeCapture("b", 4);
  makeBadCapture("bad");
  const Result result =
      runLte({"--output", "out", "--every", "--jobs", "2", "monday/a", "b", "bad", "missing"});
  EXPECT_EQ(result.status, 1);
  EXPECT_EQ(result.output, "");
  EXPECT_EQ(contentsOf("out/monday/a.jsonl"), runLte({"--every", "monday/a"}).output);
  EXPECT_EQ(contentsOf("out/b.jsonl"), runLte({"--every", "b"}).output);
  EXPECT_EQ(std::distance(fs::recursive_directory_iterator("out"), {}), 3)
      << "monday, its file, and one file: nothing else is left behind";
}

TEST_F(ManyCaptures, WhatADecoderWroteBeforeItAbortedIsNoOutput) {
  make("bad", pcapHeader() + pcapRecord(afternoon, 0, antennas(2)) +
                  pcapRecord(afternoon + 5, 0, antennas(2)) +
                  pcapRecord(afternoon + 6, 0, packet(0xFF, 0, "?")));
  EXPECT_THAT(runLte({"--every", "bad"}).output, StartsWith("{"));
  const Result result = runLte({"--output", "out", "--every", "bad"});
  EXPECT_EQ(result.status, 1);
  EXPECT_EQ(result.output, "");
  EXPECT_FALSE(fs::exists("out/bad.jsonl"));
}

TEST_F(ManyCaptures, WhatIsThereAndNewerIsLeft) {
  makeCapture("a", 2);
  makeCapture("b", 4);
  EXPECT_EQ(runLte({"--output", "out", "--format", "json", "a", "b"}).status, 0);
  make("out/a.json", "kept");
  fs::last_write_time("out/b.json", fs::last_write_time("b"));
  make("out/b.json.txt", "");
  const Result result =
      runLte({"--output", "out", "--format", "json", "--resume", "--report", "report", "a", "b"});
  EXPECT_EQ(result.status, 0) << result.error;
  EXPECT_EQ(contentsOf("out/a.json"), "kept");
  EXPECT_THAT(contentsOf("out/b.json"), StartsWith("{"));
  EXPECT_THAT(contentsOf("report"),
              StartsWith(R"({"Path":"a","Status":"present","Why":null,"Records":null,)"));
  EXPECT_THAT(contentsOf("report"), HasSubstr(R"({"Path":"b","Status":"decoded","Why":null,"Records":1,)"));
}

TEST_F(ManyCaptures, WhatCouldBeReadOfADamagedOneIsKeptButMadeAgain) {
  make("damaged", pcapHeader() + pcapRecord(afternoon, 0, antennas(2)) + "half");
  const std::vector<std::string> arguments = {"--output", "out",    "--every", "--resume",
                                              "--report", "report", "damaged"};
  for (int round = 0; round < 2; ++round) {
    EXPECT_EQ(runLte(arguments).status, 1);
    EXPECT_THAT(contentsOf("out/damaged.jsonl"), HasSubstr("\"Num Tx Antennas\":\"2\""));
    EXPECT_THAT(contentsOf("report"), StartsWith(R"({"Path":"damaged","Status":"failed","Why":"damaged, )"));
    EXPECT_THAT(contentsOf("report"), HasSubstr("\"Records\":1,"));
  }
}

TEST_F(ManyCaptures, TheReportHasALinePerCaptureInTheirOrder) {
  makeCapture("a", 2);
  makeBadCapture("bad");
  // 0xB0E4 has no version 255; two bytes of noise come before the frame of another command.
  make("list", "a\nbad\nmissing\n");
  const Result result =
      runLte({"--files-from", "list", "--jobs", "3", "--format", "json", "--report", "report"});
  EXPECT_EQ(result.status, 1);
  const std::string report = contentsOf("report");
  EXPECT_EQ(linesOf(report), 3u) << report;
  EXPECT_THAT(
      report,
      StartsWith(
          R"({"Path":"a","Status":"decoded","Why":null,"Records":1,"Left Out":{"Bad checksum":0,"Torn":0,"Other commands":0,"Encrypted":0,"Broken":0,"Too long":0,"Noise bytes":0},"Unknown Versions":[],"Seconds":)"));
  EXPECT_THAT(report, HasSubstr(R"({"Path":"bad","Status":"aborted","Why":"Aborted: ended by )"));
  EXPECT_THAT(report, HasSubstr(R"({"Path":"missing","Status":"failed","Why":"cannot open missing: )"));
  EXPECT_LT(report.find("\"bad\""), report.find("\"missing\""));
}

TEST_F(ManyCaptures, TheReportCountsUnknownVersions) {
  make("a", pcapHeader() + pcapRecord(afternoon, 0, packet(1, 0xB0C1, std::string(40, '\x63'))));
  EXPECT_EQ(run({"--report", "report", "--format", "none", "a"}).status, 0);
  EXPECT_THAT(contentsOf("report"),
              HasSubstr(R"("Unknown Versions":[{"Name":"0xB0C1","Version":"99","Messages":1}])"));
}

TEST_F(ManyCaptures, OutputsThatWouldOverwriteAreMistakes) {
  makeCapture("a", 2);
  make("list", "a\n");
  for (const std::vector<std::string>& arguments :
       std::vector<std::vector<std::string>>{{"--output", "out", "a", "./a"},
                                             {"--report", "a", "a"},
                                             {"--report", "list", "--files-from", "list"},
                                             {"--files-from", "list", "a"},
                                             {"--files-from", ""},
                                             {"--part", "3/2", "a"},
                                             {"--part", "", "a"},
                                             {"--resume", "a"},
                                             {"--output", "out", "--format", "none", "a"},
                                             {"--files-from", "list", "--pcap", "x"},
                                             {"--files-from", "list", "--follow", "--every"},
                                             {}}) {
    const Result result = runLte(arguments);
    EXPECT_EQ(result.status, 2) << ::testing::PrintToString(arguments) << result.error;
    EXPECT_EQ(linesOf(result.error), 1u) << result.error;
  }
  EXPECT_THAT(contentsOf("a"), Not(HasSubstr("Path")));
}

// The outputs of all parts go to one folder.
TEST_F(ManyCaptures, AnOutputThatWouldOverwriteACaptureOfAnotherPartIsAMistake) {
  makeCapture("a", 2);
  makeCapture("a.txt", 4);
  const std::string before = contentsOf("a.txt");
  EXPECT_EQ(runLte({"--output", ".", "--part", "1/2", "a", "a.txt"}).status, 2);
  EXPECT_EQ(contentsOf("a.txt"), before);
  EXPECT_EQ(runLte({"--output", "out", "--part", "1/2", "a", "./a"}).status, 2);
  EXPECT_FALSE(fs::exists("out"));
}

TEST_F(ManyCaptures, AnOutputThatIsTheListTheReportOrTheDatabaseIsAMistake) {
  makeCapture("a", 2);
  makeCapture("b", 4);
  make("b.txt", "a\nb\n");
  fs::create_directory("out");
  const Result list = runLte({"--files-from", "b.txt", "--output", "."});
  EXPECT_EQ(list.status, 2);
  EXPECT_EQ(list.error,
            "varnel-decode: the output of b would overwrite b.txt; name another folder; see varnel-decode "
            "--help\n");
  EXPECT_EQ(contentsOf("b.txt"), "a\nb\n");
  for (const char* option : {"--report", "--sqlite"}) {
    EXPECT_EQ(runLte({"b", "a", "--output", "out", option, "out/a.txt"}).status, 2) << option;
    EXPECT_TRUE(fs::is_empty("out")) << option;
  }
}

TEST_F(ManyCaptures, FewerRunAtATimeWhenTheSystemAllowsFewFiles) {
  std::string names;
  for (int i = 0; i < 40; ++i) {
    names += ' ' + std::to_string(i);
    makeCapture(std::to_string(i), 2);
  }
  Process process("/bin/sh", {"-c", "ulimit -n 80; exec " VARNEL_DECODE_PROGRAM
                                    " --technology kalvi-lte --every --jobs 40 --report report" +
                                        names});
  const Result result = finish(process);
  EXPECT_EQ(result.status, 0) << result.error;
  EXPECT_EQ(linesOf(result.output), 40u);
  EXPECT_EQ(linesOf(contentsOf("report")), 40u);
}

TEST_F(ManyCaptures, AReportIsThereEvenWhenTheSystemAllowsTooFewFiles) {
  makeCapture("a", 2);
  Process process("/bin/sh", {"-c", "exec 3>&- 4>&- 5>&-; ulimit -n 6; exec " VARNEL_DECODE_PROGRAM
                                    " --technology kalvi-lte --every --report report a"});
  const Result result = finish(process);
  EXPECT_EQ(result.status, 3);
  EXPECT_THAT(result.error, HasSubstr("cannot make a temporary file"));
  EXPECT_TRUE(fs::exists("report"));
}

TEST_F(ManyCaptures, AnOutputThatCannotBeWrittenIsOneLineOfTheReport) {
  makeCapture("a", 2);
  makeCapture("b/c", 2);
  make("out/b", "in the way");
  const Result result = runLte({"--output", "out", "--every", "--report", "report", "a", "b/c"});
  EXPECT_EQ(result.status, 3) << "not that of a capture that cannot be decoded";
  EXPECT_THAT(contentsOf("report"),
              HasSubstr(R"({"Path":"b/c","Status":"failed","Why":"cannot write out/b/c.jsonl)"));
  EXPECT_THAT(contentsOf("out/a.jsonl"), EndsWith("}\n"));
}

TEST_F(ManyCaptures, AReportOrADatabaseThatCannotBeWrittenHasAStatusOfItsOwn) {
  makeCapture("a", 2);
  EXPECT_EQ(runLte({"--report", "nowhere/report", "a"}).status, 3);
  EXPECT_EQ(runLte({"--sqlite", "nowhere/all.db", "a"}).status, 3);
  EXPECT_EQ(runLte({"--sqlite", "all.db", "a"}).status, 0);
  Process process("/bin/sh",
                  {"-c", "ulimit -f 16; exec " VARNEL_DECODE_PROGRAM
                         " --technology kalvi-lte --log-level -1 --sqlite all.db --report report a"});
  const Result limited = finish(process);
  EXPECT_EQ(limited.status, 3) << limited.error;
  EXPECT_THAT(contentsOf("report"),
              StartsWith(R"({"Path":"a","Status":"failed","Why":"cannot use the database )"));
}

}  // namespace
}  // namespace varnel
