#include "host/WholeFile.h"

#include <fstream>

#include "base/PropertyList.h"

namespace varnel {

std::optional<Bytes> readWholeFile(const std::filesystem::path& path) {
  std::error_code failure;
  const std::uintmax_t size = std::filesystem::file_size(path, failure);
  if (failure || size > fileLimits.size) return std::nullopt;
  Bytes bytes(size);
  std::ifstream file(path, std::ios::binary);
  if (!file.read(reinterpret_cast<char*>(bytes.data()), static_cast<std::streamsize>(size)))
    return std::nullopt;
  return bytes;
}

}  // namespace varnel
