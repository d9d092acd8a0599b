#pragma once

#include <sys/types.h>

#include <filesystem>
#include <string>
#include <system_error>

#include "base/Bytes.h"
#include "host/FileDescriptor.h"

namespace varnel {

/// What becomes of a file that is there, and not empty, when a recording is to have its name.
enum class ExistingRecording { Refused, Replaced };

/// A file that grows by whole records, for its owner alone (mode 0600) and locked while it grows. It is made,
/// or takes the place of an earlier one, with its first record. What is no regular file, as a pipe, gets the
/// records as they come.
class RecordingFile final {
 public:
  /// Finds out whether there can be a recording of that name; "-" is standard output. Throws
  /// std::runtime_error, one line that says what to do, when a file is in the way, when it is a symbolic
  /// link, when another process records to it, and when it cannot be written.
  RecordingFile(const std::string& path, ExistingRecording existing);

  /// Adds a record. Throws std::runtime_error when that fails; the file then ends with the record before, an
  /// earlier file is still there when this was the first one, and nothing more can be added.
  void append(ByteView record);

 private:
  void openExisting();
  void make(ByteView record);
  void replaceExisting(ByteView record);
  bool isExistingInPlace() const;
  [[noreturn]] void fail(std::error_code failure) const;

  const std::filesystem::path _path;
  const std::string _name;  // as errors tell it
  const ExistingRecording _ifExisting;
  FileDescriptor _existing;  // locked, while it keeps its place
  FileDescriptor _file;
  bool _isStream = false;
  off_t _size = 0;  // of the records in the file
};

}  // namespace varnel
