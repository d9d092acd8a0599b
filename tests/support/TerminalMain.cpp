#include <gtest/gtest.h>

#include "terminal/Characters.h"

// The main function of tests that show texts in a terminal's columns.
int main(int argumentCount, char** arguments) {
  testing::InitGoogleTest(&argumentCount, arguments);
  varnel::useUtf8Characters();
  return RUN_ALL_TESTS();
}
