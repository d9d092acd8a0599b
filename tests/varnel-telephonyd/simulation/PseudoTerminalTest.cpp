#include "programs/varnel-telephonyd/simulation/pty/PseudoTerminal.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include <string>

#include "host/FileDescriptor.h"
#include "tests/support/EventLoop.h"

namespace varnel {
namespace {

class PseudoTerminalTest : public testing::Test {
 protected:
  FileDescriptor open() const {
    return FileDescriptor(::open(_terminal.name().c_str(), O_RDWR | O_NOCTTY | O_NONBLOCK | O_CLOEXEC));
  }
  // What the device has to read, without the frame ends that may come before it.
  static std::string read(const FileDescriptor& device) {
    std::string bytes(1 << 16, '\0');
    const ssize_t count = ::read(device.number(), bytes.data(), bytes.size());
    bytes.resize(count < 0 ? 0 : static_cast<std::size_t>(count));
    bytes.erase(0, bytes.find_first_not_of('~'));
    return bytes;
  }
  bool send(const std::string& bytes) { return _terminal.send(Bytes(bytes.begin(), bytes.end())); }
  bool sendSoon(const std::string& bytes) {
    return runUntil([&] { return send(bytes); });
  }
  std::string readSoon(const FileDescriptor& device) {
    std::string bytes;
    runUntil([&] { return !(bytes = read(device)).empty(); });
    return bytes;
  }

  std::string _came;
  PseudoTerminal _terminal{[this](ByteView bytes) { _came.append(bytes.begin(), bytes.end()); }};
};

TEST_F(PseudoTerminalTest, BytesPassUnchangedInBothDirectionsWithoutAnEcho) {
  const std::string bytes("\x03\r\n\x11\x13\x7F\x04\0\xFF\x1A", 10);
  const FileDescriptor device = open();
  ASSERT_EQ(::write(device.number(), bytes.data(), bytes.size()), 10);
  EXPECT_TRUE(runUntil([&] { return _came == bytes; }));
  EXPECT_TRUE(sendSoon(bytes));
  EXPECT_EQ(readSoon(device), bytes);
  runFor(std::chrono::milliseconds(50));
  EXPECT_EQ(read(device), "");
}

TEST_F(PseudoTerminalTest, WhileNobodyHasItOpenNothingIsSent) {
  EXPECT_FALSE(send("early"));
  FileDescriptor device = open();
  EXPECT_TRUE(sendSoon("a"));
  EXPECT_EQ(readSoon(device), "a");
  device = FileDescriptor();
  EXPECT_TRUE(runUntil([&] { return !send("b"); }));
}

TEST_F(PseudoTerminalTest, AReaderMayGoAndComeBack) {
  for (int i = 0; i < 3; ++i) {
    const FileDescriptor device = open();
    ASSERT_EQ(::write(device.number(), "x", 1), 1);
    EXPECT_TRUE(runUntil([&] { return std::exchange(_came, {}) == "x"; }));
    EXPECT_TRUE(sendSoon("abc"));
    EXPECT_EQ(readSoon(device), "abc");
  }
}

TEST_F(PseudoTerminalTest, ASlowReaderGetsWholePiecesOnly) {
  const FileDescriptor device = open();
  const std::string piece = std::string(999, 'p') + '\n';
  ASSERT_TRUE(sendSoon(piece));
  std::size_t sent = 1;
  for (int i = 0; i < 200; ++i) sent += send(piece) ? 1 : 0;
  EXPECT_GT(sent, 60u);
  EXPECT_LT(sent, 100u);
  std::string got;
  EXPECT_TRUE(runUntil([&] {
    got += read(device);
    return got.size() == sent * piece.size();
  }));
  EXPECT_TRUE(send(piece));
}

}  // namespace
}  // namespace varnel
