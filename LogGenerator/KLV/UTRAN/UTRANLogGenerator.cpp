#include "LogGenerator/KLV/UTRAN/UTRANLogGenerator.h"

#include <algorithm>

#include "LogGenerator/KLV/UTRAN/UTRANClassIndex.h"
#include "base/Log.h"

namespace varnel {

namespace {

bool containsUTRAN(std::string_view path) {
  constexpr std::string_view name = "UTRAN";
  const auto equalInAnyCase = [](char a, char b) { return (a >= 'a' && a <= 'z' ? a - 'a' + 'A' : a) == b; };
  return std::search(path.begin(), path.end(), name.begin(), name.end(), equalInAnyCase) != path.end();
}

// The file name without folders and extension; empty when the path of no resource has the name.
std::string templateName(const Resources& resources) {
  const auto paths = resources.propertyListPaths();
  const auto found = std::ranges::find_if(paths, containsUTRAN);
  if (found == paths.end()) return {};
  const std::string fileName = found->substr(found->rfind('/') + 1);
  return fileName.substr(0, fileName.rfind('.'));
}

std::shared_ptr<ClassIndex> makeClassIndex(const Services& services, const std::string& templateName) {
  if (templateName.empty()) return nullptr;
  return std::make_shared<UTRANClassIndex>(services.standardOutput);
}

}  // namespace

UTRANLogGenerator::UTRANLogGenerator(const Services& services)
    : UTRANLogGenerator(services, templateName(services.resources)) {}

UTRANLogGenerator::UTRANLogGenerator(const Services& services, const std::string& listName)
    : KLVLogGenerator2(services, listName, makeClassIndex(services, listName)) {
  // Kept: a success, logged as an error; and "Created", not "Creating".
  logError("Created UTRANLogGenerator object");
}

std::unique_ptr<LogGenerator> UTRANLogGenerator::generator(const Services& services) {
  return std::make_unique<UTRANLogGenerator>(services);
}

// Without a template there is no name to report, so this names the template that ships.
std::optional<std::string> UTRANLogGenerator::missingTemplate() const {
  return KLVLogGenerator2::missingTemplate() ? std::optional("UTRAN.plist") : std::nullopt;
}

}  // namespace varnel
