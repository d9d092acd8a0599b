#include "host/RootedFiles.h"

#include "base/PropertyList.h"
#include "host/PrivateFile.h"

namespace varnel {

bool RootedFiles::exists(const std::string& path) const {
  std::error_code ignored;
  return std::filesystem::exists(below(path), ignored);
}

bool RootedFiles::writePropertyList(const Value& list, const std::string& path) {
  const auto bytes = writeXmlPropertyList(list);
  return bytes && writePrivateFile(below(path), *bytes);
}

std::filesystem::path RootedFiles::below(const std::string& path) const {
  return _root / std::filesystem::path(path).relative_path();
}

}  // namespace varnel
