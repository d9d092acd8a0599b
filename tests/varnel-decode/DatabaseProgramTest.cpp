#include <gmock/gmock.h>

#include <filesystem>

#include "programs/varnel-decode/database/Sqlite.h"
#include "tests/varnel-decode/DecodeProgram.h"

namespace varnel {
namespace {

using ::testing::ElementsAre;
using ::testing::HasSubstr;

class DecodeIntoDatabase : public DecodeProgram {
 protected:
  DecodeIntoDatabase() {
    std::filesystem::current_path(folder.path());
    write("a",
          pcapHeader() + pcapRecord(afternoon, 0, antennas(2)) + pcapRecord(afternoon + 3, 0, antennas(4)));
    write("b", pcapHeader() + pcapRecord(afternoon, 0, antennas(1)));
    write("bad", pcapHeader() + pcapRecord(afternoon, 0, packet(0xFF, 0, "?")));
    write("damaged", pcapHeader() + pcapRecord(afternoon, 0, antennas(2)) + "half");
    write("list", "a\nb\nbad\nmissing\ndamaged\n");
  }
  ~DecodeIntoDatabase() override { std::filesystem::current_path(before); }

  static Result runLte(std::vector<std::string> arguments) {
    arguments.insert(arguments.begin(), {"--technology", "kalvi-lte", "--log-level", "-1"});
    return run(std::move(arguments));
  }

  static std::vector<std::string> rowsOf(const std::string& database, const std::string& query) {
    SqliteConnection connection(database, SqliteConnection::Mode::ReadOnly);
    SqliteStatement statement(connection, query);
    std::vector<std::string> rows;
    while (statement.next()) rows.push_back(statement.text(0).value_or("NULL"));
    return rows;
  }
  static std::vector<std::string> changesIn(const std::string& database) {
    return rowsOf(database,
                  "SELECT capture || '|' || time || '|' || path || '=' || coalesce(text, '-') FROM "
                  "value_changes ORDER BY capture, time, path");
  }
  static std::vector<std::string> capturesIn(const std::string& database) {
    return rowsOf(database,
                  "SELECT path || '|' || status || '|' || coalesce(why, '') || '|' || coalesce(records, '') "
                  "FROM captures ORDER BY path");
  }

