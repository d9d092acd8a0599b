#pragma once

#include <sys/types.h>

#include <filesystem>
#include <optional>
#include <system_error>
#include <utility>

#include "base/Bytes.h"
#include "host/FileBeside.h"
#include "host/OutputStream.h"

namespace varnel {

/// The bytes of a file; nothing when there is no regular file, it cannot be read, or it is larger than
/// property-list files may be.
std::optional<Bytes> readWholeFile(const std::filesystem::path& path);

/// The mode of a file that takes the place of another one. Where there was none, it is its owner's alone.
enum class ReplacedMode {
  OwnerAlone,  ///< 0600
  Kept,
};

/// Writes a file so that it is whole or not there: it is written beside, and takes the place of the old file,
/// which stays as it is after a failure, once it is on the disk. No folder is made. Nothing is written
/// through a symbolic link: a link that has the name is an error, and so is whatever else is no regular file,
/// and a file that may not be written. The error's message is a phrase for users.
std::error_code writeWholeFile(const std::filesystem::path& path, ByteView bytes,
                               ReplacedMode mode = ReplacedMode::OwnerAlone);

/// The same, written piece by piece.
class WholeFileWriter final {
 public:
  explicit WholeFileWriter(std::filesystem::path path, ReplacedMode mode = ReplacedMode::OwnerAlone)
      : _path(path), _mode(mode), _file(std::move(path)) {}

  /// To be called first; the others only when it is no error.
  std::error_code open();
  std::error_code write(ByteView bytes) { return writeAll(_file.descriptor(), bytes); }
  /// Has the file take its place. Without it the old one stays.
  std::error_code finish();

 private:
  const std::filesystem::path _path;
  const ReplacedMode _mode;
  mode_t _oldMode = 0;
  FileBeside _file;
};

/// Writes what the user has named for output. A pipe, a terminal and the like (`isStream`) get the bytes as
/// they come, anything else as a whole file.
std::error_code writeOutputFile(const std::filesystem::path& path, ByteView bytes);

/// The error of a name that is a symbolic link.
std::error_code isLinkError();

}  // namespace varnel
