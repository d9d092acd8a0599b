#include "host/HostApplication.h"

#include <gtest/gtest.h>

#include <clocale>

namespace varnel {
namespace {

// The application object of this test program was made in the locale C.UTF-8.
TEST(HostApplication, LeavesNumbersAsTheyAre) {
  EXPECT_STREQ(std::setlocale(LC_CTYPE, nullptr), "C.UTF-8");
  EXPECT_STREQ(std::setlocale(LC_NUMERIC, nullptr), "C");
}

}  // namespace
}  // namespace varnel
