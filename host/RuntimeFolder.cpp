#include "host/RuntimeFolder.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstdlib>
#include <stdexcept>
#include <system_error>

#include "host/FileDescriptor.h"

namespace varnel {

namespace {

namespace fs = std::filesystem;

constexpr mode_t permissionBits = 07777;
constexpr mode_t ownMode = 0700;
// Members of the group make sockets, which belong to the group too, and remove only their own.
constexpr mode_t sharedMode = 03770;

[[noreturn]] void refuse(const fs::path& path, const std::string& reason) {
  throw std::runtime_error("the runtime folder " + path.string() + " " + reason);
}

std::string systemError() { return std::generic_category().message(errno); }

// Other users may write to the temporary folder, so a link there can be anybody's.
enum class Links { Followed, Refused };

struct Place {
  fs::path path;
  Links links = Links::Followed;
};

// The session's own folder; empty when the session has none.
fs::path sessionFolder() {
  const char* const path = std::getenv("XDG_RUNTIME_DIR");
  return path && fs::path(path).is_absolute() ? fs::path(path) : fs::path();
}

Place placeOf(const std::optional<std::string>& option) {
  if (option) return {fs::absolute(*option)};
  if (const fs::path session = sessionFolder(); !session.empty()) return {session / "varnel"};
  const std::string name = "varnel-" + std::to_string(::geteuid());
  return {fs::absolute(fs::temp_directory_path()) / name, Links::Refused};
}

struct stat statusOf(const Place& place) {
  struct stat status {};
  const int failure = place.links == Links::Followed ? ::stat(place.path.c_str(), &status)
                                                     : ::lstat(place.path.c_str(), &status);
  if (failure != 0) refuse(place.path, "cannot be read: " + systemError());
  if (!S_ISDIR(status.st_mode)) refuse(place.path, "is no folder; name another one with --runtime-dir");
  return status;
}

// Makes the folder if it is missing.
struct stat madeFolder(const Place& place) {
  if (::mkdir(place.path.c_str(), ownMode) != 0 && errno != EEXIST)
    refuse(place.path, "cannot be made: " + systemError() + "; name another one with --runtime-dir");
  return statusOf(place);
}

bool isShared(const struct stat& status) { return (status.st_mode & permissionBits) == sharedMode; }

void requireOwner(const Place& place, const struct stat& status) {
  if (status.st_uid != ::geteuid())
    refuse(place.path, "belongs to another user; name another one with --runtime-dir");
}

void requireClosed(const Place& place, const struct stat& status) {
  if ((status.st_mode & (S_IRWXG | S_IRWXO)) != 0)
    refuse(place.path,
           "is open to other users; close it with chmod 700, or name another one with --runtime-dir");
}

[[noreturn]] void refuseSharing(const Place& place, const std::string& group) {
  refuse(place.path, "cannot be given to the group " + group + ": " + systemError() +
                         "; start the server as a member of that group");
}

// A system that makes the folder for its server has done this already, and may forbid it to the server.
void share(const Place& place, const struct stat& status, gid_t group, const std::string& name) {
  if (status.st_gid == group && isShared(status)) return;
  if (!isShared(status)) requireClosed(place, status);
  const int flags = O_RDONLY | O_DIRECTORY | O_CLOEXEC | (place.links == Links::Refused ? O_NOFOLLOW : 0);
  const FileDescriptor folder(::open(place.path.c_str(), flags));
  // A change of the group takes the bits of the mode away, so the mode comes last.
  if (!folder.isOpen() || ::fchown(folder.number(), static_cast<uid_t>(-1), group) != 0 ||
      ::fchmod(folder.number(), sharedMode) != 0)
    refuseSharing(place, name);
}

// Throws unless this user's viewer can use the folder, which has this status.
RuntimeFolder usable(const Place& place, const struct stat& status) {
  const bool mayBeAnothers = place.links == Links::Followed;
  if (!isShared(status) || !mayBeAnothers) requireOwner(place, status);
  if (!isShared(status)) {
    requireClosed(place, status);
    return place.path;
  }
  if (const auto group = groupThatIsMissing(place.path)) {
    refuse(place.path, "is for members of the group " + *group +
                           " alone; become one, or name another one with --runtime-dir");
  }
  return {place.path, PeerAccess(status.st_uid, status.st_gid)};
}

}  // namespace

RuntimeFolder serversFolder(const std::optional<std::string>& option,
                            const std::optional<std::string>& group) {
  const Place place = placeOf(option);
  if (!group) {
    const struct stat status = madeFolder(place);
    requireOwner(place, status);
    requireClosed(place, status);
    return place.path;
  }
  const auto number = groupNamed(*group);
  if (!number)
    throw std::runtime_error("there is no group " + *group + "; name one that is there with --allow-group");
  const struct stat status = madeFolder(place);
  requireOwner(place, status);
  share(place, status, *number, *group);
  return {place.path, PeerAccess(::geteuid(), *number)};
}

RuntimeFolder viewersFolder(const std::optional<std::string>& option) {
  const Place place = placeOf(option);
  return usable(place, madeFolder(place));
}

RuntimeFolder controllersFolder(const std::optional<std::string>& option) {
  const Place place = placeOf(option);
  struct stat status {};
  if (::lstat(place.path.c_str(), &status) != 0 && errno == ENOENT) return place.path;
  return usable(place, statusOf(place));
}

std::optional<RuntimeFolder> sharedFolder(const fs::path& path) {
  struct stat status {};
  if (::stat(path.c_str(), &status) != 0 || !S_ISDIR(status.st_mode) || !isShared(status))
    return std::nullopt;
  return RuntimeFolder(path, PeerAccess(status.st_uid, status.st_gid));
}

std::optional<std::string> groupThatIsMissing(const fs::path& path) {
  struct stat status {};
  if (::stat(path.c_str(), &status) != 0 || ::access(path.c_str(), W_OK | X_OK) == 0) return std::nullopt;
  return groupName(status.st_gid);
}

}  // namespace varnel
