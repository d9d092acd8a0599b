#include "host/RootedFiles.h"

#include <cerrno>
#include <system_error>

#include "base/PropertyList.h"
#include "host/PrivateFile.h"

namespace varnel {

bool RootedFiles::exists(const std::string& path) const {
  std::error_code ignored;
  return std::filesystem::exists(below(path), ignored);
}

FileWriting RootedFiles::writePropertyList(const Value& list, const std::string& path) {
  const std::filesystem::path place = below(path);
  const auto bytes = writeXmlPropertyList(list);
  if (!bytes) return {.place = place, .failure = "it has no property-list form"};
  std::error_code ignored;
  const bool isThere = std::filesystem::exists(place, ignored);
  if (!writePrivateFile(place, *bytes))
    return {.place = place, .failure = std::generic_category().message(errno)};
  return {.place = place, .failure = {}, .hasReplaced = isThere};
}

std::filesystem::path RootedFiles::below(const std::string& path) const {
  return _root / std::filesystem::path(path).relative_path();
}

}  // namespace varnel
