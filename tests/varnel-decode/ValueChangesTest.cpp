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

Value sorted(std::initializer_list<std::pair<const char*, const char*>> entries) {
  Value section = Value::ofDictionary();
  section.dictionary()->set("_sorted", "");
  for (const auto& [name, text] : entries) section.dictionary()->set(name, text);
  return section;
}

// A display of CDMA2000.
Value cdmaDisplay() {
  Value oneX = sorted({{"03;Rx0 Channel", "384"}});
  oneX.dictionary()->set("10;Active Set", sorted({{"0;84", "(ref pilot) -5.00 dB"}, {"1;168", "-9.00 dB"}}));
  Value evdo = sorted({{"04;Channel", "777"}, {"05;Serving Pilot PN Offset", "32 × 64chips"}});
  evdo.dictionary()->set("13;Active Set", "(none)");
  evdo.dictionary()->set("14;Finger C2I", sorted({{"0;11", "-1.00 dB"}}));
  Value display = sorted({});
  display.dictionary()->set("1;1x", oneX);
  display.dictionary()->set("2;EV-DO", evdo);
  display.dictionary()->set("3;Network", sorted({{"5;Base Station ID", "4660"}}));
  return display;
}

TEST(ValueChanges, ACellOfCdmaIsAPilotOfItsChannelAndABaseStation) {
  const auto cells = {ShownCell{"CDMA2000", "384", "168"}, ShownCell{"CDMA2000", "384", "84"},
                      ShownCell{"CDMA2000", "777", "32"}, ShownCell{"CDMA2000 base station", "384", "4660"}};
  ValueChanges alone, ofAllRadios, ofACard;
  alone.take(at(2, cdmaDisplay()));
  EXPECT_THAT(alone.cells(), testing::ElementsAreArray(cells));
  ofAllRadios.take(at(2, displayOf("CDMA2000", cdmaDisplay())));
  EXPECT_THAT(ofAllRadios.cells(), testing::ElementsAreArray(cells));
  ofACard.take(at(2, displayOf("SIM 1", displayOf("CDMA2000", cdmaDisplay()))));
  EXPECT_THAT(ofACard.cells(), testing::ElementsAreArray(cells));
}

TEST(ValueChanges, AStationIsThatOfTheChannelOnWhichItWasHeard) {
  const auto display = [](const char* channel, const char* station) {
    Value groups = displayOf("1x", section({{"Rx0 Channel", channel}}));
    groups.dictionary()->set("Network", section({{"Base Station ID", station}}));
    return groups;
  };
  ValueChanges changes;
  changes.take(at(2, display("384", "1")));
  changes.take(at(4, display("425", "1")));
  changes.take(at(6, display("425", "2")));
  EXPECT_THAT(changes.cells(), ElementsAre(ShownCell{"CDMA2000 base station", "384", "1"},
                                           ShownCell{"CDMA2000 base station", "425", "2"}));
}

TEST(ValueChanges, APilotIsOfANewChannelOnlyWhenItsPacketHasCome) {
  const auto display = [](const char* channel, const char* pilot, const char* level) {
    Value evdo = section({{"Channel", channel}});
    evdo.dictionary()->set("Active Set", section({{pilot, level}}));
    return displayOf("EV-DO", evdo);
  };
  ValueChanges changes;
  changes.take(at(2, display("777", "84", "-5.00 dB")));
  changes.take(at(4, display("802", "84", "-5.50 dB")));
  changes.take(at(6, display("802", "84", "-5.50 dB")));
  changes.take(at(8, display("802", "168", "-9.00 dB")));
  EXPECT_THAT(changes.cells(),
              ElementsAre(ShownCell{"CDMA2000", "777", "84"}, ShownCell{"CDMA2000", "802", "168"}));
  changes.take(at(10, display("802", "84", "-7.00 dB")));
  EXPECT_EQ(changes.cells().count({"CDMA2000", "802", "84"}), 1u);
}

TEST(ValueChanges, TheServingPilotComesWithItsChannel) {
  ValueChanges changes;
  for (const char* channel : {"777", "802"})
    changes.take(
        at(2, displayOf("EV-DO", section({{"Channel", channel}, {"Serving Pilot PN Offset", "32"}}))));
  EXPECT_THAT(changes.cells(),
              ElementsAre(ShownCell{"CDMA2000", "777", "32"}, ShownCell{"CDMA2000", "802", "32"}));
}

TEST(ValueChanges, WithoutAChannelOrANumberThereIsNoCellOfCdma) {
  ValueChanges changes;
  Value display = displayOf("Network", section({{"Base Station ID", "4660"}}));
  display.dictionary()->set("EV-DO",
                            section({{"Channel", "777"}, {"Serving Pilot PN Offset", "Invalid Value"}}));
  display.dictionary()->set("UMTS", displayOf("Active Set", Value::ofArray({section({{"RSCP", "-90"}})})));
  display.dictionary()->set("CDMA Cell", section({{"Base Station ID", "4660"}, {"PN", "12"}}));
  changes.take(at(2, display));
  EXPECT_THAT(changes.cells(), IsEmpty());
}

TEST(ValueChanges, APilotOfACandidateIsACellOfItsChannel) {
  ValueChanges changes;
  changes.take(at(2, displayOf("Reselection Candidates List",
                               Value::ofArray({section({{"Channel", "283"}, {"Pilot", "12"}})}))));
  EXPECT_THAT(changes.cells(), ElementsAre(ShownCell{"CDMA2000", "283", "12"}));
}

TEST(ValueChanges, AFrequencyIsNoChannel) {
  ValueChanges changes;
  const auto cells = [](const Value& record) { return displayOf("Other Cells", Value::ofArray({record})); };
  changes.take(at(
      2,
      cells(section({{"EARFCN", "1300"}, {"Downlink Frequency", "1815.0 MHz"}, {"Physical Cell ID", "7"}}))));
  changes.take(at(
      4,
      cells(section({{"UARFCN", "10588"}, {"Downlink Frequency", "2117.6 MHz"}, {"Scrambling Code", "5"}}))));
  EXPECT_THAT(changes.cells(), ElementsAre(ShownCell{"LTE", "1300", "7"}, ShownCell{"UMTS", "10588", "5"}));
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
