#include "LogGenerator/ArrayLock.h"

#include <gtest/gtest.h>
#include <unistd.h>

#include <chrono>
#include <cstdlib>
#include <future>

namespace varnel {
namespace {

using namespace std::chrono_literals;

// A thread that takes the lock once and gives it back.
std::future<void> otherThread() {
  return std::async(std::launch::async, [] { ArrayLock::Scope scope; });
}

bool isBlocked(std::future<void>& thread) { return thread.wait_for(100ms) == std::future_status::timeout; }

// Ends the process of a death test well when it is true; one that hangs is ended by its alarm.
[[noreturn]] void endWell(bool truth) { std::_Exit(truth ? EXIT_SUCCESS : EXIT_FAILURE); }

class ArrayLockTest : public testing::Test {
 protected:
  ArrayLockTest() { testing::FLAGS_gtest_death_test_style = "threadsafe"; }
};

TEST_F(ArrayLockTest, KeepsOtherThreadsOutUntilItIsReleased) {
  ArrayLock::lockArray();
  auto other = otherThread();
  EXPECT_TRUE(isBlocked(other));
  ArrayLock::unlockArray();
  other.get();
}

TEST_F(ArrayLockTest, AScopeHoldsItForItsLength) {
  std::future<void> other;
  {
    ArrayLock::Scope scope;
    other = otherThread();
    EXPECT_TRUE(isBlocked(other));
  }
  other.get();
}

TEST_F(ArrayLockTest, CanBeTakenAgainByTheThreadThatHoldsIt) {
  const auto nest = [] {
    alarm(60);
    ArrayLock::lockArray();
    ArrayLock::lockArray();
    endWell(true);
  };
  EXPECT_EXIT(nest(), testing::ExitedWithCode(EXIT_SUCCESS), "");
}

TEST_F(ArrayLockTest, TakenAndReleasedOneAfterTheOtherIsFreeEachTime) {
  for (int i = 0; i < 300; ++i) ArrayLock::Scope scope;
  otherThread().get();
}

TEST_F(ArrayLockTest, AnInnerReleaseLeavesItHeld) {
  const auto releaseOnce = [] {
    alarm(60);
    ArrayLock::lockArray();
    ArrayLock::lockArray();
    ArrayLock::unlockArray();
    auto other = otherThread();
    endWell(isBlocked(other));
  };
  EXPECT_EXIT(releaseOnce(), testing::ExitedWithCode(EXIT_SUCCESS), "");
}

TEST_F(ArrayLockTest, AThreadThatNestedItKeepsItThoughItReleasedAsOften) {
  const auto nestAndRelease = [] {
    alarm(60);
    ArrayLock::lockArray();
    ArrayLock::lockArray();
    ArrayLock::unlockArray();
    ArrayLock::unlockArray();
    auto other = otherThread();
    endWell(isBlocked(other));
  };
  EXPECT_EXIT(nestAndRelease(), testing::ExitedWithCode(EXIT_SUCCESS), "");
}

TEST_F(ArrayLockTest, TheCounterWrapsAtEightBits) {
  const auto nestAndReleaseRoundTheCounter = [] {
    alarm(60);
    ArrayLock::lockArray();
    ArrayLock::lockArray();
    ArrayLock::unlockArray();
    ArrayLock::unlockArray();  // 0: released once, one hold is left
    for (int i = 0; i < 255; ++i) ArrayLock::unlockArray();
    auto other = otherThread();
    const bool wasHeld = isBlocked(other);
    ArrayLock::unlockArray();  // 0 again: the last hold is released
    other.get();
    endWell(wasHeld);
  };
  EXPECT_EXIT(nestAndReleaseRoundTheCounter(), testing::ExitedWithCode(EXIT_SUCCESS), "");
}

}  // namespace
}  // namespace varnel
