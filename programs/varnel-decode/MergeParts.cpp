#include "programs/varnel-decode/MergeParts.h"

#include <algorithm>
#include <cerrno>
#include <cstdint>
#include <fstream>
#include <stdexcept>
#include <string>
#include <system_error>

#include "host/FileIdentity.h"
#include "programs/varnel-decode/Options.h"
#include "programs/varnel-decode/ProgramError.h"
#include "programs/varnel-decode/StandardOutput.h"
#include "programs/varnel-decode/StatisticsSum.h"
#include "programs/varnel-decode/database/CaptureDatabase.h"

namespace varnel {

namespace {

constexpr int generalError = 1;

std::ifstream openPart(const std::string& path) {
  std::ifstream file(path, std::ios::binary);
  if (!file) throw std::system_error(errno, std::generic_category(), "cannot open " + path);
  return file;
}

// Returns how many captures the database has then.
std::int64_t addDatabases(const std::vector<std::string>& parts, const std::string& databasePath) {
  CaptureDatabase database(databasePath);
  for (const std::string& part : parts) database.take(part);
  database.removeJournal();
  return database.captureCount();
}

void addReports(const std::vector<std::string>& parts) {
  StatisticsSum sum;
  for (const std::string& part : parts) {
    std::ifstream file = openPart(part);
    sum.add(file, part);
    if (file.bad()) throw std::system_error(errno, std::generic_category(), "cannot read " + part);
  }
  writeOutput(stdout, sum.asJson());
}

}  // namespace

int mergeParts(const std::vector<std::string>& parts, const std::optional<std::string>& databasePath) {
  std::vector<std::string> databases, reports;
  const bool areReadable = succeeds([&] {
    for (const std::string& part : parts) {
      // A report may be empty, but a database that is was never written.
      if (databasePath && openPart(part).peek() == std::ifstream::traits_type::eof())
        throw std::runtime_error(part + " is empty; it is no database of captures");
      (CaptureDatabase::isDatabase(part) ? databases : reports).push_back(part);
    }
  });
  if (!areReadable) return generalError;
  if (!databases.empty() && !databasePath)
    return mistake(databases.front() + " is a database; name the one that gets its captures by --sqlite")
        .code;
  for (const std::string& part : parts)
    if (databasePath && FileIdentity::ofPath(part).isSameFileAs(FileIdentity::ofPath(*databasePath)))
      return mistake("--sqlite " + *databasePath + " is one of the parts; name another file").code;
  bool isDone = true;
  if (databasePath)
    isDone &= succeeds([&] {
      const std::int64_t captures = addDatabases(databases, *databasePath);
      // Otherwise standard output has the sum of the reports.
      if (reports.empty()) writeOutput(stdout, "{\"Captures\":" + std::to_string(captures) + "}\n");
    });
  if (!reports.empty()) isDone &= succeeds([&] { addReports(reports); });
  return isDone ? 0 : generalError;
}

}  // namespace varnel
