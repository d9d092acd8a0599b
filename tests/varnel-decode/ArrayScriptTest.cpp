#include <gmock/gmock.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <filesystem>

#include "programs/varnel-decode/database/Sqlite.h"
#include "tests/varnel-decode/DecodeProgram.h"

namespace varnel {
namespace {

namespace fs = std::filesystem;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using ::testing::StartsWith;

// The script for Slurm without Slurm. Its parts run like those of an array.
class ArrayScript : public DecodeProgram {
 protected:
  ArrayScript() {
    fs::current_path(folder.path());
    fs::create_directory("tmp");
    std::string list;
    for (int i = 0; i < 7; ++i) {
      const std::string name = "capture " + std::to_string(i);
      std::string records = pcapHeader();
      for (int record = 0; record <= i; ++record)
        records += pcapRecord(afternoon + static_cast<std::uint32_t>(3 * record), 0,
                              antennas(static_cast<char>(1 + (record + i) % 4)));
      write(name, i == 3 ? records + "half" : records);
      list += name + '\n';
    }
    write("list", list + "missing\n");
  }
  ~ArrayScript() override { fs::current_path(before); }

  static Result script(std::vector<std::string> arguments, std::vector<std::string> environment = {}) {
    environment.insert(environment.end(),
                       {"VARNEL_DECODE=" VARNEL_DECODE_PROGRAM, "TMPDIR=" + fs::absolute("tmp").string()});
    Process process(VARNEL_SOURCE_DIR "/packaging/slurm/varnel-array", std::move(arguments),
                    std::move(environment));
    return finish(process);
  }
  static Result task(const std::string& part, std::vector<std::string> environment = {}) {
    return script({"task", "out", part, "--technology", "kalvi-lte", "--log-level", "-1"},
                  std::move(environment));
  }

  static std::vector<std::string> dump(const std::string& database) {
    SqliteConnection connection(database, SqliteConnection::Mode::ReadOnly);
    SqliteStatement statement(connection,
                              "SELECT capture || '|' || elapsed || '|' || path || '|' || text FROM "
                              "value_changes ORDER BY capture, elapsed, path");
    std::vector<std::string> rows;
    while (statement.next()) rows.push_back(statement.text(0).value_or("NULL"));
    return rows;
  }
  static std::vector<std::string> sortedPaths(const std::string& report) {
    std::vector<std::string> paths;
    std::istringstream lines(contentsOf(report));
    for (std::string line; std::getline(lines, line);) paths.push_back(line.substr(0, line.find(",\"Why\"")));
    std::ranges::sort(paths);
    return paths;
  }

