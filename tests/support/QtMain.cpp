#include <gtest/gtest.h>

#include <cstdlib>

#include "host/HostApplication.h"

// The main function of tests that need an event loop, in another locale than the one in which programs start.
int main(int argumentCount, char** arguments) {
  ::setenv("LC_ALL", "C.UTF-8", 1);
  testing::InitGoogleTest(&argumentCount, arguments);
  const varnel::HostApplication application(argumentCount, arguments);
  return RUN_ALL_TESTS();
}
