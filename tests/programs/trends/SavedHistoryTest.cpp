#include "programs/varnel/SavedHistory.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "LogGenerator/Field.h"
#include "tests/support/DictionaryOf.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;
using testing::HasSubstr;

constexpr const char* level = "/Serving Cell/RSRP";

// A display with this level, shown so many seconds after 2023-11-14 22:13:20 UTC.
Generation saved(const char* text, std::int64_t second) {
  return {.time = {1'700'000'000 + second, 0},
          .display = dictionaryOf({{"Serving Cell", dictionaryOf({{"RSRP", text}})}})};
}

SavedHistory::Wish wish(std::vector<Generation> displays) {
  NumberFormats formats;
  formats.add("Serving Cell", "RSRP", real("%4.2f dBm", 0.25, -140.0));
  return {.path = "/home/user/walk.varnel", .displays = std::move(displays), .formats = std::move(formats)};
}

TEST(SavedHistory, HasTheCourseOverTheDisplaysInTheirTimes) {
  SavedHistory history(wish(
      {saved("-93.25 dBm", 0), saved("-94.00 dBm", 5), saved("Not Present", 8), saved("-90.50 dBm", 300)}));
  EXPECT_EQ(history.obstacle(), "");
  TrendSource& trends = history.trends();
  EXPECT_EQ(trends.name(), "walk.varnel");
  EXPECT_TRUE(trends.isComplete());
  ASSERT_TRUE(trends.row(level));
  EXPECT_EQ(trends.row(level)->unit, "dBm");
  EXPECT_EQ(trends.whole().end - trends.whole().begin, 300s);
  EXPECT_EQ(trends.momentAt(trends.whole().begin).time, (Time{1'700'000'000, 0}));
  const auto summary = trends.summary(level, trends.whole());
  EXPECT_EQ(summary.count, 3U);
  EXPECT_EQ(summary.lowest, -94.0);
  EXPECT_EQ(summary.last, -90.5);
}

TEST(SavedHistory, OfOneDisplaySaysThatThereIsNoCourse) {
  EXPECT_EQ(SavedHistory(wish({saved("-93.25 dBm", 0)})).obstacle(),
            "walk.varnel has one display only, so its numbers have no course. A capture of the same time has "
            "one.");
}

TEST(SavedHistory, OfDisplaysOfOneMomentSaysThatThereIsNoCourse) {
  EXPECT_THAT(SavedHistory(wish({saved("-93.25 dBm", 7), saved("-94.00 dBm", 7)})).obstacle(),
              HasSubstr("All displays in walk.varnel have the same time"));
}

TEST(SavedHistory, IsNotWrittenOverItsFile) {
  SavedHistory history(wish({saved("-93.25 dBm", 0), saved("-94.00 dBm", 5)}));
  EXPECT_THAT(history.trends().save("/home/user/walk.varnel", "x"), HasSubstr("was not written"));
}

}  // namespace
}  // namespace varnel
