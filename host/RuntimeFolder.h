#pragma once

#include <filesystem>
#include <optional>
#include <string>

namespace varnel {

/// The folder with the sockets of this user's programs: the one that the option names, else
/// $XDG_RUNTIME_DIR/varnel, else varnel-UID in the temporary folder. The path is absolute. Makes the folder
/// (mode 0700) when it is missing. Throws std::runtime_error, one line that says what to do, when the folder
/// cannot be made, belongs to another user, or is open to others.
std::filesystem::path runtimeFolder(const std::optional<std::string>& option);

}  // namespace varnel
