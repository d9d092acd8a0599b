#include "host/WholeFile.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <csignal>
#include <fstream>
#include <string>

#include "tests/support/FileSizeLimit.h"
#include "tests/support/Process.h"

namespace varnel {
namespace {

namespace fs = std::filesystem;

Bytes bytesOf(const std::string& text) { return {text.begin(), text.end()}; }

class WholeFile : public testing::Test {
 protected:
  std::string path(const std::string& name = "out") const { return folder.file(name); }
  void put(const std::string& text) const { std::ofstream(path(), std::ios::binary) << text; }
  // Nothing else is left in the folder.
  std::size_t files() const {
    return static_cast<std::size_t>(std::distance(fs::directory_iterator(folder.path()), {}));
  }

  TemporaryFolder folder;
};

TEST_F(WholeFile, ANewFileIsItsOwnersAloneAndNothingElseIsLeft) {
  EXPECT_FALSE(writeWholeFile(path(), bytesOf("new")));
  EXPECT_EQ(contentsOf(path()), "new");
  EXPECT_EQ(fs::status(path()).permissions(), fs::perms(0600));
  EXPECT_EQ(files(), 1u);
}

TEST_F(WholeFile, ItTakesThePlaceOfAnEarlierOneWhichKeepsItsOtherNames) {
  put("much longer than the new one");
  fs::create_hard_link(path(), path("other"));
  ::chmod(path().c_str(), 0644);
  EXPECT_FALSE(writeWholeFile(path(), bytesOf("new")));
  EXPECT_EQ(contentsOf(path()), "new");
  EXPECT_EQ(fs::status(path()).permissions(), fs::perms(0600));
  EXPECT_EQ(contentsOf(path("other")), "much longer than the new one");
}

TEST_F(WholeFile, TheModeOfTheEarlierOneIsKeptWhereThatIsAskedFor) {
  put("old");
  ::chmod(path().c_str(), 0640);
  EXPECT_FALSE(writeWholeFile(path(), bytesOf("new"), ReplacedMode::Kept));
  EXPECT_EQ(fs::status(path()).permissions(), fs::perms(0640));
}

TEST_F(WholeFile, AFileThatDoesNotFitLeavesTheEarlierOneAndNothingElse) {
  put("old");
  std::error_code failure;
  {
    const FileSizeLimit limit(1000);
    failure = writeWholeFile(path(), Bytes(2000, 'x'));
  }
  EXPECT_EQ(failure.message(), "File too large");
  EXPECT_EQ(contentsOf(path()), "old");
  EXPECT_EQ(files(), 1u);
}

TEST_F(WholeFile, AKilledProcessLeavesNothing) {
  const pid_t child = ::fork();
  ASSERT_GE(child, 0);
  if (child == 0) {
    WholeFileWriter file(path());
    if (!file.open() && !file.write(bytesOf("half"))) ::kill(::getpid(), SIGKILL);
    ::_exit(1);
  }
  int status = 0;
  ASSERT_EQ(::waitpid(child, &status, 0), child);
  EXPECT_TRUE(WIFSIGNALED(status));
  EXPECT_EQ(files(), 0u);
}

TEST_F(WholeFile, NoFolderIsMade) {
  EXPECT_EQ(writeWholeFile(path("missing/out"), {}), std::errc::no_such_file_or_directory);
  EXPECT_EQ(files(), 0u);
}

TEST_F(WholeFile, NothingIsWrittenThroughALink) {
  put("old");
  fs::create_symlink("out", path("link"));
  fs::create_symlink("nowhere", path("dangling"));
  for (const char* name : {"link", "dangling"}) {
    EXPECT_EQ(writeOutputFile(path(name), bytesOf("new")).message(),
              "it is a symbolic link; name the file that it leads to");
    EXPECT_TRUE(fs::is_symlink(path(name)));
  }
  EXPECT_EQ(contentsOf(path()), "old");
  EXPECT_EQ(files(), 3u);
}

TEST_F(WholeFile, AFolderAndAPipeAreNoPlacesForAFile) {
  ASSERT_EQ(::mkfifo(path("pipe").c_str(), 0600), 0);
  EXPECT_EQ(writeWholeFile(path("pipe"), {}).message(), "it is no regular file");
  EXPECT_EQ(writeOutputFile(folder.path(), {}), std::errc::is_a_directory);
}

TEST_F(WholeFile, LeftoversOfAKilledProcessAreInNobodysWay) {
  std::ofstream(path(".varnel-" + std::to_string(::getpid()) + "-0")) << "half";
  EXPECT_FALSE(writeWholeFile(path(), bytesOf("new")));
  EXPECT_EQ(contentsOf(path()), "new");
  EXPECT_EQ(files(), 2u);
}

TEST_F(WholeFile, APipeGetsTheBytesAsTheyCome) {
  ASSERT_EQ(::mkfifo(path("pipe").c_str(), 0600), 0);
  const int reader = ::open(path("pipe").c_str(), O_RDONLY | O_NONBLOCK);
  EXPECT_FALSE(writeOutputFile(path("pipe"), bytesOf("new")));
  char read[8] = "";
  EXPECT_EQ(::read(reader, read, sizeof read), 3);
  EXPECT_STREQ(read, "new");
  ::close(reader);
  EXPECT_TRUE(fs::is_fifo(path("pipe")));
}

TEST_F(WholeFile, AnOpenFileByItsNameInDevIsWrittenWhereItStands) {
  const int file = ::open(path().c_str(), O_WRONLY | O_CREAT, 0600);
  ASSERT_EQ(::write(file, "before ", 7), 7);
  EXPECT_FALSE(writeOutputFile("/dev/fd/" + std::to_string(file), bytesOf("after")));
  ::close(file);
  EXPECT_EQ(contentsOf(path()), "before after");
}

TEST_F(WholeFile, AFullDeviceIsAnError) {
  EXPECT_EQ(writeOutputFile("/dev/full", bytesOf("new")), std::errc::no_space_on_device);
}

}  // namespace
}  // namespace varnel
