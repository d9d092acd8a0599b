#pragma once

#include <gtest/gtest.h>

#include <filesystem>
#include <string>

namespace varnel {

/// The path of a Debian program; empty when it is not installed.
inline std::string installedTool(const std::string& name) {
  for (const char* folder : {"/usr/bin/", "/usr/local/bin/"}) {
    if (std::filesystem::exists(folder + name)) return folder + name;
  }
  return {};
}

/// A program that must be installed. The test fails without it.
inline std::string tool(const std::string& name) {
  if (const std::string path = installedTool(name); !path.empty()) return path;
  ADD_FAILURE() << name << " is missing; ./dev setup installs it";
  return "/bin/false";
}

}  // namespace varnel
