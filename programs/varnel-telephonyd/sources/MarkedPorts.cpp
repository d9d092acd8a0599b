#include "programs/varnel-telephonyd/sources/MarkedPorts.h"

#include <algorithm>
#include <fstream>
#include <system_error>

namespace varnel {

namespace {

namespace fs = std::filesystem;

// Both have a folder per device.
constexpr const char* classes[] = {"tty", "wwan"};
constexpr const char* mark = "E:VARNEL_MODEM=1";

// The first line of a small file; empty when there is none.
std::string firstLine(const fs::path& path) {
  std::ifstream file(path);
  std::string line;
  std::getline(file, line);
  return line;
}

bool hasLine(const fs::path& path, const std::string& wanted) {
  std::ifstream file(path);
  for (std::string line; std::getline(file, line);)
    if (line == wanted) return true;
  return false;
}

template <class Function>
void forEachEntry(const fs::path& folder, Function function) {
  std::error_code error;
  for (fs::directory_iterator entry(folder, error), end; !error && entry != end; entry.increment(error))
    function(entry->path());
}

}  // namespace

std::vector<std::string> markedPorts(const DeviceFolders& folders) {
  std::vector<std::string> ports;
  for (const char* const name : classes) {
    forEachEntry(folders.classes / name, [&](const fs::path& device) {
      const std::string number = firstLine(device / "dev");  // such as "188:0"; not every one has it
      if (number.empty() || !hasLine(folders.properties / ("c" + number), mark)) return;
      ports.push_back((folders.devices / device.filename()).string());
    });
  }
  std::ranges::sort(ports);
  return ports;
}

std::string lastingNameOf(const std::string& path, const DeviceFolders& folders) {
  std::error_code error;
  const fs::path device = fs::canonical(path, error);
  std::string found = path;
  if (error) return found;
  forEachEntry(folders.devices / "serial" / "by-id", [&](const fs::path& link) {
    std::error_code broken;
    if (fs::canonical(link, broken) == device) found = link.string();
  });
  return found;
}

}  // namespace varnel
