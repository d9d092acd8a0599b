#pragma once

#include <filesystem>
#include <optional>
#include <string>

namespace varnel {

/// The folder that stands for the root of the device's file system.
struct DeviceRoot {
  std::filesystem::path folder;
  std::string
      failure;  ///< why the folder could not be laid out as a device; empty when it needs no such thing
};

/// The folder that the option names, as it is. Without the option, `system` where that is a device, else the
/// program's state folder, which is laid out as a device that allows snapshots. `system` stands for the root
/// of this machine.
DeviceRoot deviceRoot(const std::optional<std::string>& option, const std::filesystem::path& system = "/");

}  // namespace varnel