  const std::filesystem::path before = std::filesystem::current_path();
};

TEST_F(DecodeIntoDatabase, EachCaptureIsThereWithWhatBecameOfIt) {
  const Result result = runLte({"--files-from", "list", "--sqlite", "all.db", "--jobs", "2"});
  EXPECT_EQ(result.status, 1);
  EXPECT_EQ(result.output, "");
  EXPECT_FALSE(std::filesystem::exists("all.db-journal"));
  const auto captures = capturesIn("all.db");
  ASSERT_EQ(captures.size(), 5u);
  EXPECT_EQ(captures[0], "a|decoded||2");
  EXPECT_EQ(captures[1], "b|decoded||1");
  EXPECT_THAT(captures[2], HasSubstr("bad|aborted|Aborted: ended by "));
  EXPECT_THAT(captures[3], HasSubstr("damaged|failed|damaged, record 2: "));
  EXPECT_THAT(captures[4], HasSubstr("missing|failed|cannot open missing: "));
  EXPECT_THAT(changesIn("all.db"),
              ElementsAre("a|2024-03-01T14:05:11.000Z|Serving Cell Info/Num Tx Antennas=2",
                          "a|2024-03-01T14:05:12.000Z|Serving Cell Info/Num Tx Antennas=4",
                          "b|2024-03-01T14:05:09.000Z|Serving Cell Info/Num Tx Antennas=1",
                          "damaged|2024-03-01T14:05:09.000Z|Serving Cell Info/Num Tx Antennas=2"));
}

TEST_F(DecodeIntoDatabase, PartsAndProcessesAndOneRunHaveTheSameRows) {
  runLte({"--files-from", "list", "--sqlite", "all.db"});
  for (const char* part : {"1/3", "2/3", "3/3"}) {
    runLte({"--files-from", "list", "--part", part, "--sqlite", "together.db", "--jobs", "3"});
    runLte({"--files-from", "list", "--part", part, "--sqlite", std::string("part") + part[0]});
  }
  const Result merged = run({"--sqlite", "merged.db", "--merge", "part3", "part1", "part2"});
  EXPECT_EQ(merged.status, 0) << merged.error;
  EXPECT_EQ(merged.output, "{\"Captures\":5}\n");
  for (const char* database : {"together.db", "merged.db"}) {
    EXPECT_EQ(changesIn(database), changesIn("all.db"));
    EXPECT_EQ(capturesIn(database), capturesIn("all.db"));
  }
}

TEST_F(DecodeIntoDatabase, WhatItHasIsLeftWhenResumed) {
  write("good", "a\nb\n");
  EXPECT_EQ(runLte({"--files-from", "good", "--sqlite", "all.db"}).status, 0);
  write("b", pcapHeader() + pcapRecord(afternoon, 0, antennas(8)));
  EXPECT_EQ(runLte({"--files-from", "good", "--sqlite", "all.db", "--resume", "--report", "report"}).status,
            0);
  EXPECT_THAT(contentsOf("report"), HasSubstr(R"({"Path":"a","Status":"present")"));
  EXPECT_THAT(contentsOf("report"), HasSubstr(R"({"Path":"b","Status":"decoded")"));
  EXPECT_THAT(changesIn("all.db"), ::testing::Contains(HasSubstr("Antennas=8")));
}

TEST_F(DecodeIntoDatabase, WithAnotherOutputStandardOutputHasThat) {
  EXPECT_EQ(runLte({"--sqlite", "all.db", "--stats", "--format", "json", "a", "b"}).output,
            runLte({"--stats", "--format", "json", "a", "b"}).output);
  EXPECT_EQ(capturesIn("all.db").size(), 2u);
}

TEST_F(DecodeIntoDatabase, ReportsOfCountsAddUp) {
  const auto count = [](const std::vector<std::string>& captures) {
    std::vector<std::string> arguments = {"--stats", "--format", "json"};
    arguments.insert(arguments.end(), captures.begin(), captures.end());
    return runLte(arguments).output;
  };
  write("all.json", count({"a", "b", "damaged"}));
  write("part1", count({"a"}));
  write("part2", count({"damaged", "b"}));
  const Result all = run({"--merge", "all.json"});
  EXPECT_THAT(all.output, ::testing::StartsWith(R"({"Captures":3,"Messages":[{"Name":"0xB0C1",)"));
  EXPECT_THAT(all.output, HasSubstr(R"("Total":{"Received":4,"Decoded":4,)"));
  EXPECT_EQ(run({"--merge", "part2", "part1"}).output, all.output);
}

TEST_F(DecodeIntoDatabase, WhatCannotBeMergedIsOneLine) {
  EXPECT_EQ(runLte({"--sqlite", "all.db", "a"}).status, 0);
  write("text", "no JSON\n");
  write("empty", "");
  const std::pair<std::vector<std::string>, int> cases[] = {
      {{"--merge", "all.db"}, 2},
      {{"--sqlite", "all.db", "--merge", "all.db"}, 2},
      {{"--merge", "text", "--every"}, 2},
      {{"--merge", "text"}, 1},
      {{"--sqlite", "merged.db", "--merge", "empty"}, 1},
      {{"--merge", "missing"}, 1},
      {{"--sqlite", "text", "a"}, 3},
      {{"--sqlite", "a", "a"}, 2},
      {{"--sqlite", "", "a"}, 2},
      {{"--follow", "--every", "--sqlite", "x", "a"}, 2},
  };
  for (const auto& [arguments, status] : cases) {
    const Result result = run(arguments);
    EXPECT_EQ(result.status, status) << ::testing::PrintToString(arguments) << result.error;
    EXPECT_EQ(linesOf(result.error), 1u) << result.error;
  }
}

}  // namespace
}  // namespace varnel
