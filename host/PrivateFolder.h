#pragma once

#include <filesystem>

#include "host/FileDescriptor.h"

namespace varnel {

/// A new folder for this user alone, in $XDG_RUNTIME_DIR, or in the temporary folder when that variable is
/// not set. The destructor removes it with everything in it.
class PrivateFolder final {
 public:
  /// Also removes the folders that killed processes have left. Throws std::runtime_error, one line that says
  /// what to do.
  PrivateFolder();
  PrivateFolder(const PrivateFolder&) = delete;
  PrivateFolder& operator=(const PrivateFolder&) = delete;
  ~PrivateFolder();

  const std::filesystem::path& path() const { return _path; }

 private:
  std::filesystem::path _path;
  FileDescriptor _lock;  // on the folder: tells other processes that it is in use
};

}  // namespace varnel
