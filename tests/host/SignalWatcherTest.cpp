#include "host/SignalWatcher.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include <vector>

#include "tests/support/EventLoop.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;
using testing::ElementsAre;

TEST(SignalWatcher, TurnsSignalsIntoCallsFromTheEventLoop) {
  std::vector<int> taken;
  const SignalWatcher watcher({SIGTERM, SIGUSR1}, [&](int signal) { taken.push_back(signal); });
  ::kill(::getpid(), SIGTERM);
  EXPECT_TRUE(taken.empty());
  EXPECT_TRUE(runUntil([&] { return taken.size() == 1; }));
  ::kill(::getpid(), SIGUSR1);
  EXPECT_TRUE(runUntil([&] { return taken.size() == 2; }));
  EXPECT_THAT(taken, ElementsAre(SIGTERM, SIGUSR1));
}

TEST(SignalWatcher, AHangUpThatTheProgramWasStartedToIgnoreStaysIgnored) {
  ::signal(SIGHUP, SIG_IGN);
  std::vector<int> taken;
  {
    const SignalWatcher watcher({SIGHUP, SIGUSR1}, [&](int signal) { taken.push_back(signal); });
    ::kill(::getpid(), SIGHUP);
    ::kill(::getpid(), SIGUSR1);
    EXPECT_TRUE(runUntil([&] { return !taken.empty(); }));
  }
  ::signal(SIGHUP, SIG_DFL);
  EXPECT_THAT(taken, ElementsAre(SIGUSR1));
}

TEST(SignalWatcherDeathTest, LeavesSignalsAloneAfterwards) {
  testing::FLAGS_gtest_death_test_style = "threadsafe";
  const auto die = [] {
    {
      const SignalWatcher watcher({SIGTERM}, [](int) {});
    }
    ::kill(::getpid(), SIGTERM);
    runFor(1min);
  };
  EXPECT_EXIT(die(), testing::KilledBySignal(SIGTERM), "");
}

}  // namespace
}  // namespace varnel
