#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

struct sqlite3;
struct sqlite3_stmt;

namespace varnel {

/// A connection to an SQLite file. No process may use a connection that its parent has opened. Every function
/// throws std::runtime_error, whose text names the file.
class SqliteConnection final {
 public:
  enum class Mode { ReadOnly, ReadAndWrite };

  /// Opens the file. For reading and writing, makes it when it is missing, readable only to its owner.
  SqliteConnection(const std::string& path, Mode mode);
  SqliteConnection(const SqliteConnection&) = delete;
  SqliteConnection& operator=(const SqliteConnection&) = delete;
  ~SqliteConnection();

  /// Runs SQL without results.
  void run(const std::string& sql);
  std::int64_t number(const std::string& sql);
  /// The key of the row that was inserted last.
  std::int64_t lastKey() const;
  const std::string& path() const { return _path; }

 private:
  friend class SqliteStatement;
  [[noreturn]] void fail() const;

  const std::string _path;
  sqlite3* _connection = nullptr;
};

/// A prepared statement.
class SqliteStatement final {
 public:
  SqliteStatement(SqliteConnection& connection, const std::string& sql);
  SqliteStatement(const SqliteStatement&) = delete;
  SqliteStatement& operator=(const SqliteStatement&) = delete;
  ~SqliteStatement();

  /// Sets a parameter, which counts from 1. Texts must live until the statement has run.
  SqliteStatement& bind(int parameter, std::int64_t number);
  SqliteStatement& bind(int parameter, double number);
  SqliteStatement& bind(int parameter, std::string_view text);
  SqliteStatement& bindNull(int parameter);

  /// The next row; false when there is none, and then the statement can run again.
  bool next();
  /// Runs a statement without rows.
  void run();
  /// A column of the row; they count from 0.
  std::int64_t number(int column) const;
  std::optional<std::string> text(int column) const;

 private:
  SqliteConnection& _connection;
  sqlite3_stmt* _statement = nullptr;
};

/// A transaction. Without `commit` nothing of it remains.
class SqliteTransaction final {
 public:
  /// Waits until no other process writes.
  explicit SqliteTransaction(SqliteConnection& connection);
  SqliteTransaction(const SqliteTransaction&) = delete;
  SqliteTransaction& operator=(const SqliteTransaction&) = delete;
  ~SqliteTransaction();

  void commit();

 private:
  SqliteConnection* _connection;  // null once it is committed
};

}  // namespace varnel