  const fs::path before = fs::current_path();
};

TEST_F(ArrayScript, TheTasksTogetherAreOneSerialRun) {
  fs::create_directory("out");
  fs::copy_file("list", "out/list");
  for (const char* part : {"2/3", "3/3", "1/3"}) {
    const Result result = task(part);
    EXPECT_EQ(result.status, 0) << result.error;
  }
  const Result merged = script({"merge", "out", "3"});
  EXPECT_EQ(merged.status, 0) << merged.error;
  const Result serial =
      run({"--files-from", "list", "--technology", "kalvi-lte", "--log-level", "-1", "--stats", "--format",
           "json", "--sqlite", "serial.db", "--report", "serial.jsonl"});
  write("serial.json", serial.output);
  EXPECT_EQ(dump("out/captures.db"), dump("serial.db"));
  EXPECT_GT(dump("serial.db").size(), 10u);
  EXPECT_EQ(contentsOf("out/counts.json"), run({"--merge", "serial.json"}).output);
  EXPECT_EQ(sortedPaths("out/report.jsonl"), sortedPaths("serial.jsonl"));
  EXPECT_FALSE(fs::exists("out/parts-3"));
  EXPECT_TRUE(fs::is_empty("tmp")) << "nothing is left behind";
}

TEST_F(ArrayScript, ATaskThatWasKilledRunsAgainAndOneThatEndedDoesNot) {
  fs::create_directory("out");
  fs::copy_file("list", "out/list");
  const std::string mine = "tmp/varnel-array-" + std::to_string(::getuid()) + "-17-1";
  fs::create_directory(mine);
  write(mine + "/part.db", "half a database");
  const std::vector<std::string> slurm = {"SLURM_ARRAY_JOB_ID=17", "SLURM_ARRAY_TASK_ID=1"};
  EXPECT_EQ(task("/1", slurm).status, 0);
  EXPECT_TRUE(fs::is_empty("tmp"));
  const auto time = fs::last_write_time("out/parts-1/1.db");
  EXPECT_THAT(task("/1", slurm).output, HasSubstr("is there already"));
  EXPECT_EQ(fs::last_write_time("out/parts-1/1.db"), time);
}

TEST_F(ArrayScript, ATerminatedTaskLeavesNothing) {
  fs::create_directory("out");
  write("out/list", folder.file("pipe") + "\n");
  ASSERT_EQ(::mkfifo("pipe", 0600), 0);
  Process process(VARNEL_SOURCE_DIR "/packaging/slurm/varnel-array", {"task", "out", "1/1"},
                  {"VARNEL_DECODE=" VARNEL_DECODE_PROGRAM, "TMPDIR=" + fs::absolute("tmp").string()});
  EXPECT_TRUE(eventually([] {
    const auto place = fs::directory_iterator("tmp");
    return place != fs::directory_iterator() && fs::exists(place->path() / "part.db");
  }));
  process.signal(SIGTERM);
  EXPECT_TRUE(process.waitForEnd());
  EXPECT_EQ(process.exitStatus(), 143);
  EXPECT_TRUE(fs::is_empty("tmp"));
  EXPECT_TRUE(fs::is_empty("out/parts-1"));
}

TEST_F(ArrayScript, AMergeNamesTheTasksThatAreMissing) {
  fs::create_directory("out");
  fs::copy_file("list", "out/list");
  task("2/3");
  const Result result = script({"merge", "out", "3"});
  EXPECT_EQ(result.status, 1);
  EXPECT_EQ(result.error,
            "varnel-array: these tasks have not ended well: 1 3; submit the list again to run them\n");
}

// The wrapper makes the database, and lets no file become as large.
TEST_F(ArrayScript, ATaskWhoseDatabaseIsNotWrittenHasFailed) {
  fs::create_directory("out");
  fs::copy_file("list", "out/list");
  write("limited", "#!/bin/bash\n" VARNEL_DECODE_PROGRAM
                   " --files-from /dev/null --sqlite \"${11}\"\n"
                   "ulimit -f 8; exec " VARNEL_DECODE_PROGRAM " \"$@\"\n");
  fs::permissions("limited", fs::perms::owner_all);
  const std::string decoder = "VARNEL_DECODE=" + fs::absolute("limited").string();
  const std::string place = "TMPDIR=" + fs::absolute("tmp").string();
  Process process(VARNEL_SOURCE_DIR "/packaging/slurm/varnel-array",
                  {"task", "out", "1/1", "--log-level", "-1"}, {decoder, place});
  const Result result = finish(process);
  EXPECT_EQ(result.status, 1);
  EXPECT_THAT(result.error, HasSubstr("ended with status 3"));
  EXPECT_TRUE(fs::is_empty("out/parts-1"));
}

TEST_F(ArrayScript, AMergeMissesCapturesInTheDatabase) {
  fs::create_directory("out");
  fs::copy_file("list", "out/list");
  for (const char* part : {"1/2", "2/2"}) task(part);
  fs::copy_file("out/parts-2/1.db", "out/parts-2/2.db", fs::copy_options::overwrite_existing);
  const Result result = script({"merge", "out", "2"});
  EXPECT_EQ(result.status, 1);
  EXPECT_THAT(result.error, HasSubstr("the database and the report do not have the same captures"));
  EXPECT_FALSE(fs::exists("out/captures.db"));
}

TEST_F(ArrayScript, AWrongOptionOfTheDecoderFailsTheTask) {
  fs::create_directory("out");
  fs::copy_file("list", "out/list");
  const Result result = script({"task", "out", "1/1", "--technology", "none"});
  EXPECT_EQ(result.status, 1);
  EXPECT_THAT(result.error, HasSubstr("ended with status 2"));
  EXPECT_FALSE(fs::exists("out/parts-1/1.jsonl"));
}

// sbatch writes down what it gets, and answers like that of Slurm.
TEST_F(ArrayScript, TheArrayIsAsLargeAsTheListAsks) {
  fs::create_directory("bin");
  write("bin/sbatch", "#!/bin/sh\nprintf '%s|' \"$@\" >>calls\necho >>calls\necho '42;cluster'\n");
  fs::permissions("bin/sbatch", fs::perms::owner_all);
  std::string list;
  for (int i = 0; i < 250; ++i) list += "name " + std::to_string(i) + '\0';
  write("nul", list);
  const std::string path = "PATH=" + fs::absolute("bin").string() + ":/usr/bin:/bin";
  const Result result = script({"submit", "nul", "out", "--identities"}, {path});
  EXPECT_EQ(result.status, 0) << result.error;
  EXPECT_THAT(result.output, HasSubstr("job 42 decodes 250 captures in 3 tasks"));
  const std::string out = fs::canonical("out").string();
  const std::string program = fs::canonical(VARNEL_SOURCE_DIR "/packaging/slurm/varnel-array").string();
  EXPECT_EQ(contentsOf("calls"), "--parsable|--array=1-3|--cpus-per-task=1|--output=" + out +
                                     "/logs/%a.log|" + program + "|task|" + out + "|/3|--identities|\n" +
                                     "--parsable|--dependency=afterany:42|--output=" + out +
                                     "/logs/merge.log|" + program + "|merge|" + out + "|3|\n");
  EXPECT_THAT(contentsOf("out/list"), StartsWith(std::string("varnel-list 1\0"
                                                             "0 name 0\0"
                                                             "0 name 1\0",
                                                             32)));

  fs::create_directories("out/parts-3");
  EXPECT_EQ(script({"submit", "nul", "out", "--identities"}, {path}).status, 0);
  EXPECT_TRUE(fs::exists("out/parts-3")) << "the tasks go on where they were";
  EXPECT_EQ(script({"submit", "nul", "out"}, {path}).status, 0);
  EXPECT_FALSE(fs::exists("out/parts-3")) << "other options make other parts";
}

// The largest capture goes away, and another one grows, while the array runs.
TEST_F(ArrayScript, PartsStayTheSameWhenCapturesChangeWhileTheArrayRuns) {
  fs::create_directory("bin");
  write("bin/sbatch", "#!/bin/sh\necho 42\n");
  fs::permissions("bin/sbatch", fs::perms::owner_all);
  const std::vector<std::string> environment = {"PATH=" + fs::absolute("bin").string() + ":/usr/bin:/bin",
                                                "VARNEL_TASKS=3"};
  const auto submit = [&] {
    return script({"submit", "list", "out", "--technology", "kalvi-lte", "--log-level", "-1"}, environment);
  };
  EXPECT_EQ(submit().status, 0);
  const std::string list = contentsOf("out/list");
  EXPECT_EQ(task("1/3").status, 0);
  fs::rename("capture 6", "capture 7");
  write("capture 0", pcapHeader() + pcapRecord(afternoon, 0, antennas(2) + std::string(4000, 'x')));
  EXPECT_EQ(submit().status, 0);
  EXPECT_EQ(contentsOf("out/list"), list);
  EXPECT_TRUE(fs::exists("out/parts-3/1.jsonl"));
  for (const char* part : {"2/3", "3/3"}) EXPECT_EQ(task(part).status, 0);
  const Result merged = script({"merge", "out", "3"});
  EXPECT_EQ(merged.status, 0) << merged.error;
  const std::string report = contentsOf("out/report.jsonl");
  EXPECT_EQ(linesOf(report), 8u);
  for (int i = 0; i < 7; ++i)
    EXPECT_THAT(report, HasSubstr("\"Path\":\"capture " + std::to_string(i) + "\""));
}

TEST_F(ArrayScript, OptionsThatATaskCannotTakeAreRefusedBeforeAnythingRuns) {
  for (const char* option :
       {"--every", "--csv", "--events", "--jobs", "--output=out", "--sqlite", "another"}) {
    const Result result = script({"submit", "list", "out", "--technology", "kalvi-lte", option});
    EXPECT_EQ(result.status, 2);
    EXPECT_THAT(result.error, StartsWith("varnel-array: " + std::string(option) + " cannot be given"));
  }
  EXPECT_EQ(script({"submit", "list", "out", "--sim"}).error, "varnel-array: --sim needs a value\n");
  EXPECT_FALSE(fs::exists("out"));
}

TEST_F(ArrayScript, NamesAreCountedAsBytes) {
  fs::create_directory("bin");
  write("bin/sbatch", "#!/bin/sh\necho 42\n");
  fs::permissions("bin/sbatch", fs::perms::owner_all);
  write("list", "\xFF\nb\n\xFE\n");
  const std::string path = "PATH=" + fs::absolute("bin").string() + ":/usr/bin:/bin";
  EXPECT_THAT(script({"submit", "list", "out"}, {path, "LC_ALL=C.UTF-8"}).output,
              HasSubstr("decodes 3 captures"));
}

// The program takes a while to end, and writes until then.
TEST_F(ArrayScript, ATerminatedTaskWaitsForTheProgram) {
  fs::create_directory("out");
  fs::copy_file("list", "out/list");
  write("slow",
        "#!/bin/bash\n"
        "trap 'sleep 0.3; mkdir -p \"${11%/*}\"; touch \"${11%/*}/late\"; exit 143' TERM\n"
        "touch begun\nwhile :; do sleep 0.05; done\n");
  fs::permissions("slow", fs::perms::owner_all);
  Process process(
      VARNEL_SOURCE_DIR "/packaging/slurm/varnel-array", {"task", "out", "1/1"},
      {"VARNEL_DECODE=" + fs::absolute("slow").string(), "TMPDIR=" + fs::absolute("tmp").string()});
  EXPECT_TRUE(eventually([] { return fs::exists("begun"); }));
  process.signal(SIGTERM);
  EXPECT_TRUE(process.waitForEnd());
  EXPECT_EQ(process.exitStatus(), 143);
  EXPECT_FALSE(eventually([] { return !fs::is_empty("tmp"); }, std::chrono::seconds(1)));
}

TEST_F(ArrayScript, AnythingElseIsAMistake) {
  for (const std::vector<std::string>& arguments : std::vector<std::vector<std::string>>{
           {}, {"run"}, {"submit", "list"}, {"task", "out", "x"}, {"merge", "out"}, {"merge", "out", "0"}})
    EXPECT_EQ(script(arguments).status, 2) << ::testing::PrintToString(arguments);
  write("empty", "\n\n");
  EXPECT_EQ(script({"submit", "empty", "out"}).error, "varnel-array: the list empty names no capture\n");
}

}  // namespace
}  // namespace varnel
