#pragma once

#include <filesystem>
#include <optional>

#include "base/Bytes.h"

namespace varnel {

/// The bytes of a file; nothing when there is no regular file, it cannot be read, or it is larger than
/// property-list files may be.
std::optional<Bytes> readWholeFile(const std::filesystem::path& path);

}  // namespace varnel
