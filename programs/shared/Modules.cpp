#include "programs/shared/Modules.h"

#include <dlfcn.h>

#include <stdexcept>

namespace varnel {

namespace fs = std::filesystem;

fs::path companionFile(const std::string& name, const fs::path& installedFolder) {
  const fs::path folder = fs::read_symlink("/proc/self/exe").parent_path();
  const fs::path beside = folder / name;
  return fs::exists(beside) ? beside : folder.parent_path() / installedFolder / name;
}

void* moduleFunction(const std::string& module, const std::string& function, const std::string& purpose) {
  const fs::path path = companionFile(module, "lib/varnel/modules");
  void* const loaded = ::dlopen(path.c_str(), RTLD_NOW | RTLD_LOCAL);
  if (!loaded)
    throw std::runtime_error("cannot load what " + purpose + ": " + ::dlerror() +
                             "; build or install it with the program");
  void* const found = ::dlsym(loaded, function.c_str());
  if (!found) throw std::runtime_error(path.string() + " is none of this program's modules");
  return found;
}

}  // namespace varnel
