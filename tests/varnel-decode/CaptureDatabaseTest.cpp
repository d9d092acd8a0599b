#include "programs/varnel-decode/database/CaptureDatabase.h"

#include <gmock/gmock.h>
#include <sys/wait.h>
#include <unistd.h>

#include <csignal>

#include "base/Dictionary.h"
#include "tests/support/Process.h"

namespace varnel {
namespace {

using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using ::testing::Not;

// The rows of a query, with a bar between the columns.
std::vector<std::string> rowsOf(const std::string& path, const std::string& query, int columns) {
  SqliteConnection connection(path, SqliteConnection::Mode::ReadOnly);
  SqliteStatement statement(connection, query);
  std::vector<std::string> rows;
  while (statement.next()) {
    std::string row;
    for (int i = 0; i < columns; ++i) row += (i > 0 ? "|" : "") + statement.text(i).value_or("NULL");
    rows.push_back(row);
  }
  return rows;
}

std::vector<std::string> planOf(const std::string& path, const std::string& query) {
  SqliteConnection connection(path, SqliteConnection::Mode::ReadOnly);
  SqliteStatement statement(connection, "EXPLAIN QUERY PLAN " + query);
  std::vector<std::string> steps;
  while (statement.next()) steps.push_back(statement.text(3).value_or(""));
  return steps;
}

class CaptureDatabaseTest : public ::testing::Test {
 protected:
  static Generation displayAt(std::int64_t seconds, const char* level, const char* cell) {
    Value section = Value::ofDictionary();
    section.dictionary()->set("EARFCN", "1300");
    section.dictionary()->set("Physical Cell ID", cell);
    section.dictionary()->set("Level", level);
    Value display = Value::ofDictionary();
    display.dictionary()->set("Cell", section);
    return {.time = {1709301909 + seconds, 500'000'000},
            .display = display,
            .elapsed = std::chrono::seconds(seconds)};
  }

  // Two displays: -90 and -92.5.
  static void store(const std::string& path, const std::string& capture, const char* cell = "7") {
    ValueChanges changes;
    changes.take(displayAt(2, "-90", cell));
    changes.take(displayAt(4, "-92.5", cell));
    MessageStatistics statistics;
    statistics.add({.outcome = MessageFate::Outcome::Decoded, .logCode = 0xB0C1});
    statistics.setCapture({{std::nullopt, 1}}, {.noiseBytes = 3});
    CaptureDatabase(path).store({.path = capture}, &statistics, &changes);
  }

  static std::vector<std::string> dump(const std::string& path) {
    return rowsOf(path,
                  "SELECT capture, time, elapsed, path, text, number, unit FROM value_changes ORDER BY "
                  "capture, elapsed, path",
                  7);
  }

