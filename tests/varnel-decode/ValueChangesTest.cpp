#include "programs/varnel-decode/database/ValueChanges.h"

#include <gmock/gmock.h>

#include "base/Dictionary.h"
#include "tests/support/DictionaryOf.h"

namespace varnel {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

Value section(std::initializer_list<std::pair<const char*, const char*>> entries) {
  Value section = Value::ofDictionary();
  for (const auto& [name, text] : entries) section.dictionary()->set(name, text);
  return section;
}

Value displayOf(const char* name, const Value& content) {
  Value display = Value::ofDictionary();
  display.dictionary()->set(name, content);
  return display;
}

Generation at(std::int64_t seconds, Value display) {
  return {.time = {seconds, 0}, .display = std::move(display), .elapsed = std::chrono::seconds(seconds)};
}

// "display path=text", and "-" for no value.
std::vector<std::string> linesOf(ValueChanges& changes) {
  std::vector<std::string> lines;
  changes.visit([&](const ValueChanges::Chunk& chunk) {
    for (std::size_t path = 0; path < chunk.changes.size(); ++path)
      for (const ValueChanges::Change& change : chunk.changes[path]) {
        const bool hasText = change.size != ValueChanges::Change::noText;
        lines.push_back(std::to_string(change.display) + ' ' + changes.paths()[path].name + '=' +
                        (hasText ? std::string(chunk.text(change)) : "-"));
      }
  });
  return lines;
}

TEST(ValueChanges, OnlyWhatChangesIsKept) {
  ValueChanges changes;
  changes.take(at(2, displayOf("Cell", section({{"ID", "7"}, {"Level", "-90 dBm"}}))));
  changes.take(at(4, displayOf("Cell", section({{"ID", "7"}, {"Level", "-90 dBm"}}))));
  changes.take(at(6, displayOf("Cell", section({{"ID", "7"}, {"Level", "-91 dBm"}}))));
  EXPECT_THAT(linesOf(changes), ElementsAre("0 Cell/ID=7", "0 Cell/Level=-90 dBm", "1 Cell/Level=-91 dBm"));
  ASSERT_EQ(changes.displays().size(), 2u) << "the second one brought nothing";
  EXPECT_EQ(changes.displays()[1].time->seconds, 6);
  EXPECT_EQ(changes.displays()[1].elapsed, std::chrono::seconds(6));
}

TEST(ValueChanges, AValueThatGoesIsAChangeAndAnEmptyOneIsNone) {
  ValueChanges changes;
  changes.take(at(2, displayOf("Cell", section({{"ID", "7"}, {"Level", ""}, {"Band", "(unknown)"}}))));
  changes.take(at(4, displayOf("Cell", section({{"ID", ""}}))));
  changes.take(at(6, displayOf("Other", section({}))));
  changes.take(at(8, displayOf("Cell", section({{"ID", "7"}}))));
  EXPECT_THAT(linesOf(changes), ElementsAre("0 Cell/ID=7", "1 Cell/ID=-", "2 Cell/ID=7"));
}

TEST(ValueChanges, RecordsHaveTheirNumbersAndSortedNamesLoseTheirOrder) {
  Value list = Value::ofArray({section({{"ID", "1"}}), section({{"ID", "2"}})});
  Value display = section({{"_sorted", ""}});
  display.dictionary()->set("1;Cells", list);
  ValueChanges changes;
  changes.take(at(2, display));
  list.array()->pop_back();
  changes.take(at(4, display));
  EXPECT_THAT(linesOf(changes), ElementsAre("0 Cells/0/ID=1", "0 Cells/1/ID=2", "1 Cells/1/ID=-"));
}

TEST(ValueChanges, WithoutADateThereIsOnlyTheElapsedTime) {
  ValueChanges changes;
  Generation generation = at(2, displayOf("Cell", section({{"ID", "7"}})));
  generation.dating = Dating::Unknown;
  changes.take(generation);
  EXPECT_FALSE(changes.displays().at(0).time);
  EXPECT_EQ(changes.displays().at(0).elapsed, std::chrono::seconds(2));
}

TEST(ValueChanges, WhatHasNoRoomInMemoryComesBackInItsOrder) {
  ValueChanges small(1), large;
  for (const auto& [time, level] : {std::pair(2, "-90"), {4, "-91"}, {6, "-91"}, {8, "-92"}}) {
    for (ValueChanges* const changes : {&small, &large})
      changes->take(at(time, displayOf("Cell", section({{"Level", level}, {"Time", level}}))));
  }
  small.take(at(10, displayOf("Cell", section({{"New", "x"}}))));
  EXPECT_THAT(linesOf(small), ElementsAre("0 Cell/Level=-90", "0 Cell/Time=-90", "1 Cell/Level=-91",
                                          "1 Cell/Time=-91", "2 Cell/Level=-92", "2 Cell/Time=-92",
                                          "3 Cell/Level=-", "3 Cell/Time=-", "3 Cell/New=x"));
  EXPECT_THAT(linesOf(large), ElementsAre("0 Cell/Level=-90", "1 Cell/Level=-91", "2 Cell/Level=-92",
                                          "0 Cell/Time=-90", "1 Cell/Time=-91", "2 Cell/Time=-92"));
}

TEST(ValueChanges, ACellIsASectionOrARecordWithChannelAndIdentity) {
  ValueChanges changes;
  Value neighbors = section({{"EARFCN", "1300"}});
  neighbors.dictionary()->set("Cells",
                              Value::ofArray({section({{"Physical Cell ID", "8"}}),
                                              section({{"Physical Cell ID", "9"}, {"EARFCN", "1400"}}),
                                              section({{"Physical Cell ID", ""}})}));
  Value display = displayOf("Neighbors", neighbors);
  display.dictionary()->set("NR", section({{"NR-ARFCN", "630000"}, {"Physical Cell ID", "8"}}));
  display.dictionary()->set("GSM", section({{"ARFCN", "60"}, {"BSIC", "12"}}));
  display.dictionary()->set("Alone", section({{"Physical Cell ID", "11"}}));
  changes.take(at(2, display));
  const auto cell = [](const char* radio, const char* channel, const char* identity) {
    return ShownCell{radio, channel, identity};
  };
  EXPECT_THAT(changes.cells(), ElementsAre(cell("GSM", "60", "12"), cell("LTE", "1300", "8"),
                                           cell("LTE", "1400", "9"), cell("NR", "630000", "8")));
}

TEST(ValueChanges, TheColorsOfAGsmCellAreItsNumber) {
  ValueChanges changes;
  for (const char* identity : {"21", "2/5 (NCC/BCC)", "8/5 (NCC/BCC)"})
    changes.take(at(2, displayOf("GSM", section({{"ARFCN", "60"}, {"BSIC", identity}}))));
  EXPECT_THAT(changes.cells(),
              ElementsAre(ShownCell{"GSM", "60", "21"}, ShownCell{"GSM", "60", "8/5 (NCC/BCC)"}));
}

TEST(ValueChanges, ACellIsSeenWhenOnlyItsChannelChanges) {
  ValueChanges changes;
  for (const char* channel : {"", "100", "100", "200"})
    changes.take(at(2, displayOf("Cell", section({{"EARFCN", channel}, {"Physical Cell ID", "7"}}))));
  EXPECT_EQ(changes.cells().size(), 2u);
}

TEST(ValueChanges, ADisplayWithoutAnythingIsNone) {
  ValueChanges changes;
  changes.take(at(2, Value()));
  EXPECT_THAT(changes.displays(), IsEmpty());
  EXPECT_THAT(changes.paths(), IsEmpty());
}

}  // namespace
}  // namespace varnel
