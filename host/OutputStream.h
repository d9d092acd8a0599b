#pragma once

#include <filesystem>
#include <system_error>

#include "base/Bytes.h"
#include "host/FileDescriptor.h"

namespace varnel {

/// The error that the last system call has left.
std::error_code lastSystemError();

/// Writes all of the bytes to an open file, or as many as it takes before the error.
std::error_code writeAll(int descriptor, ByteView bytes);

/// Whether the path names what takes bytes as they come: a pipe, a terminal or another device, or, by a name
/// like /dev/stdout, a file that this process has open.
bool isStream(const std::filesystem::path& path);

/// Opens such a thing for writing; a pipe is waited for until somebody reads it. Not open, with the error
/// left to `lastSystemError`, when that fails.
FileDescriptor openStream(const std::filesystem::path& path);

}  // namespace varnel
