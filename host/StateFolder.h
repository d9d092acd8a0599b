#pragma once

#include <filesystem>
#include <optional>

namespace varnel {

/// The folder for what a program remembers from one run to the next: $XDG_STATE_HOME/varnel, else
/// ~/.local/state/varnel. It need not be there. Nothing when the environment names no absolute folder.
std::optional<std::filesystem::path> stateFolder();

}  // namespace varnel
