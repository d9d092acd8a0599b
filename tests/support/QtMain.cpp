#include <gtest/gtest.h>

#include <cstdlib>

#include "host/HostApplication.h"

// The main of tests that need an event loop, in a locale that is not the one that programs start with.
int main(int argumentCount, char** arguments) {
  ::setenv("LC_ALL", "C.UTF-8", 1);
  testing::InitGoogleTest(&argumentCount, arguments);
  const varnel::HostApplication application(argumentCount, arguments);
  return RUN_ALL_TESTS();
}
