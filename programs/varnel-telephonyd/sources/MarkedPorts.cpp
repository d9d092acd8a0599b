#include "programs/varnel-telephonyd/sources/MarkedPorts.h"

#include <algorithm>
#include <cstddef>
#include <fstream>
#include <string_view>
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

// Numbers are compared as such: ttyUSB2 is before ttyUSB10. They have no zeros before them.
bool isBefore(std::string_view left, std::string_view right) {
  const auto isDigit = [](char letter) { return letter >= '0' && letter <= '9'; };
  const auto sizeOfNumber = [&](std::string_view text) {
    return static_cast<std::size_t>(std::ranges::find_if_not(text, isDigit) - text.begin());
  };
  while (!left.empty() && !right.empty()) {
    const std::size_t leftSize = sizeOfNumber(left), rightSize = sizeOfNumber(right);
    if (leftSize != 0 && rightSize != 0 && leftSize != rightSize) return leftSize < rightSize;
    if (left.front() != right.front()) return left.front() < right.front();
    left.remove_prefix(1);
    right.remove_prefix(1);
  }
  return left.size() < right.size();
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
  std::ranges::sort(ports, isBefore);
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
