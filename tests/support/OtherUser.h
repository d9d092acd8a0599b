#pragma once

#include <grp.h>
#include <gtest/gtest.h>
#include <sys/wait.h>
#include <unistd.h>

#include <functional>

#include "tests/support/EventLoop.h"

namespace varnel {

/// A user and a group that no system has in its database.
constexpr uid_t unusedUser = 3'123'456;
constexpr gid_t unusedGroup = 3'123'457;

/// Whether the test is root: only root can become another user. It stays true in the other user's process.
inline bool canBecomeAnotherUser() {
  static const bool isRoot = ::geteuid() == 0;
  return isRoot;
}

/// Runs the function in a child process while this process's event loop runs; returns what it returns. If the
/// test is root, the child becomes the unused user, of this primary group, and of no other group.
inline int inAnotherProcess(gid_t group, const std::function<int()>& deed) {
  const pid_t child = ::fork();
  if (child == 0) {
    if (canBecomeAnotherUser() &&
        (::setgroups(0, nullptr) != 0 || ::setgid(group) != 0 || ::setuid(unusedUser) != 0))
      ::_exit(99);
    ::_exit(deed());
  }
  int status = 0;
  if (!runUntil([&] { return ::waitpid(child, &status, WNOHANG) == child; })) {
    ADD_FAILURE() << "the other process hangs";
    ::kill(child, SIGKILL);
    ::waitpid(child, &status, 0);
  }
  return WIFEXITED(status) ? WEXITSTATUS(status) : -WTERMSIG(status);
}

}  // namespace varnel
