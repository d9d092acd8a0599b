#pragma once

#include <sys/types.h>

#include <filesystem>
#include <system_error>

#include "host/FileDescriptor.h"

namespace varnel {

/// A new file in the folder of another one, whose place it takes once it is whole. It is for its owner alone
/// (mode 0600), and removed when it goes without having taken the place.
class FileBeside final {
 public:
  explicit FileBeside(std::filesystem::path target) : _target(std::move(target)) {}
  FileBeside(const FileBeside&) = delete;
  FileBeside& operator=(const FileBeside&) = delete;
  ~FileBeside();

  /// Makes the file, which every write goes to the end of.
  std::error_code make();
  int descriptor() const { return _file.number(); }
  /// Gives it the name of the target, and whatever had the name is gone. A link is not followed.
  std::error_code takePlace();
  /// Leaves the open file to the caller.
  FileDescriptor release() { return std::move(_file); }

 private:
  const std::filesystem::path _target;
  std::filesystem::path _path;  // empty when there is nothing to remove
  FileDescriptor _file;
};

/// Sees to it that the names in the folder are on the disk, where the folder can be read.
void synchroniseFolder(const std::filesystem::path& folder);

}  // namespace varnel
