#include "programs/varnel-decode/database/CaptureDatabase.h"

#include <sys/stat.h>

#include <algorithm>
#include <charconv>
#include <fstream>
#include <numeric>
#include <stdexcept>

#include "programs/shared/Timestamps.h"

namespace varnel {

namespace {

// "Vrnl": the application to which the file belongs.
constexpr std::int64_t applicationId = 0x56726E6C;
constexpr std::int64_t formatVersion = 1;

// Each change is stored once, in the order of its primary key, and a capture has the highest key when it is
// added. So the rows of a capture go to the end of the table, and need no other index.
constexpr const char* tables = R"(
CREATE TABLE captures(
  id INTEGER PRIMARY KEY,
  path TEXT NOT NULL UNIQUE,
  status TEXT NOT NULL,
  why TEXT,
  bytes INTEGER,
  modified INTEGER,
  records INTEGER);
CREATE TABLE counts(
  capture INTEGER NOT NULL,
  name TEXT NOT NULL,
  received INTEGER NOT NULL,
  decoded INTEGER NOT NULL,
  too_short INTEGER NOT NULL,
  too_long INTEGER NOT NULL,
  unknown INTEGER NOT NULL,
  unknown_version INTEGER NOT NULL,
  PRIMARY KEY(capture, name)) WITHOUT ROWID;
CREATE TABLE unknown_versions(
  capture INTEGER NOT NULL,
  name TEXT NOT NULL,
  version TEXT NOT NULL,
  messages INTEGER NOT NULL,
  PRIMARY KEY(capture, name, version)) WITHOUT ROWID;
CREATE TABLE left_out(
  capture INTEGER NOT NULL,
  kind TEXT NOT NULL,
  count INTEGER NOT NULL,
  PRIMARY KEY(capture, kind)) WITHOUT ROWID;
CREATE TABLE cells(
  channel INTEGER NOT NULL,
  identity NUMERIC NOT NULL,
  radio TEXT NOT NULL,
  capture INTEGER NOT NULL,
  PRIMARY KEY(channel, identity, radio, capture)) WITHOUT ROWID;
CREATE INDEX cells_by_capture ON cells(capture);
CREATE TABLE paths(
  id INTEGER PRIMARY KEY,
  path TEXT NOT NULL,
  unit TEXT NOT NULL,
  UNIQUE(path, unit));
CREATE TABLE displays(
  capture INTEGER NOT NULL,
  display INTEGER NOT NULL,
  time TEXT,
  elapsed REAL NOT NULL,
  PRIMARY KEY(capture, display)) WITHOUT ROWID;
CREATE TABLE changes(
  capture INTEGER NOT NULL,
  path INTEGER NOT NULL,
  display INTEGER NOT NULL,
  text TEXT,
  number NUMERIC,
  PRIMARY KEY(capture, path, display)) WITHOUT ROWID;
CREATE VIEW value_changes AS
  SELECT captures.path AS capture, displays.time AS time, displays.elapsed AS elapsed, paths.path AS path,
         changes.text AS text, changes.number AS number, nullif(paths.unit, '') AS unit
  FROM captures
  JOIN changes ON changes.capture = captures.id
  JOIN paths ON paths.id = changes.path
  LEFT JOIN displays ON displays.capture = changes.capture AND displays.display = changes.display;
CREATE VIEW cells_seen AS
  SELECT captures.path AS capture, cells.radio AS radio, cells.channel AS channel, cells.identity AS identity
  FROM cells JOIN captures ON captures.id = cells.capture;
)";

// What the planner of the queries takes for true: many changes, in the order of captures and paths. Real
// statistics would take a walk through all of them, and without any the planner prefers such a walk.
constexpr const char* assumptions = R"(
ANALYZE sqlite_schema;
INSERT INTO sqlite_stat1 VALUES
  ('captures', 'sqlite_autoindex_captures_1', '1000 1'),
  ('paths', 'sqlite_autoindex_paths_1', '1000 1 1'),
  ('displays', 'displays', '1000000 1000 1'),
  ('cells', 'cells', '100000 300 20 20 1'),
  ('changes', 'changes', '10000000 10000 20 1');
)";

