#include "programs/varnel-decode/ManyCaptures.h"

#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>
#include <functional>
#include <optional>
#include <stdexcept>
#include <string>
#include <system_error>
#include <vector>

#include "host/OutputFile.h"
#include "programs/varnel-decode/CaptureReport.h"
#include "programs/varnel-decode/Jobs.h"
#include "programs/varnel-decode/OutputTree.h"
#include "programs/varnel-decode/ProgramError.h"
#include "programs/varnel-decode/ProgressBar.h"
#include "programs/varnel-decode/database/CaptureDatabase.h"

namespace varnel {

namespace {

constexpr int generalError = 1;

ByteView bytesOf(std::string_view text) {
  return {reinterpret_cast<const std::uint8_t*>(text.data()), text.size()};
}

// A file of lines that appears when it is whole.
class Report {
 public:
  explicit Report(const std::string& path) : _path(path), _file(path) { check(_file.open()); }

  void write(const CaptureEntry& entry) { check(_file.write(bytesOf(reportLine(entry)))); }
  void finish() { check(_file.finish()); }

 private:
  void check(std::error_code failure) const {
    if (failure) throw std::system_error(failure, "cannot write " + _path);
  }

  const std::string _path;
  OutputFile _file;
};

// Copies standard output, which is a temporary file of this process, to the output of the capture.
// An output that is not whole, or whose capture has changed since `before`, is dated before the capture.
void writeOutputOf(const std::string& capture, const std::filesystem::path& output, bool isWhole,
                   const CaptureState& before) {
  const auto check = [&](std::error_code failure) {
    if (failure) throw std::system_error(failure, "cannot write " + output.string());
  };
  std::error_code failure;
  std::filesystem::create_directories(output.parent_path(), failure);
  check(failure);
  WholeFileWriter file(output);
  check(file.open());
  std::uint8_t piece[1 << 16];
  off_t offset = 0;
  while (true) {
    const ssize_t count = ::pread(STDOUT_FILENO, piece, sizeof piece, offset);
    if (count < 0) throw std::system_error(errno, std::generic_category(), "cannot read a temporary file");
    if (count == 0) break;
    check(file.write({piece, static_cast<std::size_t>(count)}));
    offset += count;
  }
  struct stat status {};
  // What changes later is newer than the last byte that was written here.
  const bool isCurrent = isWhole && CaptureState::of(capture) == before;
  if (!isCurrent && ::stat(capture.c_str(), &status) == 0) {
    --status.st_mtim.tv_sec;
    check(file.dateTo(status.st_mtim));
  }
  check(file.finish());
}

bool hasOutput() {
  struct stat status {};
  return ::fstat(STDOUT_FILENO, &status) == 0 && status.st_size > 0;
}

class ManyCaptures {
 public:
  ManyCaptures(const Options& options, const DecodingServices& services)
      : _options(options),
        _services(services),
        _progress(
            isTerminalThatErases(STDERR_FILENO) ? sizesOf(options.captures) : std::vector<std::uint64_t>(),
            options.jobs) {
    if (options.outputFolder) _tree.emplace(*options.outputFolder, outputEnding(options));
  }

  int run() {
    const bool areUsable = succeeds([this] {
      if (_options.reportPath) _report.emplace(*_options.reportPath);
      lookIntoDatabase();
    });
    if (!areUsable) return notWrittenStatus;
    int status = generalError;
    const auto decodeAll = [&] {
      status = runJobs({.names = _options.captures,
                        .mostAtATime = _options.jobs,
                        .work = [this](std::size_t i, JobContext& context) { return decodeOne(i, context); },
                        .isLeft = [this](std::size_t i) { return isLeft(i); },
                        .ended = [this](const JobEnd& end) { note(end); },
                        .showsOutput = !_tree,
                        .progress = &_progress});
    };
    // After a failure, such as one to open more files, the report has what is known.
    if (!succeeds(decodeAll)) _isNotWritten |= _tree || _report || _options.databasePath;
    if (_report) keep([this] { _report->finish(); });
    if (_options.databasePath) keep([this] { CaptureDatabase(*_options.databasePath).removeJournal(); });
    return _isNotWritten ? notWrittenStatus : status;
  }

