#pragma once

#include <sys/mman.h>
#include <unistd.h>

#include <string>

#include "base/Bytes.h"
#include "fuzz/Require.h"

namespace varnel {

/// A file in memory, for code that reads a file by its path.
class MemoryFile {
 public:
  MemoryFile() : _descriptor(memfd_create("input", MFD_CLOEXEC)) {
    require(_descriptor >= 0, "there is a file in memory");
  }
  MemoryFile(const MemoryFile&) = delete;
  MemoryFile& operator=(const MemoryFile&) = delete;
  ~MemoryFile() { close(_descriptor); }

  std::string path() const { return "/proc/self/fd/" + std::to_string(_descriptor); }

  /// Replaces the contents.
  void set(ByteView bytes) {
    require(ftruncate(_descriptor, 0) == 0 && lseek(_descriptor, 0, SEEK_SET) == 0,
            "memory file can be emptied");
    const ssize_t written = pwrite(_descriptor, bytes.data(), bytes.size(), 0);
    require(written == static_cast<ssize_t>(bytes.size()), "memory file can be written");
  }

 private:
  int _descriptor;
};

}  // namespace varnel
