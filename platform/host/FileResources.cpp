#include "platform/host/FileResources.h"

#include <algorithm>
#include <cstdlib>
#include <fstream>

#include "platform/PropertyList.h"

namespace varnel {

namespace {

namespace fs = std::filesystem;

constexpr std::string_view extension = ".plist";

// The file's bytes; nothing when it cannot be read or is larger than any list may be.
std::optional<Bytes> bytesOf(const fs::path& path) {
  std::error_code failure;
  const std::uintmax_t size = fs::file_size(path, failure);
  if (failure || size > fileLimits.size) return std::nullopt;
  Bytes bytes(size);
  std::ifstream file(path, std::ios::binary);
  if (!file.read(reinterpret_cast<char*>(bytes.data()), static_cast<std::streamsize>(size)))
    return std::nullopt;
  return bytes;
}

bool isWithin(const fs::path& path, const fs::path& folder) {
  return std::ranges::mismatch(folder, path).in1 == folder.end();
}

}  // namespace

Value FileResources::propertyList(std::string_view name) const {
  const auto bytes = bytesOf(_folder / (std::string(name) + std::string(extension)));
  if (!bytes) return {};
  return readPropertyList(*bytes, fileLimits).value_or(Value());
}

std::vector<std::string> FileResources::propertyListPaths() const {
  std::vector<std::string> paths;
  std::error_code failure;
  for (fs::recursive_directory_iterator entry(_folder, failure), end; !failure && entry != end;
       entry.increment(failure)) {
    if (entry->path().extension() == extension && entry->is_regular_file())
      paths.push_back(entry->path().lexically_relative(_folder).string());
  }
  std::ranges::sort(paths);
  return paths;
}

fs::path resourceFolder() {
  if (const char* const folder = std::getenv("VARNEL_RESOURCES")) return folder;
  const fs::path program = fs::read_symlink("/proc/self/exe");
  if (isWithin(program, fs::weakly_canonical(VARNEL_BUILD_FOLDER))) return VARNEL_SOURCE_RESOURCES;
  return program.parent_path().parent_path() / "share/varnel/resources";
}

}  // namespace varnel
