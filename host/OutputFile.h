#pragma once

#include <filesystem>
#include <optional>
#include <system_error>

#include "base/Bytes.h"
#include "host/FileDescriptor.h"
#include "host/WholeFile.h"

namespace varnel {

/// An output that the user has named, written piece by piece. A pipe, a terminal, and the like (`isStream`)
/// get the pieces as they come. Any other output is a whole file; its pieces are collected before they go to
/// the disk.
class OutputFile final {
 public:
  explicit OutputFile(std::filesystem::path path) : _path(std::move(path)) {}

  /// Call this first, and the other functions only when it returns no error.
  std::error_code open();
  std::error_code write(ByteView bytes);
  /// Completes the output.
  std::error_code finish();

 private:
  std::error_code flush();

  const std::filesystem::path _path;
  FileDescriptor _stream;                // open when the output is a stream
  std::optional<WholeFileWriter> _file;  // set otherwise
  Bytes _gathered;
};

}  // namespace varnel
