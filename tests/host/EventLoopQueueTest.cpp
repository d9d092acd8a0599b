#include "host/EventLoopQueue.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <memory>
#include <stdexcept>
#include <utility>
#include <vector>

#include "tests/support/EventLoop.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;
using Clock = std::chrono::steady_clock;
using testing::ElementsAre;

TEST(EventLoopQueue, RunsTasksInOrderAfterTheRunningOne) {
  EventLoopQueue queue;
  std::vector<int> ran;
  queue.async([&] {
    queue.async([&] { ran.push_back(3); });
    ran.push_back(1);
  });
  queue.async([&] { ran.push_back(2); });
  EXPECT_TRUE(ran.empty());
  ASSERT_TRUE(runUntil([&] { return ran.size() == 3; }));
  EXPECT_THAT(ran, ElementsAre(1, 2, 3));
}

TEST(EventLoopQueue, DropsWhatWaitsWhenItIsDestroyed) {
  int ran = 0;
  {
    EventLoopQueue queue;
    queue.async([&] { ++ran; });
    queue.after(1ms, [&] { ++ran; });
  }
  runFor(20ms);
  EXPECT_EQ(ran, 0);
}

TEST(EventLoopQueue, DelaysATask) {
  EventLoopQueue queue;
  const auto start = Clock::now();
  bool hasRun = false;
  queue.after(100ms, [&] { hasRun = true; });
  ASSERT_TRUE(runUntil([&] { return hasRun; }));
  EXPECT_GE(Clock::now() - start, 99ms);
}

TEST(EventLoopQueue, ADelayThatTheTimerCannotHoldIsNoShortOne) {
  EventLoopQueue queue;
  int ran = 0;
  bool hasWaited = false;
  queue.after(4294967297ms, [&] { ++ran; });  // 1 ms more than 32 bits hold
  queue.after(std::chrono::milliseconds::max(), [&] { ++ran; });
  const auto timer = queue.repeating(4294967297ms, [&] { ++ran; });
  queue.after(100ms, [&] { hasWaited = true; });
  ASSERT_TRUE(runUntil([&] { return hasWaited; }));
  EXPECT_EQ(ran, 0);
}

TEST(EventLoopQueue, ADelayThatIsOverAlreadyIsNone) {
  EventLoopQueue queue;
  bool hasRun = false;
  queue.after(std::chrono::milliseconds::min(), [&] { hasRun = true; });
  EXPECT_TRUE(runUntil([&] { return hasRun; }));
}

TEST(EventLoopQueue, RepeatsATaskUntilItsTimerIsDestroyed) {
  EventLoopQueue queue;
  int ran = 0;
  const auto start = Clock::now();
  auto timer = queue.repeating(50ms, [&] { ++ran; });
  ASSERT_TRUE(runUntil([&] { return ran >= 4; }));
  EXPECT_GE(Clock::now() - start, 199ms);
  timer.reset();
  const int before = ran;
  runFor(120ms);
  EXPECT_EQ(ran, before);
}

TEST(EventLoopQueue, KeepsAnIntervalOfTwoSecondsToTheMillisecond) {
  EventLoopQueue queue;
  std::vector<std::unique_ptr<RepeatingTimer>> timers;
  int ran = 0;
  // The toolkit groups timers that need not be exact. Most of these come late, as on a busy machine; some
  // come too early.
  for (int i = 0; i < 20; ++i) {
    timers.push_back(queue.repeating(2000ms, [&, isFirst = true, start = Clock::now()]() mutable {
      if (!std::exchange(isFirst, false)) return;
      EXPECT_GE(Clock::now() - start, 1999ms);
      ++ran;
    }));
    runFor(53ms);
  }
  EXPECT_TRUE(runUntil([&] { return ran == 20; }));
}

TEST(EventLoopQueue, LetsATaskDestroyItsTimer) {
  EventLoopQueue queue;
  int ran = 0;
  std::unique_ptr<RepeatingTimer> timer;
  const auto witness = std::make_shared<int>(7);
  timer = queue.repeating(5ms, [&, witness] {
    timer.reset();
    ran += *witness;
  });
  ASSERT_TRUE(runUntil([&] { return ran > 0; }));
  runFor(50ms);
  EXPECT_EQ(ran, 7);
}

TEST(EventLoopQueueDeathTest, AnExceptionThatLeavesATaskEndsTheProgram) {
  testing::FLAGS_gtest_death_test_style = "threadsafe";
  EventLoopQueue queue;
  const auto task = [] { throw std::runtime_error("thrown by a task"); };
  EXPECT_DEATH(
      {
        queue.async(task);
        runFor(1min);
      },
      "thrown by a task");
  EXPECT_DEATH(
      {
        const auto timer = queue.repeating(1ms, task);
        runFor(1min);
      },
      "thrown by a task");
}

}  // namespace
}  // namespace varnel
