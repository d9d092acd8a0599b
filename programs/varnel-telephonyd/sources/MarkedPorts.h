#pragma once

#include <filesystem>
#include <string>
#include <vector>

namespace varnel {

/// Where the system shows its devices.
struct DeviceFolders {
  std::filesystem::path classes = "/sys/class";
  std::filesystem::path properties = "/run/udev/data";  ///< of udev, one file per device
  std::filesystem::path devices = "/dev";
};

/// The devices that udev marks as a modem's port, by the property VARNEL_MODEM=1 of the package's rule.
/// Sorted by name, and numbers in it by their value.
std::vector<std::string> markedPorts(const DeviceFolders& folders = {});

/// The link that names the same device also after it was plugged in again; the path itself when there is
/// none.
std::string lastingNameOf(const std::string& path, const DeviceFolders& folders = {});

}  // namespace varnel
