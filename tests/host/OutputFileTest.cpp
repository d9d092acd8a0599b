#include "host/OutputFile.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/stat.h>

#include <fstream>
#include <string>

#include "tests/support/Process.h"

namespace varnel {
namespace {

namespace fs = std::filesystem;

Bytes bytesOf(const std::string& text) { return {text.begin(), text.end()}; }

class OutputFileTest : public testing::Test {
 protected:
  std::string path() const { return folder.file("out"); }
  std::size_t files() const {
    return static_cast<std::size_t>(std::distance(fs::directory_iterator(folder.path()), {}));
  }
  TemporaryFolder folder;
};

TEST_F(OutputFileTest, PiecesOfEverySizeComeInTheirOrder) {
  OutputFile file(path());
  ASSERT_FALSE(file.open());
  std::string expected;
  for (const std::size_t size : {1u, 65'535u, 1u, 0u, 65'536u, 65'537u, 300'000u, 7u}) {
    const std::string piece(size, static_cast<char>('a' + expected.size() % 26));
    expected += piece;
    EXPECT_FALSE(file.write(bytesOf(piece)));
  }
  EXPECT_FALSE(fs::exists(path()));
  EXPECT_FALSE(file.finish());
  EXPECT_EQ(contentsOf(path()), expected);
  EXPECT_EQ(fs::status(path()).permissions(), fs::perms(0600));
}

TEST_F(OutputFileTest, OneThatIsNotFinishedLeavesTheEarlierFileAndNoOther) {
  std::ofstream(path()) << "earlier";
  {
    OutputFile file(path());
    ASSERT_FALSE(file.open());
    EXPECT_FALSE(file.write(Bytes(200'000, 'x')));
  }
  EXPECT_EQ(contentsOf(path()), "earlier");
  EXPECT_EQ(files(), 1u);
}

TEST_F(OutputFileTest, ALinkIsRefusedBeforeAnythingIsWritten) {
  fs::create_symlink("elsewhere", path());
  OutputFile file(path());
  EXPECT_EQ(file.open(), isLinkError());
  EXPECT_EQ(files(), 1u);
}

TEST_F(OutputFileTest, APipeGetsEachPieceAtOnce) {
  ASSERT_EQ(::mkfifo(path().c_str(), 0600), 0);
  const FileDescriptor reader(::open(path().c_str(), O_RDONLY | O_NONBLOCK | O_CLOEXEC));
  OutputFile file(path());
  ASSERT_FALSE(file.open());
  EXPECT_FALSE(file.write(bytesOf("one")));
  char received[8];
  EXPECT_EQ(::read(reader.number(), received, sizeof received), 3);
  EXPECT_FALSE(file.write(bytesOf("three")));
  EXPECT_EQ(::read(reader.number(), received, sizeof received), 5);
  EXPECT_FALSE(file.finish());
}

}  // namespace
}  // namespace varnel
