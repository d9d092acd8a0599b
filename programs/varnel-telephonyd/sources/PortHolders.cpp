#include "programs/varnel-telephonyd/sources/PortHolders.h"

#include <sys/stat.h>
#include <sys/sysmacros.h>
#include <unistd.h>

#include <charconv>
#include <fstream>
#include <map>
#include <optional>
#include <string>
#include <system_error>
#include <utility>

namespace varnel {

namespace {

namespace fs = std::filesystem;

// Looks only at files in /dev: others may be in file systems that do not answer.
bool isDevice(const fs::path& openFile, dev_t device) {
  std::error_code ignored;
  const std::string target = fs::read_symlink(openFile, ignored).string();
  struct stat status {};
  return target.starts_with("/dev/") && ::stat(openFile.c_str(), &status) == 0 && S_ISCHR(status.st_mode) &&
         status.st_rdev == device;
}

// The other end of the pseudo-terminal whose number is given.
bool isOtherEnd(const fs::path& process, const fs::path& openFile, unsigned number) {
  std::error_code ignored;
  const std::string target = fs::read_symlink(openFile, ignored).string();
  if (target != "/dev/ptmx" && target != "/dev/pts/ptmx") return false;
  std::ifstream information(process / "fdinfo" / openFile.filename());
  std::string key;
  for (unsigned index = 0; information >> key;)
    if (key == "tty-index:") return information >> index && index == number;
  return false;
}

// Majors of the devices in /dev/pts, each with 256 of them.
constexpr unsigned firstTerminalMajor = 136, lastTerminalMajor = 143, devicesOfMajor = 256;

std::optional<unsigned> terminalNumber(dev_t device) {
  const unsigned number = major(device);
  if (number < firstTerminalMajor || number > lastTerminalMajor) return std::nullopt;
  return (number - firstTerminalMajor) * devicesOfMajor + minor(device);
}

// What plays a modem on a pseudo-terminal may have both its ends open, and is no holder then.
bool holds(const fs::path& process, dev_t device) {
  const auto terminal = terminalNumber(device);
  bool hasDevice = false;
  std::error_code error;
  for (fs::directory_iterator file(process / "fd", error), end; !error && file != end;
       file.increment(error)) {
    if (terminal && isOtherEnd(process, file->path(), *terminal)) return false;
    hasDevice = hasDevice || isDevice(file->path(), device);
  }
  return hasDevice;
}

std::string shortNameOf(const fs::path& process) {
  std::string name;
  std::ifstream file(process / "comm");
  std::getline(file, name);
  return name;
}

// The system cuts the short name off after 15 characters, so the command line is asked first.
std::string nameOf(const fs::path& process) {
  constexpr std::size_t longest = 64;
  std::string name;
  std::ifstream commandLine(process / "cmdline");
  std::getline(commandLine, name, '\0');
  name = fs::path(name).filename().string();
  if (name.empty()) name = shortNameOf(process);
  return name.empty() ? "a program" : name.substr(0, longest);
}

// Nothing for a name that is no number, as that of other files among the processes.
std::optional<int> processNumber(const std::string& name) {
  int number = 0;
  const auto [end, error] = std::from_chars(name.data(), name.data() + name.size(), number);
  return error == std::errc() && end == name.data() + name.size() ? std::optional(number) : std::nullopt;
}

}  // namespace

std::vector<std::string> holdersOf(dev_t device, const fs::path& processes) {
  std::map<int, std::string> holders;
  std::error_code error;
  for (fs::directory_iterator process(processes, error), end; !error && process != end;
       process.increment(error)) {
    const auto number = processNumber(process->path().filename().string());
    if (!number || *number == ::getpid() || !holds(process->path(), device)) continue;
    holders[*number] = nameOf(process->path()) + " (process " + std::to_string(*number) + ")";
  }
  std::vector<std::string> names;
  names.reserve(holders.size());
  for (auto& [number, name] : holders) names.push_back(std::move(name));
  return names;
}

bool runsModemManager(const fs::path& processes) {
  std::error_code error;
  for (fs::directory_iterator process(processes, error), end; !error && process != end;
       process.increment(error))
    if (processNumber(process->path().filename().string()) && shortNameOf(process->path()) == "ModemManager")
      return true;
  return false;
}

}  // namespace varnel
