#pragma once

#include <filesystem>
#include <optional>
#include <system_error>

#include "base/Bytes.h"
#include "host/FileDescriptor.h"
#include "host/WholeFile.h"

namespace varnel {

/// An output that the user has named, written piece by piece. A pipe, a terminal and the like (`isStream`)
/// get the pieces as they come; anything else is a whole file, whose pieces are gathered before they go to
/// the disk.
class OutputFile final {
 public:
  explicit OutputFile(std::filesystem::path path) : _path(std::move(path)) {}

  /// To be called first; the others only when it is no error.
  std::error_code open();
  std::error_code write(ByteView bytes);
  /// The output is whole.
  std::error_code finish();

 private:
  std::error_code flush();

  const std::filesystem::path _path;
  FileDescriptor _stream;                // open where the output is one
  std::optional<WholeFileWriter> _file;  // else
  Bytes _gathered;
};

}  // namespace varnel
