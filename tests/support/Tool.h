#pragma once

#include <gtest/gtest.h>

#include <filesystem>
#include <string>

namespace varnel {

/// A program that must be on this machine, by the folders where Debian keeps them. The test fails without it.
inline std::string tool(const std::string& name) {
  for (const char* folder : {"/usr/bin/", "/usr/local/bin/"}) {
    if (std::filesystem::exists(folder + name)) return folder + name;
  }
  ADD_FAILURE() << name << " is missing; ./dev setup installs it";
  return "/bin/false";
}

}  // namespace varnel
