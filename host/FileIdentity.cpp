#include "host/FileIdentity.h"

#include <sys/stat.h>

#include <cerrno>

namespace varnel {

FileIdentity FileIdentity::ofPath(const std::filesystem::path& path) {
  FileIdentity identity;
  struct stat status {};
  if (::stat(path.c_str(), &status) == 0) {
    if (S_ISREG(status.st_mode)) identity._node = Node{status.st_dev, status.st_ino};
    return identity;
  }
  if (errno != ENOENT) return identity;
  const std::filesystem::path folder = path.has_parent_path() ? path.parent_path() : ".";
  if (::stat(folder.c_str(), &status) != 0) return identity;
  identity._node = Node{status.st_dev, status.st_ino};
  identity._newName = path.filename();
  return identity;
}

FileIdentity FileIdentity::ofDescriptor(int descriptor) {
  FileIdentity identity;
  struct stat status {};
  if (::fstat(descriptor, &status) == 0 && S_ISREG(status.st_mode))
    identity._node = Node{status.st_dev, status.st_ino};
  return identity;
}

bool FileIdentity::isSameFileAs(const FileIdentity& other) const {
  return _node && _node == other._node && _newName == other._newName;
}

}  // namespace varnel
