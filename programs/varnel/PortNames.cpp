#include "programs/varnel/PortNames.h"

#include <algorithm>
#include <string_view>
#include <system_error>

namespace varnel {

namespace {

namespace fs = std::filesystem;

constexpr std::string_view prefixes[] = {"ttyUSB", "ttyACM", "wwan"};
// A menu has no room for more.
constexpr std::size_t most = 16;

bool mayBePort(const fs::path& path) {
  const std::string name = path.filename().string();
  return std::ranges::any_of(prefixes, [&](std::string_view prefix) { return name.starts_with(prefix); });
}

}  // namespace

std::vector<std::string> portNames(const fs::path& folder) {
  std::vector<std::string> names;
  std::error_code failure;
  for (auto entry = fs::directory_iterator(folder, failure); !failure && entry != fs::directory_iterator();
       entry.increment(failure))
    if (mayBePort(entry->path())) names.push_back(entry->path().string());
  std::ranges::sort(names);
  if (names.size() > most) names.resize(most);
  return names;
}

}  // namespace varnel
