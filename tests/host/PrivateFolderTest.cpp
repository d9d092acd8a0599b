#include "host/PrivateFolder.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cstdlib>
#include <fstream>
#include <optional>
#include <string>
#include <vector>

#include "tests/support/Process.h"

namespace varnel {
namespace {

namespace fs = std::filesystem;
using testing::IsEmpty;
using testing::SizeIs;

class PrivateFolderTest : public testing::Test {
 protected:
  PrivateFolderTest() { ::setenv("XDG_RUNTIME_DIR", _session.path().c_str(), 1); }

  std::vector<fs::path> folders() const { return {fs::directory_iterator(_session.path()), {}}; }

  TemporaryFolder _session;
};

TEST_F(PrivateFolderTest, IsANewFolderForThisUserAlone) {
  const PrivateFolder first, second;
  EXPECT_NE(first.path(), second.path());
  EXPECT_EQ(first.path().parent_path(), _session.path());
  EXPECT_EQ(fs::status(first.path()).permissions(), fs::perms::owner_all);
}

TEST_F(PrivateFolderTest, IsRemovedWithEverythingInIt) {
  {
    const PrivateFolder folder;
    fs::create_directory(folder.path() / "more");
    std::ofstream(folder.path() / "more/file") << "text";
    ASSERT_THAT(folders(), SizeIs(1));
  }
  EXPECT_THAT(folders(), IsEmpty());
}

TEST_F(PrivateFolderTest, WhatAKilledProcessHasLeftIsRemovedByTheNextOne) {
  const pid_t child = ::fork();
  if (child == 0) {
    const PrivateFolder folder;
    std::ofstream(folder.path() / "file") << "text";
    ::kill(::getpid(), SIGKILL);
  }
  ::waitpid(child, nullptr, 0);
  ASSERT_THAT(folders(), SizeIs(1));
  const fs::path left = folders().front();
  const PrivateFolder next;
  EXPECT_FALSE(fs::exists(left));
  EXPECT_TRUE(fs::exists(next.path()));
}

TEST_F(PrivateFolderTest, FoldersOfAnotherKindStay) {
  fs::create_directory(_session.path() / "varnel");
  fs::create_directory(_session.path() / "varnel-1000");
  const PrivateFolder folder;
  EXPECT_THAT(folders(), SizeIs(3));
}

TEST_F(PrivateFolderTest, WithoutARoomForItTheErrorSaysWhatToDo) {
  ::setenv("XDG_RUNTIME_DIR", (_session.path() / "nowhere").c_str(), 1);
  try {
    const PrivateFolder folder;
    ADD_FAILURE() << folder.path();
  } catch (const std::runtime_error& error) {
    EXPECT_EQ(error.what(), "no folder can be made in " + (_session.path() / "nowhere").string() +
                                ": No such file or directory; name another one by XDG_RUNTIME_DIR in the "
                                "environment");
  }
}

}  // namespace
}  // namespace varnel
