#include "programs/varnel-decode/CaptureList.h"

#include <gmock/gmock.h>

#include "tests/support/Process.h"

namespace varnel {
namespace {

using namespace std::string_view_literals;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;

std::vector<std::string> namesIn(std::string_view list) { return capturesIn(list, "list").names; }

TEST(CaptureList, NewlinesSeparateNames) {
  EXPECT_THAT(namesIn("a\nb c\n\nd"), ElementsAre("a", "b c", "d"));
}

TEST(CaptureList, WithANulCharacterNamesMayHoldNewlines) {
  EXPECT_THAT(namesIn("a\nb\0c\0"sv), ElementsAre("a\nb", "c"));
}

TEST(CaptureList, ANameThatOccursAgainIsLeftOut) {
  EXPECT_THAT(namesIn("b\na\nb\na\n"), ElementsAre("b", "a"));
}

TEST(CaptureList, ADashIsAFileOfThatName) { EXPECT_THAT(namesIn("-\n"), ElementsAre("./-")); }

TEST(CaptureList, ANameThatNoFileCanHaveMeansThatItIsNoList) {
  try {
    capturesIn(std::string(4096, 'x') + "\n", "capture.bin");
    FAIL() << "it was taken";
  } catch (const std::runtime_error& error) {
    EXPECT_STREQ(error.what(), "capture.bin is no list of captures: a name in it has 4096 characters");
  }
  EXPECT_EQ(namesIn(std::string(4095, 'x')).size(), 1u);
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

TEST(CaptureList, SizesStandBeforeTheNamesOfAListThatSaysSo) {
  const CaptureList list = capturesIn(
      "varnel-list 1\0"
      "12 a b\0"
      "0  c\n\0"
      "7 -\0"sv,
      "list");
  EXPECT_THAT(list.names, ElementsAre("a b", " c\n", "./-"));
  EXPECT_THAT(list.sizes, ElementsAre(12u, 0u, 7u));
  EXPECT_THAT(capturesIn("12 a\n", "list").sizes, IsEmpty());
  EXPECT_THAT(namesIn("varnel-list 1\n12 a\n"), ElementsAre("varnel-list 1", "12 a")) << "these are names";
}

TEST(CaptureList, WhatIsWrittenWithSizesIsReadAgain) {
  const CaptureList list{{"a b", "c\n", "\xFF"}, {5, 18446744073709551615u, 0}};
  const CaptureList read = capturesIn(listWithSizes(list), "list");
  EXPECT_EQ(read.names, list.names);
  EXPECT_EQ(read.sizes, list.sizes);
}

TEST(CaptureList, AnEntryWithoutASizeMeansThatTheListIsDamaged) {
  for (const std::string_view list : {"varnel-list 1\0a\0"sv,
                                      "varnel-list 1\0"
                                      "12\0"sv,
                                      "varnel-list 1\0 a\0"sv, "varnel-list 1\0-1 a\0"sv,
                                      "varnel-list 1\0"
                                      "99999999999999999999 a\0"sv})
    EXPECT_THROW(capturesIn(list, "list"), std::runtime_error);
}

TEST(CaptureList, AListWithSizesOfAnotherVersionIsNotTakenForNames) {
  try {
    capturesIn(
        "varnel-list 2\0"
        "12 a\0"sv,
        "all.list");
    FAIL() << "it was taken";
  } catch (const std::runtime_error& error) {
    EXPECT_STREQ(error.what(),
                 "all.list is a list with sizes of version 2, which this program does not know; write it "
                 "again with its --write-list");
  }
  for (const std::string_view list : {"varnel-list 10\0"
                                      "12 a\0"sv,
                                      "varnel-list 1.1\0"
                                      "12 a\0"sv,
                                      "varnel-list 1 \0"
                                      "12 a\0"sv})
    EXPECT_THROW(capturesIn(list, "list"), std::runtime_error);
  EXPECT_THAT(namesIn("varnel-list of may\0./varnel-list 2\0"sv),
              ElementsAre("varnel-list of may", "./varnel-list 2"));
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
