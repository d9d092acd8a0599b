#include "host/StateFolder.h"

#include <gtest/gtest.h>

#include <cstdlib>

namespace varnel {
namespace {

// Tests of this program may share a process, so each restores the environment.
class StateFolderTest : public testing::Test {
 protected:
  StateFolderTest() : _home(valueOf("HOME")), _state(valueOf("XDG_STATE_HOME")) {}
  ~StateFolderTest() override {
    set("HOME", _home);
    set("XDG_STATE_HOME", _state);
  }
  static void set(const char* variable, const std::optional<std::string>& value) {
    value ? ::setenv(variable, value->c_str(), 1) : ::unsetenv(variable);
  }

 private:
  static std::optional<std::string> valueOf(const char* variable) {
    const char* const value = std::getenv(variable);
    return value ? std::optional<std::string>(value) : std::nullopt;
  }

  const std::optional<std::string> _home;
  const std::optional<std::string> _state;
};

TEST_F(StateFolderTest, IsBelowTheOneThatTheEnvironmentNames) {
  set("XDG_STATE_HOME", "/state");
  EXPECT_EQ(stateFolder(), "/state/varnel");
}

TEST_F(StateFolderTest, IsBelowTheUsersHomeByDefault) {
  set("HOME", "/home/somebody");
  for (const std::optional<std::string>& unusable : {std::optional<std::string>(), {""}, {"relative"}}) {
    set("XDG_STATE_HOME", unusable);
    EXPECT_EQ(stateFolder(), "/home/somebody/.local/state/varnel");
  }
}

TEST_F(StateFolderTest, IsNowhereForWhomHasNoHome) {
  set("XDG_STATE_HOME", std::nullopt);
  set("HOME", std::nullopt);
  EXPECT_EQ(stateFolder(), std::nullopt);
}

}  // namespace
}  // namespace varnel
