#include "host/FileResources.h"

#include <algorithm>
#include <cstdlib>
#include <stdexcept>
#include <system_error>

#include "base/PropertyList.h"
#include "host/WholeFile.h"

namespace varnel {

namespace {

namespace fs = std::filesystem;

constexpr std::string_view extension = ".plist";
constexpr const char* folderVariable = "VARNEL_RESOURCES";

bool isWithin(const fs::path& path, const fs::path& folder) {
  return std::ranges::mismatch(folder, path).in1 == folder.end();
}

bool isFile(const fs::path& path) {
  std::error_code failure;
  return fs::is_regular_file(path, failure);
}

}  // namespace

Value FileResources::propertyList(std::string_view name) const {
  const auto bytes = readWholeFile(fileOf(name));
  if (!bytes) return {};
  return readPropertyList(*bytes, fileLimits).value_or(Value());
}

// A file in the folder itself comes before files in the folders below.
fs::path FileResources::fileOf(std::string_view name) const {
  const std::string file = std::string(name) + std::string(extension);
  if (isFile(_folder / file)) return _folder / file;
  for (const fs::path path : propertyListPaths()) {
    if (path.filename() == file) return _folder / path;
  }
  return {};
}

std::vector<std::string> FileResources::propertyListPaths() const {
  std::vector<std::string> paths;
  std::error_code failure;
  constexpr auto closedFolders = fs::directory_options::skip_permission_denied;
  for (fs::recursive_directory_iterator entry(_folder, closedFolders, failure), end; !failure && entry != end;
       entry.increment(failure)) {
    if (entry->path().extension() == extension && isFile(entry->path()))
      paths.push_back(entry->path().lexically_relative(_folder).string());
  }
  std::ranges::sort(paths);
  return paths;
}

fs::path resourceFolder() {
  if (const char* const folder = std::getenv(folderVariable); folder && *folder != '\0') return folder;
  const fs::path program = fs::read_symlink("/proc/self/exe");
  if (isWithin(program, fs::weakly_canonical(VARNEL_BUILD_FOLDER))) return VARNEL_SOURCE_RESOURCES;
  return (program.parent_path() / VARNEL_INSTALLED_RESOURCES).lexically_normal();
}

fs::path readableResourceFolder() {
  fs::path folder = resourceFolder();
  std::error_code failure;
  const fs::directory_iterator reading(folder, failure);
  if (failure) {
    throw std::runtime_error("cannot read the resource folder " + folder.string() + ": " + failure.message() +
                             "; let " + folderVariable + " name the one that has LTE.plist in it");
  }
  return folder;
}

}  // namespace varnel
