#include "host/RuntimeFolder.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cstdlib>
#include <fstream>
#include <stdexcept>

#include "tests/support/OtherUser.h"
#include "tests/support/Process.h"

namespace varnel {
namespace {

using testing::HasSubstr;

unsigned modeOf(const std::filesystem::path& path) {
  struct stat status {};
  ::stat(path.c_str(), &status);
  return status.st_mode & 07777;
}

// Why the folder is refused; empty when it is accepted.
std::string refusal(const std::optional<std::string>& option,
                    const std::optional<std::string>& group = std::nullopt) {
  try {
    serversFolder(option, group);
    return "";
  } catch (const std::runtime_error& error) {
    return error.what();
  }
}

class RuntimeFolder : public testing::Test {
 protected:
  void SetUp() override {
    ::setenv("TMPDIR", _folder.path().c_str(), 1);
    ::unsetenv("XDG_RUNTIME_DIR");
  }
  void TearDown() override { ::unsetenv("TMPDIR"); }

  TemporaryFolder _folder;
  const std::string _own = _folder.file("varnel-" + std::to_string(::geteuid()));
};

TEST_F(RuntimeFolder, IsWhatTheOptionNames) {
  ::setenv("XDG_RUNTIME_DIR", _folder.path().c_str(), 1);
  const auto made = serversFolder(_folder.file("made")).path;
  EXPECT_EQ(made, _folder.file("made"));
  EXPECT_EQ(modeOf(made), 0700u);
  EXPECT_EQ(serversFolder(_folder.file("made")).path, made);
  EXPECT_EQ(viewersFolder(_folder.file("made")).path, made);
}

TEST_F(RuntimeFolder, IsNotMadeToControlAServer) {
  EXPECT_EQ(controllersFolder(_folder.file("typo")).path, _folder.file("typo"));
  EXPECT_FALSE(std::filesystem::exists(_folder.file("typo")));
  EXPECT_EQ(controllersFolder({}).path, _own);
  EXPECT_FALSE(std::filesystem::exists(_own));
  serversFolder({});
  EXPECT_EQ(controllersFolder({}).path, _own);
}

TEST_F(RuntimeFolder, IsAnAbsolutePath) {
  const auto before = std::filesystem::current_path();
  std::filesystem::current_path(_folder.path());
  EXPECT_EQ(serversFolder("relative").path, std::filesystem::current_path() / "relative");
  std::filesystem::current_path(before);
}

TEST_F(RuntimeFolder, IsTheSessionsWithoutTheOption) {
  ::setenv("XDG_RUNTIME_DIR", _folder.path().c_str(), 1);
  EXPECT_EQ(serversFolder({}).path, _folder.file("varnel"));
  EXPECT_EQ(modeOf(_folder.file("varnel")), 0700u);
}

TEST_F(RuntimeFolder, IsTheUsersOwnTemporaryOneWithoutASession) {
  EXPECT_EQ(serversFolder({}).path, _own);
  EXPECT_EQ(modeOf(_own), 0700u);
  ::setenv("XDG_RUNTIME_DIR", "relative/paths/do/not/count", 1);
  EXPECT_EQ(serversFolder({}).path, _own);
}

TEST_F(RuntimeFolder, MustNotBeOpenToOthers) {
  const std::string path = _folder.file("open");
  ::mkdir(path.c_str(), 0700);
  for (const mode_t mode : {0710, 0701, 0750, 0777}) {
    ::chmod(path.c_str(), mode);
    EXPECT_EQ(refusal(path),
              "the runtime folder " + path +
                  " is open to other users; close it with chmod 700, or name another one with --runtime-dir");
  }
}

TEST_F(RuntimeFolder, MustNotBeALinkInTheTemporaryFolder) {
  const std::string target = _folder.file("target");
  ::mkdir(target.c_str(), 0700);
  std::filesystem::create_directory_symlink(target, _own);
  EXPECT_THAT(refusal({}), HasSubstr("is no folder"));
  EXPECT_EQ(refusal(_own), "");
}

TEST_F(RuntimeFolder, MustBeAFolder) {
  std::ofstream(_folder.file("file")) << "text";
  EXPECT_THAT(refusal(_folder.file("file")), HasSubstr("is no folder"));
}

// Only root can give its own folder away. For every other user, the root folder belongs to another user.
TEST_F(RuntimeFolder, MustBelongToTheUser) {
  std::optional<std::string> another = "/";
  if (::geteuid() == 0) {
    ::mkdir(_own.c_str(), 0700);
    ASSERT_EQ(::chown(_own.c_str(), 12345, 12345), 0);
    another.reset();
  }
  EXPECT_THAT(refusal(another), HasSubstr("belongs to another user"));
}

TEST_F(RuntimeFolder, SaysWhyItCannotBeMade) {
  EXPECT_EQ(refusal(_folder.file("missing/folder")),
            "the runtime folder " + _folder.file("missing/folder") +
                " cannot be made: No such file or directory; name another one with --runtime-dir");
}

// The test's own group by number, which every process may give its folders to.
class SharedRuntimeFolder : public RuntimeFolder {
 protected:
  const std::string _group = std::to_string(::getegid());
  const std::string _shared = _folder.file("shared");
};

TEST_F(SharedRuntimeFolder, BelongsToTheGroupWhoseMembersMakeTheirPortsThere) {
  const mode_t before = ::umask(022);
  const auto made = serversFolder(_shared, _group);
  ::umask(before);
  EXPECT_EQ(made.path, _shared);
  EXPECT_TRUE(made.access.isShared());
  EXPECT_EQ(modeOf(_shared), 03770u);
  struct stat status {};
  ASSERT_EQ(::stat(_shared.c_str(), &status), 0);
  EXPECT_EQ(status.st_gid, ::getegid());
  EXPECT_TRUE(serversFolder(_shared, _group).access.isShared()) << "a second start";
  EXPECT_TRUE(viewersFolder(_shared).access.isShared());
}

TEST_F(SharedRuntimeFolder, IsMadeOfAClosedOneAndOfNoOther) {
  serversFolder(_shared);
  serversFolder(_shared, _group);
  EXPECT_EQ(modeOf(_shared), 03770u);
  for (const mode_t mode : {0777, 0710, 02770}) {
    ::chmod(_shared.c_str(), mode);
    EXPECT_THAT(refusal(_shared, _group), HasSubstr("is open to other users"));
    EXPECT_EQ(modeOf(_shared), mode);
  }
}

TEST_F(SharedRuntimeFolder, IsOpenToOtherUsersForAServerWithoutTheGroup) {
  serversFolder(_shared, _group);
  EXPECT_THAT(refusal(_shared), HasSubstr("is open to other users"));
}

TEST_F(SharedRuntimeFolder, IsOfAGroupThatIsThere) {
  EXPECT_EQ(refusal(_shared, "no such group"),
            "there is no group no such group; name one that is there with --allow-group");
  EXPECT_FALSE(std::filesystem::exists(_shared));
}

// Root can give its folder to any group. Every other user learns that it cannot.
TEST_F(SharedRuntimeFolder, IsGivenOnlyByAMemberOfTheGroup) {
  const std::string text = refusal(_shared, std::to_string(unusedGroup));
  EXPECT_EQ(text, canBecomeAnotherUser()
                      ? ""
                      : "the runtime folder " + _shared +
                            " cannot be given to the group 3123457: Operation not permitted; "
                            "start the server as a member of that group");
  EXPECT_EQ(modeOf(_shared), canBecomeAnotherUser() ? 03770u : 0700u);
}

// The viewer of a user who is no member. If the test is not root, its own folder is closed to itself.
TEST_F(SharedRuntimeFolder, TellsWhoIsNoMemberWhichGroupItIsFor) {
  serversFolder(_shared, _group);
  ::chmod(_folder.path().c_str(), 0777);
  if (!canBecomeAnotherUser()) ::chmod(_shared.c_str(), 0070);
  const std::string name = groupName(::getegid());
  EXPECT_EQ(inAnotherProcess(
                unusedGroup,
                [&] {
                  if (groupThatIsMissing(_shared) != name) return 1;
                  if (!canBecomeAnotherUser()) return 0;
                  try {
                    viewersFolder(_shared);
                    return 2;
                  } catch (const std::runtime_error& error) {
                    return error.what() == "the runtime folder " + _shared + " is for members of the group " +
                                               name +
                                               " alone; become one, or name another one with --runtime-dir"
                               ? 0
                               : 3;
                  }
                }),
            0);
}

// If the test is root, the viewer is another user's with this group.
TEST_F(SharedRuntimeFolder, OfAnotherUserIsGoodForTheViewerOfAMember) {
  serversFolder(_shared, _group);
  ::chmod(_folder.path().c_str(), 0777);
  EXPECT_EQ(inAnotherProcess(::getegid(),
                             [&] {
                               const auto folder = viewersFolder(_shared);
                               return folder.path == _shared && folder.access.isShared() ? 0 : 1;
                             }),
            0);
}

TEST_F(SharedRuntimeFolder, OfTheSystemIsOneOfModeThreeSevenSevenZero) {
  EXPECT_FALSE(sharedFolder(_shared));
  serversFolder(_shared);
  EXPECT_FALSE(sharedFolder(_shared));
  serversFolder(_shared, _group);
  ASSERT_TRUE(sharedFolder(_shared));
  EXPECT_EQ(sharedFolder(_shared)->path, _shared);
}

}  // namespace
}  // namespace varnel
