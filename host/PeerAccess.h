#pragma once

#include <sys/types.h>

#include <functional>
#include <optional>
#include <string>

namespace varnel {

/// The user behind the other end of a local socket, as the system knows it.
struct Peer {
  uid_t user = 0;
  gid_t group = 0;  ///< the primary group of the peer's process
};

/// The peer of a connected socket, at the moment when it connected or began to listen. Nothing when the
/// socket has none.
std::optional<Peer> peerOf(int socket);

/// Whether the user database has the user as a member of the group. May wait for the database.
bool isInGroup(uid_t user, gid_t group);

/// The rights that the telephony service grants to a peer.
struct Rights {
  bool spi = false;
  bool internal = false;
};

/// Whom a process trusts on the sockets of a runtime folder.
class PeerAccess {
 public:
  using Membership = std::function<bool(uid_t user, gid_t group)>;

  /// The process's own user, and root, who can be any user.
  PeerAccess();
  /// Also the folder's owner and the members of its group.
  PeerAccess(uid_t owner, gid_t group, Membership membership = isInGroup);

  bool accepts(const Peer& peer) const;
  /// Both rights to a peer that is accepted, and none to others.
  Rights rightsOf(const Peer& peer) const;
  /// True when members of a group are accepted.
  bool isShared() const { return _group.has_value(); }

 private:
  uid_t _self;
  uid_t _owner;
  std::optional<gid_t> _group;
  Membership _isMember;
};

/// The name of the group, or its number when it has no name.
std::string groupName(gid_t group);
/// The group with this name or number. Nothing when there is none.
std::optional<gid_t> groupNamed(const std::string& name);

}  // namespace varnel
