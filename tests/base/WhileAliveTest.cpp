#include "base/WhileAlive.h"

#include <gtest/gtest.h>

#include <functional>
#include <memory>

namespace varnel {
namespace {

using Task = std::function<void()>;

struct CallerWhenDestroyed {
  Task task;

  CallerWhenDestroyed() = default;
  CallerWhenDestroyed(const CallerWhenDestroyed&) = delete;
  CallerWhenDestroyed& operator=(const CallerWhenDestroyed&) = delete;
  ~CallerWhenDestroyed() {
    if (task) task();
  }
};

struct Owner {
  CallerWhenDestroyed lastBreath;
  WhileAlive whileAlive;
};

class WhileAliveTest : public testing::Test {
 protected:
  Task countingTask() {
    return owner->whileAlive([this] { ++calls; });
  }

  std::unique_ptr<Owner> owner = std::make_unique<Owner>();
  int calls = 0;
};

TEST_F(WhileAliveTest, ATaskRunsEachTimeItIsCalledWhileItsOwnerLives) {
  const Task task = countingTask();
  EXPECT_EQ(calls, 0);
  task();
  task();
  EXPECT_EQ(calls, 2);
}

TEST_F(WhileAliveTest, ATaskDoesNothingOnceItsOwnerIsGone) {
  const Task task = countingTask();
  owner.reset();
  task();
  EXPECT_EQ(calls, 0);
}

TEST_F(WhileAliveTest, ATaskDoesNothingWhileItsOwnerIsBeingDestroyed) {
  owner->lastBreath.task = countingTask();
  owner.reset();
  EXPECT_EQ(calls, 0);
}

TEST_F(WhileAliveTest, ATaskMayDestroyItsOwner) {
  const Task last = owner->whileAlive([this] { owner.reset(); });
  const Task task = countingTask();
  last();
  EXPECT_EQ(owner, nullptr);
  task();
  EXPECT_EQ(calls, 0);
}

TEST_F(WhileAliveTest, ATaskRunsAfterAnotherOwnerIsGone) {
  const Task task = countingTask();
  std::make_unique<Owner>().reset();
  task();
  EXPECT_EQ(calls, 1);
}

}  // namespace
}  // namespace varnel
