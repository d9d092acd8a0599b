#include "host/RuntimeFolder.h"

#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstdlib>
#include <stdexcept>
#include <system_error>

namespace varnel {

namespace {

namespace fs = std::filesystem;

[[noreturn]] void refuse(const fs::path& path, const std::string& reason) {
  throw std::runtime_error("the runtime folder " + path.string() + " " + reason);
}

// Other users may write to the temporary folder, so a link there can be anybody's.
enum class Links { Followed, Refused };

fs::path usableFolder(const fs::path& path, Links links) {
  if (::mkdir(path.c_str(), 0700) != 0 && errno != EEXIST) {
    refuse(path, "cannot be made: " + std::generic_category().message(errno) +
                     "; name another one with --runtime-dir");
  }
  struct stat status {};
  const int failure =
      links == Links::Followed ? ::stat(path.c_str(), &status) : ::lstat(path.c_str(), &status);
  if (failure != 0) refuse(path, "cannot be read: " + std::generic_category().message(errno));
  if (!S_ISDIR(status.st_mode)) refuse(path, "is no folder; name another one with --runtime-dir");
  if (status.st_uid != ::geteuid())
    refuse(path, "belongs to another user; name another one with --runtime-dir");
  if ((status.st_mode & (S_IRWXG | S_IRWXO)) != 0)
    refuse(path, "is open to other users; close it with chmod 700, or name another one with --runtime-dir");
  return path;
}

// The session's own folder; empty when the session has none.
fs::path sessionFolder() {
  const char* const path = std::getenv("XDG_RUNTIME_DIR");
  return path && fs::path(path).is_absolute() ? fs::path(path) : fs::path();
}

}  // namespace

fs::path runtimeFolder(const std::optional<std::string>& option) {
  if (option) return usableFolder(fs::absolute(*option), Links::Followed);
  if (const fs::path session = sessionFolder(); !session.empty())
    return usableFolder(session / "varnel", Links::Followed);
  const std::string name = "varnel-" + std::to_string(::geteuid());
  return usableFolder(fs::absolute(fs::temp_directory_path()) / name, Links::Refused);
}

}  // namespace varnel
