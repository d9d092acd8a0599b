#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "programs/varnel-decode/CaptureReport.h"
#include "programs/varnel-decode/MessageStatistics.h"
#include "programs/varnel-decode/database/Sqlite.h"
#include "programs/varnel-decode/database/ValueChanges.h"

namespace varnel {

/// What tells whether a capture has changed. Both are absent for what is no file.
struct CaptureState {
  std::optional<std::int64_t> bytes{}, modified{};  ///< the time in nanoseconds since 1970

  static CaptureState of(const std::string& path);
  bool operator==(const CaptureState&) const = default;
};

/// A database of many captures: an SQLite file with what became of each capture, its counts, the cells that
/// it shows, and its values as changes. `docs/formats.md` describes the tables.
///
/// Several processes may write to one file: each capture is one short transaction, which waits for those of
/// the others. The file has a rollback journal, which needs nothing but file locks; it has no write-ahead
/// log, which would need memory that all processes share, and so could not be on a network file system.
/// Every function throws std::runtime_error.
class CaptureDatabase final {
 public:
  enum class Use { Reading, Writing };

  /// For writing, makes the file with its tables when it is missing.
  explicit CaptureDatabase(const std::string& path, Use use = Use::Writing);

  /// Whether the file begins like an SQLite file.
  static bool isDatabase(const std::string& path);

  /// Replaces what the database has of this capture. The next arguments are null when nothing is known. The
  /// state is that from before the capture was opened, because it may grow; absent for its present state.
  void store(const CaptureEntry& capture, const MessageStatistics* statistics, ValueChanges* changes,
             const std::optional<CaptureState>& state = std::nullopt);

  /// Which of the captures the database has, decoded when they had their present size and time.
  std::vector<bool> present(const std::vector<std::string>& captures);

  /// How many captures the database has.
  std::int64_t captureCount();

  /// Copies all captures of another database.
  void take(const std::string& part);

  /// Removes the empty journal beside the file, which saves time between transactions. Another process that
  /// writes makes it again.
  void removeJournal();

 private:
  void makeTables();
  std::int64_t addCapture(const CaptureEntry& capture, const CaptureState& state);
  void addCounts(std::int64_t capture, const MessageStatistics& statistics);
  void addChanges(std::int64_t capture, ValueChanges& changes);
  std::vector<std::int64_t> pathKeys(const ValueChanges& changes);
  void remove(const std::string& capture);

  SqliteConnection _connection;
};

}  // namespace varnel
