#include "host/RuntimeFolder.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cstdlib>
#include <fstream>
#include <stdexcept>

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
std::string refusal(const std::optional<std::string>& option) {
  try {
    runtimeFolder(option);
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
  const auto made = runtimeFolder(_folder.file("made"));
  EXPECT_EQ(made, _folder.file("made"));
  EXPECT_EQ(modeOf(made), 0700u);
  EXPECT_EQ(runtimeFolder(_folder.file("made")), made);
}

TEST_F(RuntimeFolder, IsAnAbsolutePath) {
  const auto before = std::filesystem::current_path();
  std::filesystem::current_path(_folder.path());
  EXPECT_EQ(runtimeFolder("relative"), std::filesystem::current_path() / "relative");
  std::filesystem::current_path(before);
}

TEST_F(RuntimeFolder, IsTheSessionsWithoutTheOption) {
  ::setenv("XDG_RUNTIME_DIR", _folder.path().c_str(), 1);
  EXPECT_EQ(runtimeFolder({}), _folder.file("varnel"));
  EXPECT_EQ(modeOf(_folder.file("varnel")), 0700u);
}

TEST_F(RuntimeFolder, IsTheUsersOwnTemporaryOneWithoutASession) {
  EXPECT_EQ(runtimeFolder({}), _own);
  EXPECT_EQ(modeOf(_own), 0700u);
  ::setenv("XDG_RUNTIME_DIR", "relative/paths/do/not/count", 1);
  EXPECT_EQ(runtimeFolder({}), _own);
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

}  // namespace
}  // namespace varnel
