#pragma once

#include <sys/types.h>

#include <ctime>
#include <filesystem>
#include <optional>
#include <system_error>
#include <utility>

#include "base/Bytes.h"
#include "host/FileBeside.h"
#include "host/OutputStream.h"

namespace varnel {

/// The bytes of a file. Nothing when it is no regular file, cannot be read, or is larger than property-list
/// files may be.
std::optional<Bytes> readWholeFile(const std::filesystem::path& path);

/// The mode of a file that replaces another one. Without an earlier file, the mode is 0600.
enum class ReplacedMode {
  OwnerAlone,  ///< 0600
  Kept,
};

/// Writes a file so that it appears only when it is whole: it writes beside the target, and replaces the old
/// file once the new one is on the disk. After a failure the old file is unchanged. Makes no folder. It is an
/// error if the name belongs to a symbolic link, to anything else than a regular file, or to a file that may
/// not be written. The error's message is a phrase for users.
std::error_code writeWholeFile(const std::filesystem::path& path, ByteView bytes,
                               ReplacedMode mode = ReplacedMode::OwnerAlone);

/// The same, written piece by piece.
class WholeFileWriter final {
 public:
  explicit WholeFileWriter(std::filesystem::path path, ReplacedMode mode = ReplacedMode::OwnerAlone)
      : _path(path), _mode(mode), _file(std::move(path)) {}

  /// Call this first, and the other functions only when it returns no error.
  std::error_code open();
  std::error_code write(ByteView bytes) { return writeAll(_file.descriptor(), bytes); }
  /// Gives the file this time of its last change, after everything was written.
  std::error_code dateTo(const timespec& time);
  /// Replaces the old file. Without this call the old file stays.
  std::error_code finish();

 private:
  const std::filesystem::path _path;
  const ReplacedMode _mode;
  mode_t _oldMode = 0;
  FileBeside _file;
};

/// Writes an output that the user has named. A pipe, a terminal, and the like (`isStream`) get the bytes as
/// they come. Any other output is written as a whole file.
std::error_code writeOutputFile(const std::filesystem::path& path, ByteView bytes);

/// The error for a name that is a symbolic link.
std::error_code isLinkError();

}  // namespace varnel