  TemporaryFolder folder;
  const std::string file = folder.file("captures.db");
};

TEST_F(CaptureDatabaseTest, HasTheCaptureItsCountsItsCellsAndItsChanges) {
  store(file, "a");
  EXPECT_THAT(rowsOf(file, "SELECT path, status, why, bytes, records FROM captures", 5),
              ElementsAre("a|decoded|NULL|NULL|1"));
  EXPECT_THAT(rowsOf(file, "SELECT * FROM counts", 8), ElementsAre("1|0xB0C1|1|1|0|0|0|0"));
  EXPECT_THAT(rowsOf(file, "SELECT kind, count FROM left_out WHERE count > 0", 2),
              ElementsAre("Noise bytes|3"));
  EXPECT_THAT(rowsOf(file, "SELECT capture, radio, channel, identity FROM cells_seen", 4),
              ElementsAre("a|LTE|1300|7"));
  EXPECT_THAT(dump(file), ElementsAre("a|2024-03-01T14:05:11.500Z|2.0|Cell/EARFCN|1300|1300|NULL",
                                      "a|2024-03-01T14:05:11.500Z|2.0|Cell/Level|-90|-90|NULL",
                                      "a|2024-03-01T14:05:11.500Z|2.0|Cell/Physical Cell ID|7|7|NULL",
                                      "a|2024-03-01T14:05:13.500Z|4.0|Cell/Level|-92.5|-92.5|NULL"));
}

TEST_F(CaptureDatabaseTest, ACaptureThatIsStoredAgainIsThereOnce) {
  store(file, "a", "8");
  store(file, "b");
  const auto before = dump(file);
  store(file, "a", "8");
  EXPECT_EQ(dump(file), before);
  for (const char* table : {"captures", "counts", "cells"})
    EXPECT_THAT(rowsOf(file, std::string("SELECT count(*) FROM ") + table, 1), ElementsAre("2")) << table;
}

TEST_F(CaptureDatabaseTest, OnlyItsOwnerMayReadIt) {
  store(file, "a");
  EXPECT_EQ(std::filesystem::status(file).permissions(),
            std::filesystem::perms::owner_read | std::filesystem::perms::owner_write);
}

// No query walks through all values.
TEST_F(CaptureDatabaseTest, TheQueriesUseTheKeys) {
  for (int i = 0; i < 20; ++i) store(file, "capture " + std::to_string(i));
  const std::string course =
      "SELECT time, text, number FROM value_changes WHERE capture = 'capture 3' AND path = 'Cell/Level' "
      "ORDER BY time";
  const std::string captures =
      "SELECT DISTINCT capture FROM cells_seen WHERE channel = 1300 AND identity = 7";
  const std::string levels =
      "SELECT capture, min(number), avg(number), max(number) FROM value_changes WHERE path = 'Cell/Level' "
      "GROUP BY capture";
  for (const std::string& query : {course, captures, levels}) {
    const auto plan = planOf(file, query);
    EXPECT_THAT(plan, Not(::testing::Contains(HasSubstr("SCAN changes"))));
    EXPECT_THAT(plan, Not(::testing::Contains(HasSubstr("SCAN cells"))));
    EXPECT_THAT(plan, Not(::testing::Contains(HasSubstr("SCAN displays"))));
    EXPECT_THAT(plan, Not(::testing::Contains(HasSubstr("AUTOMATIC"))));
  }
  for (const std::string& query : {course, levels})
    EXPECT_THAT(planOf(file, query),
                ::testing::Contains("SEARCH changes USING PRIMARY KEY (capture=? AND path=?)"));
  EXPECT_THAT(planOf(file, captures),
              ::testing::Contains("SEARCH cells USING PRIMARY KEY (channel=? AND identity=?)"));
  EXPECT_THAT(rowsOf(file, course, 3),
              ElementsAre("2024-03-01T14:05:11.500Z|-90|-90", "2024-03-01T14:05:13.500Z|-92.5|-92.5"));
  EXPECT_EQ(rowsOf(file, captures, 1).size(), 20u);
  EXPECT_THAT(rowsOf(file, levels + " LIMIT 1", 4), ElementsAre("capture 0|-92.5|-91.25|-90"));
}

TEST_F(CaptureDatabaseTest, SeveralProcessesWriteToOneFile) {
  std::vector<pid_t> writers;
  for (int writer = 0; writer < 4; ++writer) {
    const pid_t process = ::fork();
    if (process == 0) {
      for (int i = 0; i < 10; ++i) store(file, std::to_string(writer) + '/' + std::to_string(i));
      ::_exit(0);
    }
    writers.push_back(process);
  }
  for (const pid_t writer : writers) {
    int status = -1;
    ::waitpid(writer, &status, 0);
    EXPECT_EQ(status, 0);
  }
  EXPECT_EQ(dump(file).size(), 160u);
  EXPECT_THAT(rowsOf(file, "PRAGMA integrity_check", 1), ElementsAre("ok"));
}

TEST_F(CaptureDatabaseTest, AProcessThatIsKilledLeavesItWhole) {
  store(file, "before");
  const pid_t writer = ::fork();
  if (writer == 0) {
    SqliteConnection connection(file, SqliteConnection::Mode::ReadAndWrite);
    // So small a cache lets the transaction reach the file before it ends.
    connection.run("PRAGMA cache_size = 1; BEGIN IMMEDIATE");
    for (int i = 0; i < 20000; ++i)
      connection.run("INSERT INTO captures(path, status) VALUES('half " + std::to_string(i) +
                     "', 'decoded')");
    connection.run("DELETE FROM changes");
    ::raise(SIGKILL);
  }
  int status = 0;
  ::waitpid(writer, &status, 0);
  ASSERT_TRUE(WIFSIGNALED(status));
  EXPECT_GT(std::filesystem::file_size(file), 500'000u) << "part of it is in the file";
  store(file, "after");
  EXPECT_THAT(rowsOf(file, "SELECT path FROM captures ORDER BY path", 1), ElementsAre("after", "before"));
  EXPECT_EQ(dump(file).size(), 8u);
  EXPECT_THAT(rowsOf(file, "PRAGMA integrity_check", 1), ElementsAre("ok"));
}

TEST_F(CaptureDatabaseTest, PartsTogetherAreTheWhole) {
  const std::string one = folder.file("one"), other = folder.file("other"), merged = folder.file("merged");
  store(file, "a");
  store(file, "b", "8");
  store(file, "c");
  store(one, "c");
  store(one, "a");
  store(other, "b", "8");
  {
    CaptureDatabase database(merged);
    database.take(other);
    database.take(one);
    database.take(other);
  }
  EXPECT_EQ(dump(merged), dump(file));
  for (const std::string query :
       {"SELECT path, status, why, bytes, modified, records, '' FROM captures ORDER BY path",
        "SELECT captures.path, name, received, decoded, '', '', '' FROM counts JOIN captures ON id = capture "
        "ORDER BY 1, 2",
        "SELECT capture, radio, channel, identity, '', '', '' FROM cells_seen ORDER BY 1, 2, 3, 4"})
    EXPECT_EQ(rowsOf(merged, query, 7), rowsOf(file, query, 7));
}

TEST_F(CaptureDatabaseTest, ACaptureIsPresentAsLongAsItDoesNotChange) {
  const std::string a = folder.file("a"), failed = folder.file("failed");
  std::ofstream(a) << "x";
  std::ofstream(failed) << "x";
  CaptureDatabase database(file);
  database.store({.path = a}, nullptr, nullptr);
  database.store({.path = failed, .fate = CaptureFate::Failed, .why = "it is damaged"}, nullptr, nullptr);
  EXPECT_THAT(database.present({a, failed, folder.file("other")}), ElementsAre(true, false, false));
  std::filesystem::last_write_time(a, std::filesystem::last_write_time(a) + std::chrono::seconds(1));
  EXPECT_THAT(database.present({a}), ElementsAre(false));
}

TEST_F(CaptureDatabaseTest, ACaptureThatGrewWhileItWasDecodedIsNotPresent) {
  const std::string a = folder.file("a");
  std::ofstream(a) << "x";
  const CaptureState before = CaptureState::of(a);
  std::ofstream(a, std::ios::app) << "y";
  CaptureDatabase database(file);
  database.store({.path = a}, nullptr, nullptr, before);
  EXPECT_THAT(database.present({a}), ElementsAre(false));
}

TEST_F(CaptureDatabaseTest, AnotherFileIsRefused) {
  std::ofstream(file) << "some text that is no database, and is longer than the header of one is";
  EXPECT_FALSE(CaptureDatabase::isDatabase(file));
  EXPECT_THROW(CaptureDatabase{file}, std::runtime_error);
  const std::string foreign = folder.file("foreign");
  SqliteConnection(foreign, SqliteConnection::Mode::ReadAndWrite).run("CREATE TABLE t(x)");
  EXPECT_TRUE(CaptureDatabase::isDatabase(foreign));
  try {
    CaptureDatabase database(foreign);
    FAIL() << "it was taken";
  } catch (const std::runtime_error& error) {
    EXPECT_EQ(error.what(), foreign + " is no database of captures; name another file");
  }
  EXPECT_THAT(rowsOf(foreign, "SELECT name FROM sqlite_master", 1), ElementsAre("t"));
}

}  // namespace
}  // namespace varnel
