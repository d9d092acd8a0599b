#pragma once

#include <string>
#include <system_error>

#include "base/Bytes.h"
#include "host/WholeFile.h"

namespace varnel {

/// Writes the file that the user named for output. Throws std::system_error.
inline void writeFile(const std::string& path, ByteView bytes) {
  if (const auto failure = writeOutputFile(path, bytes))
    throw std::system_error(failure, "cannot write " + path);
}

}  // namespace varnel
