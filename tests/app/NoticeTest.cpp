#include "app/Notice.h"

#include <gtest/gtest.h>

namespace varnel {
namespace {

using Matter = Notice::Matter;

TEST(Notice, IsEmptyWhileThereIsNothingToTell) { EXPECT_EQ(Notice().text(), ""); }

TEST(Notice, TheMostUrgentLineStandsFirst) {
  Notice notice;
  notice.set(Matter::NotDecoded, "strange messages: 3");
  notice.set(Matter::Link, "no server");
  notice.set(Matter::Saving, "saved");
  EXPECT_EQ(notice.text(), "saved\nno server\nstrange messages: 3");
}

TEST(Notice, AMatterHasOneLineAndAnEmptyOneTakesItAway) {
  Notice notice;
  notice.set(Matter::Link, "no server");
  notice.set(Matter::Link, "server full");
  EXPECT_EQ(notice.text(), "server full");
  notice.set(Matter::Link, "");
  EXPECT_EQ(notice.text(), "");
}

TEST(Notice, SaysWhetherItHasChanged) {
  Notice notice;
  EXPECT_FALSE(notice.set(Matter::Link, ""));
  EXPECT_TRUE(notice.set(Matter::Link, "no server"));
  EXPECT_FALSE(notice.set(Matter::Link, "no server"));
  EXPECT_TRUE(notice.set(Matter::Link, "server full"));
  EXPECT_TRUE(notice.set(Matter::Link, ""));
}

TEST(Notice, ControlCharactersBecomeEscapesAndALineStaysALine) {
  Notice notice;
  notice.set(Matter::Source, "a\x1b[2Jb\nc\xC2\x9B");
  EXPECT_EQ(notice.text(), R"(a\x1b[2Jb\x0ac\x9b)");
}

TEST(Notice, WhatIsMuchTooLongIsCutBetweenCharacters) {
  Notice notice;
  notice.set(Matter::Source, std::string(499, 'a') + "äb");
  EXPECT_EQ(notice.text(), std::string(499, 'a') + "…");
}

}  // namespace
}  // namespace varnel
