#pragma once

#include <filesystem>
#include <system_error>

#include "base/Bytes.h"
#include "host/FileDescriptor.h"

namespace varnel {

/// The error of the last system call.
std::error_code lastSystemError();

/// Writes all bytes to an open file, or as many as it takes before an error.
std::error_code writeAll(int descriptor, ByteView bytes);

/// Whether the path names something that takes bytes as they come: a pipe, a terminal, another device, or, by
/// a name like /dev/stdout, a file that this process has open.
bool isStream(const std::filesystem::path& path);

/// Opens it for writing. For a pipe, waits until somebody reads it. On failure the result is not open, and
/// `lastSystemError` has the error.
FileDescriptor openStream(const std::filesystem::path& path);

}  // namespace varnel
