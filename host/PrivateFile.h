#pragma once

#include <filesystem>

#include "base/Bytes.h"

namespace varnel {

/// Writes a file in place of what is there; a new one gets mode 0600. False, with errno set, when that fails.
bool writePrivateFile(const std::filesystem::path& path, ByteView bytes);

}  // namespace varnel
