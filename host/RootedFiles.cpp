#include "host/RootedFiles.h"

#include <system_error>

#include "base/FitForXml.h"
#include "base/PropertyList.h"
#include "host/WholeFile.h"

namespace varnel {

bool RootedFiles::exists(const std::string& path) const {
  std::error_code ignored;
  return std::filesystem::exists(below(path), ignored);
}

FileWriting RootedFiles::writePropertyList(const Value& list, const std::string& path) {
  const std::filesystem::path place = below(path);
  const auto bytes = writeXmlPropertyList(fitForXml(list));
  if (!bytes) return {.place = place, .failure = "it is too large, or holds what no property list can"};
  std::error_code ignored;
  const bool isThere = std::filesystem::exists(place, ignored);
  if (const auto failure = writeWholeFile(place, *bytes))
    return {.place = place, .failure = failure.message()};
  return {.place = place, .failure = {}, .hasReplaced = isThere};
}

std::filesystem::path RootedFiles::below(const std::string& path) const {
  return _root / std::filesystem::path(path).relative_path();
}

}  // namespace varnel