 private:
  bool keep(const std::function<void()>& part) {
    const bool isWritten = succeeds(part);
    _isNotWritten |= !isWritten;
    return isWritten;
  }

  // The connection must not be open when other processes are started.
  void lookIntoDatabase() {
    if (!_options.databasePath) return;
    CaptureDatabase database(*_options.databasePath);
    if (_options.isResuming) _isInDatabase = database.present(_options.captures);
  }

  bool isLeft(std::size_t index) const {
    if (!_options.isResuming) return false;
    if (_tree && !_tree->hasNewer(_options.captures[index])) return false;
    return _isInDatabase.empty() || _isInDatabase[index];
  }

  // Runs in a process of its own, whose standard output and standard error are temporary files.
  int decodeOne(std::size_t index, JobContext& context) const {
    const bool isStoring = _options.databasePath.has_value();
    const CaptureState before = CaptureState::of(_options.captures[index]);
    MessageStatistics statistics;
    ValueChanges changes;
    DecodingNotes notes{.bytesRead = context.bytesRead,
                        .statistics = _report || isStoring ? &statistics : nullptr,
                        .changes = isStoring ? &changes : nullptr};
    int status = decodeInput(_options, index, _services, &notes);
    if (notes.isOutputBroken || std::ferror(stdout)) status = notWrittenStatus;
    const auto also = [&](const std::function<void()>& part) {
      if (!succeeds(part)) status = notWrittenStatus;
    };
    if (_tree) also([&] { keepOutput(_options.captures[index], status, before); });
    if (isStoring) {
      CaptureEntry entry{.path = _options.captures[index]};
      if (status != 0) {
        entry.fate = CaptureFate::Failed;
        entry.why = lastLineOf(STDERR_FILENO);
      }
      also([&] { CaptureDatabase(*_options.databasePath).store(entry, &statistics, &changes, before); });
    }
    if (_report) {
      const std::string details = statistics.asReportMembers();
      std::fwrite(details.data(), 1, details.size(), context.details);
    }
    return status;
  }

  // What could be read of a damaged capture is kept. Its output is older than the capture, so that it is made
  // again when the work is resumed. The same goes for a capture that grew while it was decoded.
  void keepOutput(const std::string& capture, int status, const CaptureState& before) const {
    if (std::ferror(stdout)) throw std::runtime_error("the output of " + capture + " was not written");
    if (status == 0 || hasOutput()) writeOutputOf(capture, _tree->outputOf(capture), status == 0, before);
  }

  void note(const JobEnd& end) {
    if (!_report && !end.signal) return;
    CaptureEntry entry{.path = _options.captures[end.piece], .details = end.details, .time = end.time};
    if (end.wasLeft) entry.fate = CaptureFate::Present;
    if (end.status != 0) {
      entry.fate = CaptureFate::Failed;
      entry.why = end.lastError;
    }
    if (end.signal) {
      entry.fate = CaptureFate::Aborted;
      entry.why = std::string(::strsignal(*end.signal));
      if (!end.lastError.empty()) entry.why += ": " + end.lastError;
    }
    // The process that ended could not do it itself.
    if (_options.databasePath && end.signal)
      keep([&] { CaptureDatabase(*_options.databasePath).store(entry, nullptr, nullptr); });
    // A report that lacks a line does not appear.
    if (_report && !keep([&] { _report->write(entry); })) _report.reset();
  }

  const Options& _options;
  const DecodingServices& _services;
  ListProgress _progress;
  std::optional<OutputTree> _tree;
  std::optional<Report> _report;
  std::vector<bool> _isInDatabase;  // by capture; empty unless the work is resumed
  bool _isNotWritten = false;       // a part of the report or the database
};

}  // namespace

int decodeMany(const Options& options, const DecodingServices& services) {
  return ManyCaptures(options, services).run();
}

}  // namespace varnel
