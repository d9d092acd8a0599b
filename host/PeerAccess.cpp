#include "host/PeerAccess.h"

#include <grp.h>
#include <pwd.h>
#include <sys/socket.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <charconv>
#include <utility>
#include <vector>

namespace varnel {

namespace {

// More than any system allows a user to have.
constexpr int mostGroups = 1 << 17;
constexpr std::size_t largestEntry = 1 << 20;

// Calls one of the reentrant functions of the user database, with as much room as it asks for. Nothing when
// the database has no such entry.
template <class Entry, class Query, class Taker>
auto lookUp(Query query, Taker take) -> decltype(std::optional(take(std::declval<const Entry&>()))) {
  std::vector<char> room(4096);
  while (true) {
    Entry entry{};
    Entry* found = nullptr;
    const int error = query(&entry, room.data(), room.size(), &found);
    if (error == EINTR) continue;
    if (error == ERANGE && room.size() < largestEntry) {
      room.resize(room.size() * 4);
      continue;
    }
    if (!found) return std::nullopt;
    return take(*found);
  }
}

std::vector<gid_t> groupsOf(const std::string& user, gid_t primary) {
  std::vector<gid_t> groups(64);
  while (true) {
    int count = static_cast<int>(groups.size());
    if (::getgrouplist(user.c_str(), primary, groups.data(), &count) >= 0) {
      groups.resize(static_cast<std::size_t>(count));
      return groups;
    }
    if (groups.size() >= mostGroups) return {};
    groups.resize(groups.size() * 2);
  }
}

}  // namespace

std::optional<Peer> peerOf(int socket) {
  ucred credentials{};
  socklen_t size = sizeof credentials;
  if (::getsockopt(socket, SOL_SOCKET, SO_PEERCRED, &credentials, &size) != 0) return std::nullopt;
  // The system's answer when there is no peer.
  if (credentials.uid == static_cast<uid_t>(-1)) return std::nullopt;
  return Peer{credentials.uid, credentials.gid};
}

bool isInGroup(uid_t user, gid_t group) {
  const auto groups =
      lookUp<passwd>([user](auto... rest) { return ::getpwuid_r(user, rest...); },
                     [](const passwd& entry) { return groupsOf(entry.pw_name, entry.pw_gid); });
  return groups && std::ranges::find(*groups, group) != groups->end();
}

PeerAccess::PeerAccess() : _self(::geteuid()), _owner(_self) {}

PeerAccess::PeerAccess(uid_t owner, gid_t group, Membership membership)
    : _self(::geteuid()), _owner(owner), _group(group), _isMember(std::move(membership)) {}

bool PeerAccess::accepts(const Peer& peer) const {
  if (peer.user == _self || peer.user == _owner || peer.user == 0) return true;
  return _group && (peer.group == *_group || _isMember(peer.user, *_group));
}

Rights PeerAccess::rightsOf(const Peer& peer) const {
  const bool isAccepted = accepts(peer);
  return {.spi = isAccepted, .internal = isAccepted};
}

std::string groupName(gid_t group) {
  return lookUp<::group>([group](auto... rest) { return ::getgrgid_r(group, rest...); },
                         [](const ::group& entry) { return std::string(entry.gr_name); })
      .value_or(std::to_string(group));
}

std::optional<gid_t> groupNamed(const std::string& name) {
  const auto found = lookUp<::group>([&name](auto... rest) { return ::getgrnam_r(name.c_str(), rest...); },
                                     [](const ::group& entry) { return entry.gr_gid; });
  if (found) return found;
  gid_t number = 0;
  const auto [end, failure] = std::from_chars(name.data(), name.data() + name.size(), number);
  const bool isNumber = failure == std::errc() && end == name.data() + name.size();
  // The largest number stands for no group.
  return isNumber && number != static_cast<gid_t>(-1) ? std::optional(number) : std::nullopt;
}

}  // namespace varnel
