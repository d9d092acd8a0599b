#include "host/PeerAccess.h"

#include <gtest/gtest.h>
#include <pwd.h>
#include <sys/socket.h>
#include <unistd.h>

#include "host/FileDescriptor.h"
#include "tests/support/OtherUser.h"

namespace varnel {
namespace {

constexpr gid_t viewers = 500;

// A user database in which the user 1001 alone is a member of the viewers.
bool isViewer(uid_t user, gid_t group) { return user == 1001 && group == viewers; }

TEST(PeerAccess, IsForTheOwnUserAndRootAlone) {
  const PeerAccess access;
  EXPECT_FALSE(access.isShared());
  EXPECT_TRUE(access.accepts({::geteuid(), 77}));
  EXPECT_TRUE(access.accepts({0, 0}));
  EXPECT_FALSE(access.accepts({unusedUser, ::getegid()}));
}

TEST(PeerAccess, OfASharedFolderIsAlsoForItsOwnerAndTheMembersOfItsGroup) {
  const PeerAccess access(900, viewers, isViewer);
  EXPECT_TRUE(access.isShared());
  EXPECT_TRUE(access.accepts({::geteuid(), 77}));
  EXPECT_TRUE(access.accepts({900, 77}));
  EXPECT_TRUE(access.accepts({1001, 77})) << "a supplementary group";
  EXPECT_TRUE(access.accepts({1002, viewers})) << "the primary group of the process";
  EXPECT_FALSE(access.accepts({1002, 77}));
}

TEST(PeerAccess, GrantsBothRightsOrNone) {
  const PeerAccess access(900, viewers, isViewer);
  EXPECT_TRUE(access.rightsOf({1001, 77}).spi);
  EXPECT_TRUE(access.rightsOf({1001, 77}).internal);
  EXPECT_FALSE(access.rightsOf({1002, 77}).spi);
  EXPECT_FALSE(access.rightsOf({1002, 77}).internal);
}

TEST(PeerAccess, APeerIsTheUserWhoHasConnected) {
  int ends[2];
  ASSERT_EQ(::socketpair(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0, ends), 0);
  const FileDescriptor one(ends[0]), other(ends[1]);
  const auto peer = peerOf(one.number());
  ASSERT_TRUE(peer);
  EXPECT_EQ(peer->user, ::geteuid());
  EXPECT_EQ(peer->group, ::getegid());
  // What only another user's process can see.
  EXPECT_EQ(inAnotherProcess(unusedGroup,
                             [] {
                               int pair[2];
                               if (::socketpair(AF_UNIX, SOCK_STREAM, 0, pair) != 0) return 1;
                               const auto self = peerOf(pair[0]);
                               return self && self->user == ::geteuid() && self->group == ::getegid() ? 0 : 2;
                             }),
            0);
}

TEST(PeerAccess, ASocketWithoutAPeerHasNone) {
  const FileDescriptor socket(::socket(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0));
  EXPECT_FALSE(peerOf(socket.number()));
  EXPECT_FALSE(peerOf(-1));
}

TEST(UserDatabase, KnowsThePrimaryGroupOfEachUser) {
  const passwd* const self = ::getpwuid(::geteuid());
  ASSERT_TRUE(self) << "the test's user is not in the user database";
  EXPECT_TRUE(isInGroup(::geteuid(), self->pw_gid));
  EXPECT_FALSE(isInGroup(::geteuid(), unusedGroup));
}

TEST(UserDatabase, AUserWhoIsNotInItIsInNoGroup) {
  EXPECT_FALSE(isInGroup(unusedUser, 0));
  EXPECT_FALSE(isInGroup(unusedUser, unusedGroup));
}

TEST(UserDatabase, GroupsHaveANameOrANumber) {
  EXPECT_EQ(groupNamed("root"), 0u);
  EXPECT_EQ(groupNamed("0"), 0u);
  EXPECT_EQ(groupNamed("3123457"), unusedGroup);
  for (const char* name : {"", "-1", "4294967295", "4294967296", "12x", "no such group"})
    EXPECT_FALSE(groupNamed(name)) << name;
  EXPECT_EQ(groupName(0), "root");
  EXPECT_EQ(groupName(unusedGroup), "3123457");
}

}  // namespace
}  // namespace varnel