// What belongs to a capture, besides its row in "captures".
constexpr const char* tablesByCapture[] = {"counts", "unknown_versions", "left_out",
                                           "cells",  "displays",         "changes"};

void bindOptional(SqliteStatement& statement, int parameter, const std::optional<std::int64_t>& number) {
  if (number)
    statement.bind(parameter, *number);
  else
    statement.bindNull(parameter);
}

// A plain decimal number.
void bindNumber(SqliteStatement& statement, int parameter, std::string_view number) {
  const char* const end = number.data() + number.size();
  std::int64_t whole = 0;
  if (number.empty()) {
    statement.bindNull(parameter);
  } else if (std::from_chars(number.data(), end, whole).ptr == end) {
    statement.bind(parameter, whole);
  } else {
    double real = 0;
    std::from_chars(number.data(), end, real);
    statement.bind(parameter, real);
  }
}

}  // namespace

CaptureState CaptureState::of(const std::string& path) {
  struct stat status {};
  if (::stat(path.c_str(), &status) != 0 || !S_ISREG(status.st_mode)) return {};
  return {.bytes = status.st_size,
          .modified = std::int64_t{status.st_mtim.tv_sec} * 1'000'000'000 + status.st_mtim.tv_nsec};
}

CaptureDatabase::CaptureDatabase(const std::string& path, Use use)
    : _connection(path, use == Use::Reading ? SqliteConnection::Mode::ReadOnly
                                            : SqliteConnection::Mode::ReadAndWrite) {
  if (use == Use::Writing) {
    _connection.run(
        "PRAGMA journal_mode = TRUNCATE; PRAGMA synchronous = NORMAL; PRAGMA cache_size = -16384");
    makeTables();
  }
  if (_connection.number("PRAGMA application_id") != applicationId)
    throw std::runtime_error(path + " is no database of captures; name another file");
  if (_connection.number("PRAGMA user_version") != formatVersion)
    throw std::runtime_error(path + " comes from another version of this program; name another file");
}

bool CaptureDatabase::isDatabase(const std::string& path) {
  constexpr std::string_view beginning("SQLite format 3\0", 16);
  std::string bytes(beginning.size(), '\0');
  std::ifstream file(path, std::ios::binary);
  return file.read(bytes.data(), static_cast<std::streamsize>(bytes.size())) && bytes == beginning;
}

void CaptureDatabase::removeJournal() { _connection.run("PRAGMA journal_mode = DELETE"); }

std::int64_t CaptureDatabase::captureCount() { return _connection.number("SELECT count(*) FROM captures"); }

// Another process may do the same at the same time.
void CaptureDatabase::makeTables() {
  if (_connection.number("SELECT count(*) FROM sqlite_master") > 0) return;
  SqliteTransaction transaction(_connection);
  if (_connection.number("SELECT count(*) FROM sqlite_master") > 0) return;
  _connection.run(tables);
  _connection.run(assumptions);
  _connection.run("PRAGMA application_id = " + std::to_string(applicationId) +
                  "; PRAGMA user_version = " + std::to_string(formatVersion));
  transaction.commit();
}

void CaptureDatabase::store(const CaptureEntry& capture, const MessageStatistics* statistics,
                            ValueChanges* changes, const std::optional<CaptureState>& state) {
  SqliteTransaction transaction(_connection);
  remove(capture.path);
  const std::int64_t key = addCapture(capture, state ? *state : CaptureState::of(capture.path));
  if (statistics) addCounts(key, *statistics);
  if (changes) addChanges(key, *changes);
  transaction.commit();
}

void CaptureDatabase::remove(const std::string& capture) {
  SqliteStatement find(_connection, "SELECT id FROM captures WHERE path = ?");
  if (!find.bind(1, capture).next()) return;
  const std::string key = std::to_string(find.number(0));
  find.run();
  for (const std::string table : tablesByCapture)
    _connection.run(std::string("DELETE FROM ").append(table).append(" WHERE capture = ").append(key));
  _connection.run("DELETE FROM captures WHERE id = " + key);
}

std::int64_t CaptureDatabase::addCapture(const CaptureEntry& capture, const CaptureState& state) {
  const std::string status(nameOf(capture.fate));
  SqliteStatement add(_connection,
                      "INSERT INTO captures(path, status, why, bytes, modified) VALUES(?, ?, ?, ?, ?)");
  add.bind(1, capture.path).bind(2, status);
  if (capture.why.empty())
    add.bindNull(3);
  else
    add.bind(3, capture.why);
  bindOptional(add, 4, state.bytes);
  bindOptional(add, 5, state.modified);
  add.run();
  return _connection.lastKey();
}

void CaptureDatabase::addCounts(std::int64_t capture, const MessageStatistics& statistics) {
  SqliteStatement setRecords(_connection, "UPDATE captures SET records = ? WHERE id = ?");
  setRecords.bind(1, static_cast<std::int64_t>(statistics.recordCount())).bind(2, capture).run();
  SqliteStatement addCount(_connection, "INSERT INTO counts VALUES(?, ?, ?, ?, ?, ?, ?, ?)");
  SqliteStatement addVersion(_connection, "INSERT INTO unknown_versions VALUES(?, ?, ?, ?)");
  SqliteStatement addLeftOut(_connection, "INSERT INTO left_out VALUES(?, ?, ?)");
  for (const MessageStatistics::Row& row : statistics.rows()) {
    addCount.bind(1, capture).bind(2, row.name);
    for (std::size_t i = 0; i < row.counts.size(); ++i)
      addCount.bind(static_cast<int>(i) + 3, static_cast<std::int64_t>(row.counts[i]));
    addCount.run();
    for (const auto& [version, messages] : row.unknownVersions)
      addVersion.bind(1, capture)
          .bind(2, row.name)
          .bind(3, version)
          .bind(4, static_cast<std::int64_t>(messages))
          .run();
  }
  for (const auto& [kind, count] : statistics.leftOut())
    addLeftOut.bind(1, capture).bind(2, kind).bind(3, static_cast<std::int64_t>(count)).run();
}

std::vector<std::int64_t> CaptureDatabase::pathKeys(const ValueChanges& changes) {
  SqliteStatement find(_connection, "SELECT id FROM paths WHERE path = ? AND unit = ?");
  SqliteStatement add(_connection, "INSERT INTO paths(path, unit) VALUES(?, ?)");
  std::vector<std::int64_t> keys;
  keys.reserve(changes.paths().size());
  for (const ValueChanges::Path& path : changes.paths()) {
    if (find.bind(1, path.name).bind(2, path.unit).next()) {
      keys.push_back(find.number(0));
      find.run();
    } else {
      add.bind(1, path.name).bind(2, path.unit).run();
      keys.push_back(_connection.lastKey());
    }
  }
  return keys;
}

void CaptureDatabase::addChanges(std::int64_t capture, ValueChanges& changes) {
  SqliteStatement addCell(_connection, "INSERT OR IGNORE INTO cells VALUES(?, ?, ?, ?)");
  for (const ShownCell& cell : changes.cells()) {
    bindNumber(addCell, 1, cell.channel);
    addCell.bind(2, cell.identity).bind(3, cell.radio).bind(4, capture).run();
  }
  SqliteStatement addDisplay(_connection, "INSERT INTO displays VALUES(?, ?, ?, ?)");
  std::int64_t display = 0;
  for (const ValueChanges::Display& shown : changes.displays()) {
    const std::string time = shown.time ? timestamp(*shown.time) : std::string();
    addDisplay.bind(1, capture).bind(2, display++);
    if (shown.time)
      addDisplay.bind(3, time);
    else
      addDisplay.bindNull(3);
    addDisplay.bind(4, std::chrono::duration<double>(shown.elapsed).count()).run();
  }
  const std::vector<std::int64_t> keys = pathKeys(changes);
  std::vector<std::size_t> inOrder(keys.size());
  std::iota(inOrder.begin(), inOrder.end(), std::size_t{0});
  std::ranges::sort(inOrder, {}, [&](std::size_t path) { return keys[path]; });
  SqliteStatement addChange(_connection, "INSERT INTO changes VALUES(?, ?, ?, ?, ?)");
  addChange.bind(1, capture);
  changes.visit([&](const ValueChanges::Chunk& chunk) {
    for (const std::size_t path : inOrder) {
      if (path >= chunk.changes.size()) continue;
      addChange.bind(2, keys[path]);
      const EntryFormats& formats = changes.paths()[path].formats;
      for (const ValueChanges::Change& change : chunk.changes[path]) {
        addChange.bind(3, std::int64_t{change.display});
        if (change.size == ValueChanges::Change::noText) {
          addChange.bindNull(4).bindNull(5);
        } else {
          const std::string_view text = chunk.text(change);
          addChange.bind(4, text);
          bindNumber(addChange, 5, formats.number(text));
        }
        addChange.run();
      }
    }
  });
}

std::vector<bool> CaptureDatabase::present(const std::vector<std::string>& captures) {
  SqliteStatement find(_connection,
                       "SELECT bytes, modified FROM captures WHERE path = ? AND status = 'decoded' AND "
                       "bytes IS NOT NULL");
  std::vector<bool> present;
  present.reserve(captures.size());
  for (const std::string& capture : captures) {
    bool isPresent = false;
    if (find.bind(1, capture).next()) {
      isPresent =
          CaptureState{.bytes = find.number(0), .modified = find.number(1)} == CaptureState::of(capture);
      find.run();
    }
    present.push_back(isPresent);
  }
  return present;
}

void CaptureDatabase::take(const std::string& part) {
  static_cast<void>(CaptureDatabase(part, Use::Reading));
  SqliteStatement(_connection, "ATTACH DATABASE ? AS part").bind(1, part).run();
  {
    SqliteTransaction transaction(_connection);
    _connection.run(
        "CREATE TEMP TABLE old_captures AS SELECT c.id AS id FROM captures AS c JOIN part.captures AS p ON "
        "c.path = p.path");
    for (const std::string table : tablesByCapture)
      _connection.run("DELETE FROM main." + table + " WHERE capture IN (SELECT id FROM old_captures)");
    _connection.run("DELETE FROM main.captures WHERE id IN (SELECT id FROM old_captures)");
    _connection.run(
        "INSERT OR IGNORE INTO main.paths(path, unit) SELECT path, unit FROM part.paths;"
        "CREATE TEMP TABLE new_paths(old INTEGER PRIMARY KEY, new INTEGER NOT NULL);"
        "INSERT INTO new_paths SELECT p.id, m.id FROM part.paths AS p JOIN main.paths AS m ON m.path = "
        "p.path AND m.unit = p.unit");
    const std::int64_t shift = _connection.number("SELECT coalesce(max(id), 0) FROM main.captures");
    const std::string key = "capture + " + std::to_string(shift);
    _connection.run("INSERT INTO main.captures SELECT id + " + std::to_string(shift) +
                    ", path, status, why, bytes, modified, records FROM part.captures ORDER BY id");
    _connection.run("INSERT INTO main.counts SELECT " + key +
                    ", name, received, decoded, too_short, too_long, unknown, unknown_version FROM "
                    "part.counts ORDER BY capture, name");
    _connection.run("INSERT INTO main.unknown_versions SELECT " + key +
                    ", name, version, messages FROM part.unknown_versions ORDER BY capture, name, version");
    _connection.run("INSERT INTO main.left_out SELECT " + key +
                    ", kind, count FROM part.left_out ORDER BY capture, kind");
    _connection.run("INSERT INTO main.cells SELECT channel, identity, radio, " + key + " FROM part.cells");
    _connection.run("INSERT INTO main.displays SELECT " + key +
                    ", display, time, elapsed FROM part.displays ORDER BY capture, display");
    _connection.run("INSERT INTO main.changes SELECT " + key +
                    ", new, display, text, number FROM part.changes CROSS JOIN new_paths ON old = path");
    _connection.run("DROP TABLE old_captures; DROP TABLE new_paths");
    transaction.commit();
  }
  _connection.run("DETACH DATABASE part");
}

}  // namespace varnel
