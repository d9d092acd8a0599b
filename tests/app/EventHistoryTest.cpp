#include "app/EventHistory.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tests/support/DictionaryOf.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::SizeIs;

DisplayEvent cellChange(std::int64_t second) {
  return {{second, 0}, EventKind::CellChange, "LTE/Serving Cell", "", std::to_string(second)};
}

std::vector<std::string> cells(const EventHistory& history, const ValueHistory::Stretch& stretch) {
  std::vector<std::string> texts;
  for (const auto& found : history.in(stretch)) texts.push_back(found.event.to);
  return texts;
}

TEST(EventHistory, KeepsWhatADisplayTells) {
  EventHistory history;
  const Value display = dictionaryOf(
      {{"LTE",
        dictionaryOf({{"Serving Cell", dictionaryOf({{"EARFCN", "1300"}, {"Physical Cell ID", "16"}})}})}});
  history.look(display, {100, 0}, 4s);
  const auto found = history.in({0s, 10s});
  ASSERT_THAT(found, SizeIs(1));
  EXPECT_EQ(found[0].at, 4s);
  EXPECT_EQ(found[0].event.kind, EventKind::CellChange);
  history.look(display, {102, 0}, 6s);
  EXPECT_THAT(history.in({0s, 10s}), SizeIs(1));
}

TEST(EventHistory, BothEndsOfAStretchBelongToIt) {
  EventHistory history;
  for (int i = 1; i <= 4; ++i) history.add(cellChange(i), i * 1s);
  EXPECT_THAT(cells(history, {2s, 3s}), ElementsAre("2", "3"));
  EXPECT_THAT(cells(history, {5s, 9s}), IsEmpty());
}

TEST(EventHistory, AnEarlierEventCountsAsAtTheTimeOfTheLastOne) {
  EventHistory history;
  history.add(cellChange(5), 5s);
  history.add(cellChange(4), 4s);
  EXPECT_THAT(cells(history, {5s, 5s}), ElementsAre("5", "4"));
}

TEST(EventHistory, OldOnesAreDropped) {
  EventHistory history;
  for (int i = 1; i <= 4; ++i) history.add(cellChange(i), i * 1s);
  history.dropBefore(3s);
  EXPECT_THAT(cells(history, {0s, 9s}), ElementsAre("3", "4"));
  history.clear();
  EXPECT_THAT(cells(history, {0s, 9s}), IsEmpty());
}

TEST(EventHistory, OfTooManyTheOldestGo) {
  EventHistory history;
  for (std::size_t i = 0; i <= EventHistory::mostEvents; ++i) history.add(cellChange(1), 1s * i);
  EXPECT_THAT(history.in({0s, std::chrono::hours(10)}), SizeIs(EventHistory::mostEvents));
  EXPECT_TRUE(history.lacksSome());
}

}  // namespace
}  // namespace varnel
