#include "widgets/Display.h"

#include <gtest/gtest.h>
#include <sys/socket.h>
#include <sys/un.h>
#include <unistd.h>

#include <cstdlib>
#include <map>
#include <optional>
#include <string>

namespace varnel {
namespace {

// Each test has an environment without displays, and restores the old one.
class DisplayTest : public testing::Test {
 protected:
  DisplayTest() {
    for (const char* name : {"QT_QPA_PLATFORM", "WAYLAND_DISPLAY", "DISPLAY"}) {
      const char* value = std::getenv(name);
      _former[name] = value ? std::optional<std::string>(value) : std::nullopt;
      ::unsetenv(name);
    }
  }
  ~DisplayTest() override {
    for (const auto& [name, value] : _former) {
      if (value) {
        ::setenv(name.c_str(), value->c_str(), 1);
      } else {
        ::unsetenv(name.c_str());
      }
    }
  }

 private:
  std::map<std::string, std::optional<std::string>> _former;
};

TEST_F(DisplayTest, WithoutAnythingInTheEnvironmentThereIsNone) {
  EXPECT_FALSE(displayIsThere());
  EXPECT_EQ(wantedDisplay(), "");
}

TEST_F(DisplayTest, APlatformThatTheToolkitIsToldOfCounts) {
  ::setenv("QT_QPA_PLATFORM", "offscreen", 1);
  EXPECT_TRUE(displayIsThere());
  EXPECT_EQ(wantedDisplay(), "QT_QPA_PLATFORM=offscreen");
}

TEST_F(DisplayTest, AnX11DisplayCountsWhileItsServerListens) {
  ::setenv("DISPLAY", ":7654", 1);
  EXPECT_EQ(wantedDisplay(), "DISPLAY=:7654");
  EXPECT_FALSE(displayIsThere());

  const int server = ::socket(AF_UNIX, SOCK_STREAM, 0);
  sockaddr_un address{};
  address.sun_family = AF_UNIX;
  const std::string name = std::string(1, '\0') + "/tmp/.X11-unix/X7654";
  name.copy(address.sun_path, name.size());
  const auto length = static_cast<socklen_t>(sizeof address.sun_family + name.size());
  ASSERT_EQ(::bind(server, reinterpret_cast<const sockaddr*>(&address), length), 0);
  ASSERT_EQ(::listen(server, 4), 0);
  EXPECT_TRUE(displayIsThere());
  ::setenv("DISPLAY", "unix:7654.0", 1);
  EXPECT_TRUE(displayIsThere());
  ::close(server);
  EXPECT_FALSE(displayIsThere());
}

TEST_F(DisplayTest, NamesOfNoKnownFormAreNoDisplay) {
  for (const char* name : {"7", ":", ":x", ":12345", "localhost", ":1x"}) {
    ::setenv("DISPLAY", name, 1);
    EXPECT_FALSE(displayIsThere()) << name;
  }
}

TEST_F(DisplayTest, AWaylandDisplayWithoutAServerIsNone) {
  ::setenv("WAYLAND_DISPLAY", "wayland-7654", 1);
  EXPECT_FALSE(displayIsThere());
  EXPECT_EQ(wantedDisplay(), "WAYLAND_DISPLAY=wayland-7654");
}

}  // namespace
}  // namespace varnel
