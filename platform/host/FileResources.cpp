#include "platform/host/FileResources.h"

#include <algorithm>
#include <cstdlib>

#include "platform/PropertyList.h"
#include "platform/host/WholeFile.h"

namespace varnel {

namespace {

namespace fs = std::filesystem;

constexpr std::string_view extension = ".plist";

bool isWithin(const fs::path& path, const fs::path& folder) {
  return std::ranges::mismatch(folder, path).in1 == folder.end();
}

}  // namespace

Value FileResources::propertyList(std::string_view name) const {
  const auto bytes = readWholeFile(_folder / (std::string(name) + std::string(extension)));
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
  return (program.parent_path() / VARNEL_INSTALLED_RESOURCES).lexically_normal();
}

}  // namespace varnel
