#include "host/BuildInfo.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace varnel {
namespace {

TEST(BuildInfo, KnowsVersionAndDate) {
  const ApplicationInfo build = applicationInfo();
  ASSERT_TRUE(build.version);
  EXPECT_THAT(*build.version, testing::MatchesRegex("[0-9]+\\.[0-9]+\\.[0-9]+"));
  EXPECT_THAT(build.buildDate, testing::MatchesRegex("[A-Z][a-z][a-z] [ 1-3][0-9] 20[0-9][0-9] ..:..:.."));
}

}  // namespace
}  // namespace varnel
