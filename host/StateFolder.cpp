#include "host/StateFolder.h"

#include <cstdlib>

namespace varnel {

namespace {

namespace fs = std::filesystem;

// XDG Base Directory Specification: a relative path counts as not set.
std::optional<fs::path> absoluteFolder(const char* variable) {
  const char* const path = std::getenv(variable);
  return path && fs::path(path).is_absolute() ? std::optional<fs::path>(path) : std::nullopt;
}

}  // namespace

std::optional<fs::path> stateFolder() {
  if (const auto state = absoluteFolder("XDG_STATE_HOME")) return *state / "varnel";
  if (const auto home = absoluteFolder("HOME")) return *home / ".local/state/varnel";
  return std::nullopt;
}

}  // namespace varnel
