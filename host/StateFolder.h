#pragma once

#include <filesystem>
#include <optional>

namespace varnel {

/// The folder for what a program remembers between runs: $XDG_STATE_HOME/varnel, else ~/.local/state/varnel.
/// The folder may not exist yet. Nothing when the environment names no absolute folder.
std::optional<std::filesystem::path> stateFolder();

}  // namespace varnel
