#pragma once

#include <optional>
#include <string>

namespace varnel {

/// What the application says about itself.
struct ApplicationInfo {
  std::optional<std::string> version;  ///< absent when the build has no version
  std::string buildDate;               ///< the compiler's date and time, "Nov  2 2022 18:26:06"
};

}  // namespace varnel
