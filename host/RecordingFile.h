#pragma once

#include <sys/types.h>

#include <filesystem>
#include <string>
#include <system_error>

#include "base/Bytes.h"
#include "host/FileDescriptor.h"

namespace varnel {

/// What to do when a file with the name of the recording exists and is not empty.
enum class ExistingRecording { Refused, Replaced };

/// A file that grows by whole records. Only its owner may read it (mode 0600), and it is locked while it
/// grows. The first record makes the file, or replaces an earlier one. Anything but a regular file, such as a
/// pipe, gets the records as they come.
class RecordingFile final {
 public:
  /// Checks whether there can be a recording with this name; "-" is standard output. Throws
  /// std::runtime_error, one line that says what to do, when a file is in the way, when it is a symbolic
  /// link, when another process records to it, or when it cannot be written.
  RecordingFile(const std::string& path, ExistingRecording existing);

  /// Adds a record. Throws std::runtime_error on failure. Then the file ends with the record before. If this
  /// was the first record, an earlier file is still there. After a failure nothing more can be added.
  void append(ByteView record);

 private:
  void openExisting();
  void make(ByteView record);
  void replaceExisting(ByteView record);
  bool isExistingInPlace() const;
  [[noreturn]] void fail(std::error_code failure) const;

  const std::filesystem::path _path;
  const std::string _name;  // as error messages name it
  const ExistingRecording _ifExisting;
  FileDescriptor _existing;  // locked while it keeps its place
  FileDescriptor _file;
  bool _isStream = false;
  off_t _size = 0;  // bytes of the records in the file
};

}  // namespace varnel
