#include "terminal/HeldLines.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include <algorithm>
#include <cstdint>
#include <filesystem>
#include <string>

#include "tests/support/Process.h"

namespace varnel {
namespace {

// Standard output is a file while this object lives.
class OutputInFile {
 public:
  OutputInFile() : _former(::dup(STDOUT_FILENO)) {
    const int file = ::open(path().c_str(), O_WRONLY | O_CREAT | O_TRUNC, 0600);
    ::dup2(file, STDOUT_FILENO);
    ::close(file);
  }
  OutputInFile(const OutputInFile&) = delete;
  OutputInFile& operator=(const OutputInFile&) = delete;
  ~OutputInFile() {
    ::dup2(_former, STDOUT_FILENO);
    ::close(_former);
  }
  std::string path() const { return _folder.file("output"); }
  std::string text() const { return contentsOf(path()); }

 private:
  TemporaryFolder _folder;
  int _former;
};

TEST(HeldLines, ComeOutAtTheEnd) {
  const OutputInFile output;
  {
    HeldLines held;
    held.lines() << "one\n" << 2 << '\n';
    EXPECT_EQ(held.last(), "one\n2\n");
    EXPECT_EQ(output.text(), "");
  }
  EXPECT_EQ(output.text(), "one\n2\n");
}

TEST(HeldLines, OfTooManyTheOldestAreLeftOutAndCounted) {
  const OutputInFile output;
  {
    HeldLines held;
    // 300,000 lines of 10 bytes. Half of 256 KiB stays, in whole lines: 13,107 of them.
    for (int line = 0; line < 30; ++line) {
      for (int i = 0; i < 10'000; ++i) held.lines() << "123456789\n";
      held.trim();
    }
    EXPECT_LE(held.last().size(), 64u * 1024);
    EXPECT_EQ(held.last().size() % 10, 0u);
  }
  const std::string text = output.text();
  EXPECT_LE(text.size(), 256u * 1024 + 64);
  EXPECT_TRUE(text.starts_with("(")) << text.substr(0, 80);
  EXPECT_NE(text.find(" bytes of older lines are left out)\n123456789\n"), std::string::npos);
}

// The largest file in memory that this process has open.
std::uintmax_t heldBytes() {
  std::uintmax_t most = 0;
  for (const auto& file : std::filesystem::directory_iterator("/proc/self/fd")) {
    std::error_code error;
    const std::string name = std::filesystem::read_symlink(file.path(), error).string();
    if (name.starts_with("/memfd:varnel-held-lines"))
      most = std::max(most, std::filesystem::file_size(file.path()));
  }
  return most;
}

TEST(HeldLines, AreBoundedWithoutATimer) {
  const OutputInFile output;
  HeldLines held;
  std::uintmax_t most = 0;
  for (int piece = 0; piece < 100; ++piece) {
    for (int i = 0; i < 1000; ++i) held.lines() << "123456789\n";
    most = std::max(most, heldBytes());
  }
  EXPECT_GT(most, 256u * 1024) << "a file was found";
  EXPECT_LE(most, 512u * 1024);
}

TEST(HeldLines, StandardErrorThatIsNoTerminalStaysWhereItIs) {
  const OutputInFile output;
  testing::internal::CaptureStderr();
  {
    const HeldLines held;
    ASSERT_EQ(::write(STDERR_FILENO, "error\n", 6), 6);
  }
  EXPECT_EQ(testing::internal::GetCapturedStderr(), "error\n");
  EXPECT_EQ(output.text(), "");
}

}  // namespace
}  // namespace varnel
