#include "programs/varnel-decode/database/Sqlite.h"

#include <fcntl.h>
#include <sqlite3.h>

#include <stdexcept>

#include "host/FileDescriptor.h"

namespace varnel {

namespace {

// Other processes write one capture at a time. Very many of them may wait for a slow file system.
constexpr int longestWait_ms = 15 * 60 * 1000;

// So that no name means something else to the library.
std::string asFile(const std::string& path) { return path.starts_with('/') ? path : "./" + path; }

}  // namespace

SqliteConnection::SqliteConnection(const std::string& path, Mode mode) : _path(path) {
  const std::string name = asFile(path);
  const bool isWriting = mode == Mode::ReadAndWrite;
  // The library would let others read a new file.
  if (isWriting) FileDescriptor(::open(name.c_str(), O_RDWR | O_CREAT | O_CLOEXEC, 0600));
  const int flags = isWriting ? SQLITE_OPEN_READWRITE : SQLITE_OPEN_READONLY;
  if (sqlite3_open_v2(name.c_str(), &_connection, flags, nullptr) == SQLITE_OK) {
    sqlite3_busy_timeout(_connection, longestWait_ms);
    return;
  }
  const std::string why = _connection ? sqlite3_errmsg(_connection) : "out of memory";
  sqlite3_close(_connection);
  throw std::runtime_error("cannot open the database " + path + ": " + why);
}

SqliteConnection::~SqliteConnection() { sqlite3_close(_connection); }

void SqliteConnection::fail() const {
  throw std::runtime_error("cannot use the database " + _path + ": " + sqlite3_errmsg(_connection));
}

void SqliteConnection::run(const std::string& sql) {
  if (sqlite3_exec(_connection, sql.c_str(), nullptr, nullptr, nullptr) != SQLITE_OK) fail();
}

std::int64_t SqliteConnection::number(const std::string& sql) {
  SqliteStatement statement(*this, sql);
  return statement.next() ? statement.number(0) : 0;
}

std::int64_t SqliteConnection::lastKey() const { return sqlite3_last_insert_rowid(_connection); }

SqliteStatement::SqliteStatement(SqliteConnection& connection, const std::string& sql)
    : _connection(connection) {
  if (sqlite3_prepare_v2(connection._connection, sql.c_str(), -1, &_statement, nullptr) != SQLITE_OK)
    connection.fail();
}

SqliteStatement::~SqliteStatement() { sqlite3_finalize(_statement); }

SqliteStatement& SqliteStatement::bind(int parameter, std::int64_t number) {
  if (sqlite3_bind_int64(_statement, parameter, number) != SQLITE_OK) _connection.fail();
  return *this;
}

SqliteStatement& SqliteStatement::bind(int parameter, double number) {
  if (sqlite3_bind_double(_statement, parameter, number) != SQLITE_OK) _connection.fail();
  return *this;
}

SqliteStatement& SqliteStatement::bind(int parameter, std::string_view text) {
  const char* const begin = text.data() ? text.data() : "";
  if (sqlite3_bind_text64(_statement, parameter, begin, text.size(), SQLITE_STATIC, SQLITE_UTF8) != SQLITE_OK)
    _connection.fail();
  return *this;
}

SqliteStatement& SqliteStatement::bindNull(int parameter) {
  if (sqlite3_bind_null(_statement, parameter) != SQLITE_OK) _connection.fail();
  return *this;
}

bool SqliteStatement::next() {
  const int result = sqlite3_step(_statement);
  if (result == SQLITE_ROW) return true;
  if (sqlite3_reset(_statement) != SQLITE_OK || result != SQLITE_DONE) _connection.fail();
  return false;
}

void SqliteStatement::run() {
  while (next()) {
  }
}

std::int64_t SqliteStatement::number(int column) const { return sqlite3_column_int64(_statement, column); }

std::optional<std::string> SqliteStatement::text(int column) const {
  const auto* const text = reinterpret_cast<const char*>(sqlite3_column_text(_statement, column));
  if (!text) return std::nullopt;
  return std::string(text, static_cast<std::size_t>(sqlite3_column_bytes(_statement, column)));
}

SqliteTransaction::SqliteTransaction(SqliteConnection& connection) : _connection(&connection) {
  connection.run("BEGIN IMMEDIATE");
}

SqliteTransaction::~SqliteTransaction() {
  if (!_connection) return;
  try {
    _connection->run("ROLLBACK");
  } catch (const std::runtime_error&) {
    // The library has rolled it back already.
  }
}

void SqliteTransaction::commit() {
  _connection->run("COMMIT");
  _connection = nullptr;
}

}  // namespace varnel
