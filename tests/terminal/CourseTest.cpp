#include "terminal/Course.h"

#include <gtest/gtest.h>

namespace varnel {
namespace {

using Values = std::vector<std::optional<double>>;

TEST(Course, TheLowestAndTheHighestValueAreTheLowestAndTheHighestBlock) {
  EXPECT_EQ(courseInBlocks(Values{-90, -100, -95, -93}, 4, unicodeGlyphs), L"█▁▅▆");
}

TEST(Course, TheNewestValuesAreShown) {
  EXPECT_EQ(courseInBlocks(Values{100, 1, 2}, 2, unicodeGlyphs), L"▁█");
}

TEST(Course, AStandingValueIsALowLine) { EXPECT_EQ(courseInBlocks(Values{7, 7}, 5, unicodeGlyphs), L"▁▁"); }

TEST(Course, ABlankStandsWhereThereIsNoValue) {
  EXPECT_EQ(courseInBlocks(Values{1, {}, 2}, 3, unicodeGlyphs), L"▁ █");
  EXPECT_EQ(courseInBlocks(Values{{}, {}}, 2, unicodeGlyphs), L"");
  EXPECT_EQ(courseInBlocks(Values{}, 2, unicodeGlyphs), L"");
  EXPECT_EQ(courseInBlocks(Values{1}, 0, unicodeGlyphs), L"");
}

TEST(Course, ATerminalWithoutBlocksGetsAscii) {
  EXPECT_EQ(courseInBlocks(Values{0, 1}, 2, asciiGlyphs), L"_#");
}

}  // namespace
}  // namespace varnel
