#include <gtest/gtest.h>

#include <QApplication>
#include <cstdlib>

// The main function of tests that need windows, on an invisible screen.
int main(int argumentCount, char** arguments) {
  ::setenv("QT_QPA_PLATFORM", "offscreen", 1);
  ::setenv("LC_ALL", "C.UTF-8", 1);
  testing::InitGoogleTest(&argumentCount, arguments);
  const QApplication application(argumentCount, arguments);
  return RUN_ALL_TESTS();
}
