#pragma once

#include <filesystem>
#include <string>

namespace varnel {

/// A file that belongs to the program, such as a module: beside the program in the build tree, else in this
/// folder of the installation, which counts from the installation's root.
std::filesystem::path companionFile(const std::string& name, const std::filesystem::path& installedFolder);

/// The function of a module that comes with the program. The module is loaded, and stays loaded: its
/// libraries cannot be unloaded. Throws std::runtime_error when the module is missing or does not have the
/// function. `purpose` says what the module does, such as "draws pictures".
void* moduleFunction(const std::string& module, const std::string& function, const std::string& purpose);

}  // namespace varnel
