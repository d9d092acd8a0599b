#include "host/FileIdentity.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include <fstream>

#include "tests/support/Process.h"

namespace varnel {
namespace {

namespace fs = std::filesystem;

class FileIdentityTest : public testing::Test {
 protected:
  FileIdentityTest() { std::ofstream(folder.file("a")) << "text"; }
  bool areOne(const std::string& first, const std::string& second) const {
    return FileIdentity::ofPath(folder.path() / first)
        .isSameFileAs(FileIdentity::ofPath(folder.path() / second));
  }

  TemporaryFolder folder;
};

TEST_F(FileIdentityTest, AFileIsItselfByEveryNameAndLink) {
  fs::create_hard_link(folder.file("a"), folder.file("hard"));
  fs::create_symlink("a", folder.file("soft"));
  fs::create_directory(folder.file("below"));
  for (const char* name : {"a", "./a", "below/../a", "hard", "soft"}) EXPECT_TRUE(areOne("a", name)) << name;
}

TEST_F(FileIdentityTest, OtherFilesOfTheSameTextAreOthers) {
  std::ofstream(folder.file("b")) << "text";
  EXPECT_FALSE(areOne("a", "b"));
  EXPECT_FALSE(areOne("a", "new"));
}

TEST_F(FileIdentityTest, AFileThatIsNotThereYetIsItsNameInItsFolder) {
  fs::create_directory(folder.file("below"));
  EXPECT_TRUE(areOne("new", "./new"));
  EXPECT_TRUE(areOne("new", "below/../new"));
  EXPECT_FALSE(areOne("new", "below/new"));
  EXPECT_FALSE(areOne("new", "other"));
}

TEST_F(FileIdentityTest, AnOpenFileIsWhatItsNameStandsFor) {
  const int file = ::open(folder.file("a").c_str(), O_RDONLY);
  EXPECT_TRUE(FileIdentity::ofDescriptor(file).isSameFileAs(FileIdentity::ofPath(folder.file("a"))));
  ::close(file);
}

TEST_F(FileIdentityTest, DevicesAndFoldersAreNoFiles) {
  EXPECT_FALSE(areOne("/dev/null", "/dev/null"));
  EXPECT_FALSE(areOne(".", "."));
  EXPECT_FALSE(areOne("missing/new", "missing/new"));
}

}  // namespace
}  // namespace varnel
