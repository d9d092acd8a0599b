#pragma once

#include <sys/types.h>

#include <filesystem>
#include <system_error>

#include "host/FileDescriptor.h"

namespace varnel {

/// A new file in the folder of another one, which it replaces once it is whole. Only its owner may read it
/// (mode 0600). The destructor removes it when it has not taken the other's place. Where the file system can,
/// the file has no name until then. So even a killed process leaves nothing.
class FileBeside final {
 public:
  explicit FileBeside(std::filesystem::path target) : _target(std::move(target)) {}
  FileBeside(const FileBeside&) = delete;
  FileBeside& operator=(const FileBeside&) = delete;
  ~FileBeside();

  /// Makes the file. Every write goes to its end.
  std::error_code make();
  int descriptor() const { return _file.number(); }
  /// Renames the file to the target and so replaces an existing one. Follows no link.
  std::error_code takePlace();
  /// Hands the open file to the caller.
  FileDescriptor release() { return std::move(_file); }

 private:
  template <class Make>
  std::error_code withFreeName(Make make);
  std::error_code makeNamed();
  std::error_code giveName();

  const std::filesystem::path _target;
  std::filesystem::path _path;  // empty when there is nothing to remove
  FileDescriptor _file;
  bool _hasNoName = false;
};

/// Makes sure that the names in the folder are on the disk, if the folder can be read.
void synchroniseFolder(const std::filesystem::path& folder);

}  // namespace varnel
