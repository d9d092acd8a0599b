#pragma once

#include <filesystem>
#include <string>
#include <vector>

namespace varnel {

/// The devices of this machine that may be ports of a modem, by their names. `folder` stands for /dev.
std::vector<std::string> portNames(const std::filesystem::path& folder = "/dev");

}  // namespace varnel
