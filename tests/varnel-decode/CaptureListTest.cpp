#include "programs/varnel-decode/CaptureList.h"

#include <gmock/gmock.h>

#include "tests/support/Process.h"

namespace varnel {
namespace {

using namespace std::string_view_literals;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;

TEST(CaptureList, NewlinesSeparateNames) {
  EXPECT_THAT(capturesIn("a\nb c\n\nd", "list"), ElementsAre("a", "b c", "d"));
}

TEST(CaptureList, WithANulCharacterNamesMayHoldNewlines) {
  EXPECT_THAT(capturesIn("a\nb\0c\0"sv, "list"), ElementsAre("a\nb", "c"));
}

TEST(CaptureList, ANameThatOccursAgainIsLeftOut) {
  EXPECT_THAT(capturesIn("b\na\nb\na\n", "list"), ElementsAre("b", "a"));
}

TEST(CaptureList, ADashIsAFileOfThatName) { EXPECT_THAT(capturesIn("-\n", "list"), ElementsAre("./-")); }

TEST(CaptureList, ANameThatNoFileCanHaveMeansThatItIsNoList) {
  try {
    capturesIn(std::string(4096, 'x') + "\n", "capture.bin");
    FAIL() << "it was taken";
  } catch (const std::runtime_error& error) {
    EXPECT_STREQ(error.what(), "capture.bin is no list of captures: a name in it has 4096 characters");
  }
  EXPECT_EQ(capturesIn(std::string(4095, 'x'), "list").size(), 1u);
}

TEST(CaptureList, AListThatCannotBeReadIsNamed) {
  try {
    readCaptureList("/nowhere/list");
    FAIL() << "it was read";
  } catch (const std::runtime_error& error) {
    EXPECT_THAT(error.what(), HasSubstr("cannot read the list /nowhere/list: No such file"));
  }
}

TEST(CaptureList, SizesAreThoseOfFilesAnd0ForAllElse) {
  const TemporaryFolder folder;
  std::ofstream(folder.file("five")) << "12345";
  EXPECT_THAT(sizesOf({folder.file("five"), folder.file("missing"), folder.path().string()}),
              ElementsAre(5u, 0u, 0u));
}

TEST(CaptureParts, APartIsANumberAndHowManyThereAre) {
  const auto part = partNamed("2/8");
  ASSERT_TRUE(part);
  EXPECT_EQ(part->number, 2u);
  EXPECT_EQ(part->count, 8u);
  for (const char* text : {"", "2", "2/", "/8", "0/8", "9/8", "2/8x", "-1/8", "1/0", " 1/2", "1/1000001"})
    EXPECT_FALSE(partNamed(text)) << text;
}

TEST(CaptureParts, TheLargestAreDealtFirstToThePartWithTheFewestBytes) {
  // d (90000) to 1, b (50000) to 2, c (40000) to 2, a (30000) to 1 since 90000 < 98192, e (1) to 2.
  const std::vector<std::string> captures = {"a", "b", "c", "d", "e"};
  const std::vector<std::uint64_t> sizes = {30000, 50000, 40000, 90000, 1};
  EXPECT_THAT(shareOf(captures, sizes, {1, 2}), ElementsAre("a", "d"));
  EXPECT_THAT(shareOf(captures, sizes, {2, 2}), ElementsAre("b", "c", "e"));
}

TEST(CaptureParts, EmptyCapturesAreDealtOutToo) {
  const std::vector<std::string> captures = {"a", "b", "c", "d"};
  const std::vector<std::uint64_t> sizes(4, 0);
  EXPECT_THAT(shareOf(captures, sizes, {1, 2}), ElementsAre("a", "c"));
  EXPECT_THAT(shareOf(captures, sizes, {2, 2}), ElementsAre("b", "d"));
}

TEST(CaptureParts, ThereMayBeMorePartsThanCaptures) {
  EXPECT_THAT(shareOf({"a"}, {1}, {1, 3}), ElementsAre("a"));
  EXPECT_THAT(shareOf({"a"}, {1}, {3, 3}), IsEmpty());
}

}  // namespace
}  // namespace varnel
