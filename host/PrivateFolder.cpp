#include "host/PrivateFolder.h"

#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstdlib>
#include <stdexcept>
#include <string>
#include <string_view>
#include <system_error>
#include <utility>

namespace varnel {

namespace {

namespace fs = std::filesystem;

constexpr std::string_view prefix = "varnel-own-";
constexpr int mostAttempts = 10;

fs::path placeOfFolders() {
  const char* const session = std::getenv("XDG_RUNTIME_DIR");
  if (session && fs::path(session).is_absolute()) return session;
  return fs::absolute(fs::temp_directory_path());
}

FileDescriptor openFolder(const fs::path& path) {
  return FileDescriptor(::open(path.c_str(), O_RDONLY | O_DIRECTORY | O_NOFOLLOW | O_CLOEXEC));
}

bool lock(const FileDescriptor& folder) { return ::flock(folder.number(), LOCK_EX | LOCK_NB) == 0; }

bool belongsToThisUser(const FileDescriptor& folder) {
  struct stat status {};
  return ::fstat(folder.number(), &status) == 0 && status.st_uid == ::geteuid();
}

// False when somebody has removed it.
bool isStillThere(const FileDescriptor& folder, const fs::path& path) {
  struct stat opened {};
  struct stat named {};
  return ::fstat(folder.number(), &opened) == 0 && ::lstat(path.c_str(), &named) == 0 &&
         opened.st_ino == named.st_ino && opened.st_dev == named.st_dev;
}

void removeLeftovers(const fs::path& place) {
  std::error_code ignored;
  for (auto entry = fs::directory_iterator(place, ignored); entry != fs::directory_iterator();
       entry.increment(ignored)) {
    if (!entry->path().filename().string().starts_with(prefix)) continue;
    const FileDescriptor folder = openFolder(entry->path());
    // Nobody uses a folder that nobody has locked.
    if (folder.isOpen() && belongsToThisUser(folder) && lock(folder)) fs::remove_all(entry->path(), ignored);
  }
}

}  // namespace

PrivateFolder::PrivateFolder() {
  const fs::path place = placeOfFolders();
  removeLeftovers(place);
  for (int attempt = 0; attempt < mostAttempts; ++attempt) {
    std::string name = (place / (std::string(prefix) + "XXXXXX")).string();
    if (!::mkdtemp(name.data())) {
      throw std::runtime_error("no folder can be made in " + place.string() + ": " +
                               std::generic_category().message(errno) +
                               "; name another one by XDG_RUNTIME_DIR in the environment");
    }
    _path = name;
    _lock = openFolder(_path);
    // Before the lock, another process could take the folder for one that was left.
    if (lock(_lock) && isStillThere(_lock, _path)) return;
  }
  throw std::runtime_error("a folder in " + place.string() +
                           " cannot be locked; name another one by XDG_RUNTIME_DIR in the environment");
}

PrivateFolder::~PrivateFolder() {
  std::error_code ignored;
  fs::remove_all(_path, ignored);
}

}  // namespace varnel
