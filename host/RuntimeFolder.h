#pragma once

#include <filesystem>
#include <optional>
#include <string>
#include <utility>

#include "host/PeerAccess.h"

namespace varnel {

/// A folder with the sockets through which programs meet.
struct RuntimeFolder {
  /// A folder for this process's user alone. The path is absolute.
  RuntimeFolder(std::filesystem::path place, PeerAccess trusted = PeerAccess())  // NOLINT: a path is one
      : path(std::move(place)), access(std::move(trusted)) {}

  std::filesystem::path path;
  PeerAccess access;  ///< whom programs trust on its sockets
};

/// The folder of this user's server: the one that the option names, else $XDG_RUNTIME_DIR/varnel, else
/// varnel-UID in the temporary folder. Makes the folder when it is missing. Without a group, its mode is
/// 0700. With the name or the number of a group, it belongs to that group and its mode is 03770: members make
/// their ports there. Throws std::runtime_error, one line that says what to do, when there is no such group,
/// or when the folder cannot be made, belongs to another user, or is open to more users.
RuntimeFolder serversFolder(const std::optional<std::string>& option,
                            const std::optional<std::string>& group = std::nullopt);

/// The folder in which this user's viewer looks for a server: the one that `serversFolder` has with the same
/// option. Makes it with mode 0700 when it is missing. A folder of mode 03770 may belong to another user.
/// Throws std::runtime_error like `serversFolder`, and when the user may not enter it.
RuntimeFolder viewersFolder(const std::optional<std::string>& option);

/// The same folder for a program that controls a server. Makes none: without the folder there is no server.
RuntimeFolder controllersFolder(const std::optional<std::string>& option);

/// The folder of the system's server.
inline constexpr const char* systemsFolder = "/run/varnel";

/// The folder at this path, if it is there and its mode is 03770.
std::optional<RuntimeFolder> sharedFolder(const std::filesystem::path& path);
/// The name of the group whose members alone may use this shared folder, if this process does not belong to
/// it.
std::optional<std::string> groupThatIsMissing(const std::filesystem::path& path);

}  // namespace varnel
